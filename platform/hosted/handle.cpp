#include "platform/hosted/handle.h"

#include <unistd.h>

namespace {

// The invalid handle has all bits set and the null handle none: no kind has either of these in its place.
constexpr int KindBits = 3;
constexpr std::intptr_t KindMask = (1 << KindBits) - 1;

}  // namespace

HANDLE hosted::HandleOf(HandleKind kind, int number) {
    const std::intptr_t value = (static_cast<std::intptr_t>(number) << KindBits) | static_cast<std::intptr_t>(kind);
    return reinterpret_cast<HANDLE>(value);
}

int hosted::NumberOf(HANDLE handle, HandleKind kind) {
    const auto value = reinterpret_cast<std::intptr_t>(handle);
    return (value & KindMask) == static_cast<std::intptr_t>(kind) ? static_cast<int>(value >> KindBits) : -1;
}

BOOL CloseHandle(HANDLE handle) {
    using hosted::HandleKind;
    if (const int descriptor = hosted::NumberOf(handle, HandleKind::Folder); descriptor >= 0) {
        close(descriptor);
        return TRUE;
    }
    if (hosted::NumberOf(handle, HandleKind::Process) >= 0 || hosted::NumberOf(handle, HandleKind::Token) >= 0) {
        return TRUE;
    }
    SetLastError(static_cast<DWORD>(ERROR_INVALID_HANDLE));
    return FALSE;
}
