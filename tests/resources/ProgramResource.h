#pragma once

#include <string>

#include "platform/win32.h"

/// The bytes of a resource of this program, which carries what the wizard carries; empty when it has none such.
inline std::string ProgramResource(int number, LPCSTR type) {
    const HRSRC found = FindResourceA(nullptr, MAKEINTRESOURCEA(number), type);
    if (found == nullptr) {
        return {};
    }
    const HGLOBAL loaded = LoadResource(nullptr, found);
    std::string bytes(static_cast<const char*>(LockResource(loaded)), SizeofResource(nullptr, found));
    FreeResource(loaded);
    return bytes;
}
