#pragma once

#include <utility>

#include "platform/windows/win32.h"

namespace platform {

/// A handle of the system, closed in the end. Null and the invalid handle are none.
class Handle {
public:
    explicit Handle(HANDLE handle = nullptr) : handle_(handle == INVALID_HANDLE_VALUE ? nullptr : handle) {}
    Handle(Handle&& other) noexcept : handle_(std::exchange(other.handle_, nullptr)) {}
    Handle& operator=(Handle&& other) noexcept {
        std::swap(handle_, other.handle_);
        return *this;
    }
    ~Handle() {
        if (handle_ != nullptr) {
            CloseHandle(handle_);
        }
    }

    [[nodiscard]] bool IsOpen() const { return handle_ != nullptr; }
    [[nodiscard]] HANDLE Get() const { return handle_; }
    /// Leaves the handle to the caller.
    [[nodiscard]] HANDLE Give() { return std::exchange(handle_, nullptr); }

private:
    HANDLE handle_;
};

}  // namespace platform
