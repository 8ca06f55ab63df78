#include "platform/files.h"

#include "platform/filesystem.h"
#include "platform/win32.h"

namespace platform {

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

}  // namespace platform
