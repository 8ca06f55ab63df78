#pragma once

/// The shell's links through the platform's names: COM, IShellLinkW and IPersistFile.
///
/// Apart from win32.h, because one source alone makes links and the system's headers for it are large.
#ifdef _WIN32
#include "platform/windows/shell_link.h"
#else
#include "platform/hosted/shell_link.h"
#endif
