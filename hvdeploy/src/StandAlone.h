#pragma once

#include <string>
#include <vector>

namespace HV {

/// The line that a process's arguments make: joined by single blanks, and an argument in double quotes again, from
/// after its first "=" (or as a whole when it has none), where the line would take it apart otherwise. One that holds
/// a double quote is somebody's own quoting and stays as it is.
std::string LineFromArguments(const std::vector<std::string>& arguments);

/// The whole of the stand-alone program: one run of the front end with `arguments` (without the program's name), and a
/// bar when standard output is a terminal. Arguments that hold no double quote and are each one by themselves reach the
/// front end as they are; any others as one line. An interrupt from the keyboard cancels the run, which then undoes
/// itself. Returns the exit status: 0 when the arguments were good and the run gave 0, else 1. Its own last word is a
/// line on standard error: what became of the run, or where to find the options. A list that was printed has none.
/// Throws nothing.
int RunStandAlone(const std::vector<std::string>& arguments);

}  // namespace HV
