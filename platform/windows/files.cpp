#include "platform/files.h"

#include <fcntl.h>
#include <io.h>

#include <cstdint>

#include "platform/filesystem.h"
#include "platform/windows/handle.h"

namespace platform {
namespace {

/// A file that has just been made is nobody else's. One that was there is looked at before it is emptied. Wine opens
/// what a link names, so the name is asked as well.
Handle OpenItselfForWriting(const std::wstring& name) {
    const auto open = [&name](DWORD disposition) {
        return Handle(CreateFileW(name.c_str(), GENERIC_WRITE, 0, nullptr, disposition,
                                  FILE_ATTRIBUTE_NORMAL | FILE_FLAG_OPEN_REPARSE_POINT, nullptr));
    };
    Handle file = open(CREATE_NEW);
    if (file.IsOpen() || GetLastError() != ERROR_FILE_EXISTS) {
        return file;
    }
    file = open(OPEN_EXISTING);
    BY_HANDLE_FILE_INFORMATION found{};
    constexpr DWORD kOther = FILE_ATTRIBUTE_DIRECTORY | FILE_ATTRIBUTE_REPARSE_POINT;
    const bool itself = file.IsOpen() && GetFileInformationByHandle(file.Get(), &found) &&
                        ((found.dwFileAttributes | GetFileAttributesW(name.c_str())) & kOther) == 0 &&
                        found.nNumberOfLinks == 1;
    return itself && SetEndOfFile(file.Get()) ? std::move(file) : Handle();
}

}  // namespace

int MakeDirectory(const std::string& path) {
    return _wmkdir(fs::path(path).c_str());
}

int RemoveFile(const std::string& path) {
    return _wunlink(fs::path(path).c_str());
}

bool RemoveEmptyDirectory(const std::string& path) {
    return RemoveDirectoryW(fs::path(path).c_str()) != 0;
}

std::FILE* OpenStream(const std::string& path, const char* mode) {
    std::FILE* file = nullptr;
    const bool opened = _wfopen_s(&file, fs::path(path).c_str(), fs::path(mode).c_str()) == 0;
    return opened ? file : nullptr;
}

std::FILE* OpenOwnFile(const std::string& path) {
    Handle file = OpenItselfForWriting(fs::path(path).native());
    const int descriptor =
        file.IsOpen() ? _open_osfhandle(reinterpret_cast<std::intptr_t>(file.Get()), _O_WRONLY | _O_BINARY) : -1;
    if (descriptor < 0) {
        return nullptr;
    }
    // The descriptor closes it now.
    (void)file.Give();
    std::FILE* const stream = _fdopen(descriptor, "wb");
    if (stream == nullptr) {
        _close(descriptor);
    }
    return stream;
}

}  // namespace platform
