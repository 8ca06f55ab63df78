#pragma once

#include <string>
#include <vector>

namespace HV {

/// The line that a process's arguments make: joined by single blanks, and an argument with white space and without any
/// quote character in double quotes again, from behind its first "=" (or as a whole when it has none).
std::string LineFromArguments(const std::vector<std::string>& arguments);

/// The whole of the stand-alone program: runs `arguments` (without the program's name) as one line, with a bar when
/// standard output is a terminal. An interrupt from the keyboard cancels the run, which then undoes itself. Returns the
/// exit status: 0 when the line was parsed and the run gave 0, else 1. Throws nothing.
int RunStandAlone(const std::vector<std::string>& arguments);

}  // namespace HV
