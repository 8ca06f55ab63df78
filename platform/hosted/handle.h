#pragma once

#include <cstdint>

#include "platform/hosted/win32.h"

namespace hosted {

/// What a handle of the platform stands for.
enum class HandleKind : std::intptr_t { Folder = 1, Process = 2, Token = 3 };

/// Handles are numbers, as the platform's are to who uses them: a kind, and a number of the host. No memory stands
/// behind one, so a handle that is never closed costs nothing but what the host itself keeps for it: a folder's
/// descriptor, and nothing for a process or its token.
[[nodiscard]] HANDLE HandleOf(HandleKind kind, int number);

/// The number behind a handle of this kind; -1 for any other handle.
[[nodiscard]] int NumberOf(HANDLE handle, HandleKind kind);

}  // namespace hosted
