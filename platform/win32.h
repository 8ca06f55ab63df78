#pragma once

/// The platform's names, for all logic: types, registry, environment and the runtime's file calls.
///
/// On Windows these are the system's own headers, freed of the macros that hit our names. Hosted, they are the same
/// names and constants over the machine that is kept in a folder, and only those that the logic calls.
/// Narrow strings are UTF-8 on both targets; on Windows before version 1903 they are in the system's code page.
#ifdef _WIN32
#include "platform/windows/win32.h"
#else
#include "platform/hosted/command.h"
#include "platform/hosted/console.h"
#include "platform/hosted/win32.h"
#include "platform/hosted/window_messages.h"
#endif
