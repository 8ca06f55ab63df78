#pragma once

#include <minizip/ioapi.h>

#include <string>

#include "platform/filesystem.h"

/// The door for third-party libraries that open files by themselves, and so know nothing of `fs`.
namespace platform {

class ArchiveFile;

/// The narrow name under which a library that calls the runtime finds this file: the path itself on Windows, the host's
/// name hosted.
std::string LibraryFileName(const fs::path& file);

/// The name of the log property file that the log library is to read in place of `file`: on Windows `file` itself.
/// Hosted it is a private copy, removed when the process ends, whose values of keys that end in ".fileName" have their
/// `${NAME}` variables filled in from the machine's environment and are turned into the host's names. A file that
/// cannot be read gives its own host name, so that the library finds out and says so; a copy that cannot be
/// made throws fs::filesystem_error.
std::string LibraryPropertyFile(const fs::path& file);

/// Fills in functions for minizip's unzOpen2_64() and zipOpen2_64(); their file name is `fs::path::c_str()`. Reading is
/// buffered, so that the many small reads of a zip directory cost no system call each; sizes beyond 4 GB are fine.
/// Hosted, writing asks the machine's faults, and a failed write shows in the result of the library's own calls.
void FillArchiveFileFunctions(zlib_filefunc64_def& functions);

/// Fills in functions that use `file`, whatever name the library is given. It stays open when the library is done, and
/// has to live as long as the library's handle.
void FillArchiveFileFunctions(zlib_filefunc64_def& functions, ArchiveFile& file);

}  // namespace platform
