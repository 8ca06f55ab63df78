#pragma once

/// Files for all logic: `namespace fs`, with the names, signatures and Windows path rules of boost::filesystem 1.81.
///
/// On Windows it is that library. Hosted, it is the same over the files of the machine that is kept in a folder: of the
/// operations what the logic and its tests call, of `fs::path` nearly everything. `fs::path` holds wide text; narrow
/// text is UTF-8 in both directions on both targets (on Windows before version 1903 in the system's code page), and
/// malformed text becomes U+FFFD instead of an error. Operations without an error code throw fs::filesystem_error.
#ifdef _WIN32
#include "platform/windows/filesystem.h"
#else
#include "platform/hosted/filesystem.h"

namespace fs = hosted::filesystem;
#endif
