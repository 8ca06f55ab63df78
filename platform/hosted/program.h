#pragma once

#include "platform/hosted/win32.h"

/// This program itself: its own path, and the resources that are compiled into it.
///
/// A program has the resources that its build has given it, and no others: one without any finds none, as on Windows.

struct HRSRC__;
using HRSRC = HRSRC__*;
using HGLOBAL = void*;

#define MAKEINTRESOURCEA(number) \
    (reinterpret_cast<LPSTR>(static_cast<std::uintptr_t>(static_cast<std::uint16_t>(number))))

/// This program's path on the machine: `Z:\...` for one that lies on the host. `module` is null. Returns its length; a
/// path that `size` characters do not hold is cut, terminated, and gives `size` and ERROR_INSUFFICIENT_BUFFER.
DWORD GetModuleFileNameA(HMODULE module, LPSTR buffer, DWORD size);

/// The resource of this number (made by MAKEINTRESOURCEA) and type name, whatever the case of the name; null when this
/// program has none such. `module` is null in all three.
HRSRC FindResourceA(HMODULE module, LPCSTR name, LPCSTR type);
HGLOBAL LoadResource(HMODULE module, HRSRC resource);
DWORD SizeofResource(HMODULE module, HRSRC resource);
/// The bytes, which stay until the process ends.
LPVOID LockResource(HGLOBAL loaded);
/// FALSE: there is nothing to be freed, as on Windows.
BOOL FreeResource(HGLOBAL loaded);

namespace hosted {

/// A resource that is compiled into this program: a static object enters it into the program's list, and lives as long
/// as the program. The type and the bytes are not copied.
class CompiledResource {
public:
    CompiledResource(std::uint16_t number, const char* type, const char* begin, const char* end);
    CompiledResource(const CompiledResource&) = delete;
    CompiledResource& operator=(const CompiledResource&) = delete;

    /// Null when the program has none such.
    [[nodiscard]] static const CompiledResource* Find(std::uintptr_t number, const char* type);

    [[nodiscard]] const char* Bytes() const { return begin_; }
    [[nodiscard]] std::size_t Size() const { return static_cast<std::size_t>(end_ - begin_); }

private:
    std::uint16_t number_;
    const char* type_;
    const char* begin_;
    const char* end_;
    const CompiledResource* next_;
};

}  // namespace hosted
