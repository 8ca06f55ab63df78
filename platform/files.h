#pragma once

#include <cstdio>
#include <string>

/// The runtime's file calls by narrow names, for paths of any length that the system takes.
///
/// They go the way on which `fs` goes, so that what one of them makes the other can remove: on Windows the runtime's
/// own narrow calls end at 259 characters even where long paths are switched on, and its wide ones do not.
namespace platform {

/// As the runtime's _mkdir: 0, or -1.
[[nodiscard]] int MakeDirectory(const std::string& path);

/// As the runtime's _unlink: 0, or -1.
[[nodiscard]] int RemoveFile(const std::string& path);

/// Removes an empty directory, or a link onto one. False on failure.
[[nodiscard]] bool RemoveEmptyDirectory(const std::string& path);

/// As the runtime's fopen_s; null on failure. The caller closes it.
[[nodiscard]] std::FILE* OpenStream(const std::string& path, const char* mode);

/// Opens the file at `path` for writing, in binary, made anew or emptied; null on failure. What is opened has no other
/// name and is reached by none: a link there is not followed, and where the file has a second name somewhere nothing is
/// opened. The folders above are the caller's business.
[[nodiscard]] std::FILE* OpenOwnFile(const std::string& path);

}  // namespace platform
