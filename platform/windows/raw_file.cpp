#include "platform/raw_file.h"

#include <algorithm>

#include "platform/win32.h"

namespace platform {
namespace {

/// One call moves at most this much; its count has 32 bits.
constexpr std::size_t LongestTransfer = std::size_t{1} << 30;

OVERLAPPED At(std::uint64_t place) {
    OVERLAPPED overlapped{};
    overlapped.Offset = static_cast<DWORD>(place & 0xFFFFFFFFu);
    overlapped.OffsetHigh = static_cast<DWORD>(place >> 32);
    return overlapped;
}

bool IsSameState(const BY_HANDLE_FILE_INFORMATION& one, const BY_HANDLE_FILE_INFORMATION& other) {
    return one.dwVolumeSerialNumber == other.dwVolumeSerialNumber && one.nFileIndexHigh == other.nFileIndexHigh &&
           one.nFileIndexLow == other.nFileIndexLow && one.nFileSizeHigh == other.nFileSizeHigh &&
           one.nFileSizeLow == other.nFileSizeLow && CompareFileTime(&one.ftLastWriteTime, &other.ftLastWriteTime) == 0;
}

class WindowsFile : public RawFile {
public:
    explicit WindowsFile(HANDLE handle) : handle_(handle) { GetFileInformationByHandle(handle_, &opened_); }
    ~WindowsFile() override { WindowsFile::Close(); }

    std::int64_t ReadAt(std::uint64_t place, void* bytes, std::size_t count) override {
        std::size_t done = 0;
        while (done < count) {
            OVERLAPPED at = At(place + done);
            DWORD got = 0;
            const auto wanted = static_cast<DWORD>(std::min(count - done, LongestTransfer));
            if (!ReadFile(handle_, static_cast<char*>(bytes) + done, wanted, &got, &at) &&
                GetLastError() != ERROR_HANDLE_EOF) {
                return -1;
            }
            if (got == 0) {
                break;
            }
            done += got;
        }
        return static_cast<std::int64_t>(done);
    }

    bool WriteAt(std::uint64_t place, const void* bytes, std::size_t count) override {
        std::size_t done = 0;
        while (done < count) {
            OVERLAPPED at = At(place + done);
            DWORD put = 0;
            const auto wanted = static_cast<DWORD>(std::min(count - done, LongestTransfer));
            if (!WriteFile(handle_, static_cast<const char*>(bytes) + done, wanted, &put, &at) || put == 0) {
                return false;
            }
            done += put;
        }
        return true;
    }

    [[nodiscard]] std::uint64_t Size() const override {
        LARGE_INTEGER size{};
        return GetFileSizeEx(handle_, &size) ? static_cast<std::uint64_t>(size.QuadPart) : 0;
    }

    [[nodiscard]] bool IsStillAt(const wchar_t* name) const override {
        const HANDLE found =
            CreateFileW(name, FILE_READ_ATTRIBUTES, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE, nullptr,
                        OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL, nullptr);
        if (found == INVALID_HANDLE_VALUE) {
            return false;
        }
        BY_HANDLE_FILE_INFORMATION now{};
        const bool known = GetFileInformationByHandle(found, &now) != FALSE;
        CloseHandle(found);
        return known && IsSameState(now, opened_);
    }

    bool Close() override {
        const HANDLE handle = handle_;
        handle_ = INVALID_HANDLE_VALUE;
        return handle == INVALID_HANDLE_VALUE || CloseHandle(handle);
    }

private:
    HANDLE handle_;
    BY_HANDLE_FILE_INFORMATION opened_{};
};

}  // namespace

std::unique_ptr<RawFile> OpenRawFile(const wchar_t* name, RawFile::Mode mode) {
    const bool writes = mode != RawFile::Mode::Read;
    const DWORD access = writes ? GENERIC_READ | GENERIC_WRITE : GENERIC_READ;
    const HANDLE handle =
        CreateFileW(name, access, FILE_SHARE_READ, nullptr,
                    mode == RawFile::Mode::Create ? CREATE_ALWAYS : OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL, nullptr);
    if (handle == INVALID_HANDLE_VALUE) {
        return nullptr;
    }
    auto file = std::make_unique<WindowsFile>(handle);
    return GetFileType(handle) == FILE_TYPE_DISK ? std::move(file) : nullptr;
}

}  // namespace platform
