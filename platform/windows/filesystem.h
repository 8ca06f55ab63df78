#pragma once

#include <boost/filesystem.hpp>

namespace fs = boost::filesystem;

namespace platform {

/// Makes the library read and write narrow paths in the process's code page, as everything else here does that takes
/// narrow names. That is UTF-8 where the manifest is heeded. By itself the library asks Windows for the same code page,
/// but with flags that Windows documents as an error for UTF-8.
bool DecodePathsAsTheProcessDoes();

/// Whoever sees `fs` has had this done, before any path of its own is made. It happens once a process.
inline const bool pathsAreDecoded = DecodePathsAsTheProcessDoes();

}  // namespace platform
