#pragma once

#include <cstdint>

#include "platform/hosted/win32.h"

/// Messages to other programs' windows, under the platform's names. Nobody else runs on the machine: a message is
/// received by no one, and that is a success.

struct HWND__;
using HWND = HWND__*;
using UINT = unsigned int;
using WPARAM = std::uintptr_t;
using LPARAM = std::intptr_t;
using LRESULT = std::intptr_t;
using PDWORD_PTR = std::uintptr_t*;

#define HWND_BROADCAST (reinterpret_cast<HWND>(static_cast<std::intptr_t>(0xFFFF)))

inline constexpr UINT WM_SETTINGCHANGE = 0x001A;
inline constexpr UINT SMTO_ABORTIFHUNG = 0x0002;

inline LRESULT SendMessageTimeoutA(HWND, UINT, WPARAM, LPARAM, UINT, UINT, PDWORD_PTR) {
    return 1;
}
