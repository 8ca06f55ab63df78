#pragma once

#include "platform/hosted/win32.h"

/// The keyboard's interrupt, under the platform's names.

#define WINAPI

inline constexpr DWORD CTRL_C_EVENT = 0;
inline constexpr DWORD CTRL_BREAK_EVENT = 1;

using PHANDLER_ROUTINE = BOOL(WINAPI*)(DWORD event);

/// Adds the one handler (a second replaces it), or removes it. It is called on a thread of its own, CTRL_C_EVENT for an
/// interrupt and CTRL_BREAK_EVENT for a request to terminate; without a handler both end the process, as ever.
BOOL SetConsoleCtrlHandler(PHANDLER_ROUTINE handler, BOOL add);
