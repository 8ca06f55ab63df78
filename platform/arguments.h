#pragma once

#include <string>
#include <vector>

namespace platform {

/// What the user wrote behind the program's name, as the machine understands it.
///
/// On Windows these are the words as they stand. Hosted, a user also names files of the host: a word, or what follows
/// its first `=`, that begins with `/` is a path of the host, and becomes the path on `Z:` by which the machine reaches
/// it. A slash with one character behind it is a switch, as Windows has them, and stays.
std::vector<std::string> ProgramArguments(int count, const char* const* words);

}  // namespace platform
