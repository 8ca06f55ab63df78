#pragma once

#include <boost/filesystem.hpp>

namespace fs = boost::filesystem;

namespace platform {

/// Makes the library read and write narrow paths as UTF-8. By itself it asks Windows for the process's code page, which
/// is UTF-8 only where the manifest is heeded, and does so with flags that Windows documents as an error for UTF-8.
bool UseUtf8InPaths();

/// Whoever sees `fs` has had this done, before any path of its own is made. It happens once a process.
inline const bool pathsAreUtf8 = UseUtf8InPaths();

}  // namespace platform
