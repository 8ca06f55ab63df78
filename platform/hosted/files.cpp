#include "platform/files.h"

#include "platform/hosted/host_file.h"
#include "platform/win32.h"

namespace platform {

int MakeDirectory(const std::string& path) {
    return _mkdir(path.c_str());
}

int RemoveFile(const std::string& path) {
    return _unlink(path.c_str());
}

bool RemoveEmptyDirectory(const std::string& path) {
    return RemoveDirectoryA(path.c_str()) != 0;
}

std::FILE* OpenStream(const std::string& path, const char* mode) {
    std::FILE* file = nullptr;
    return fopen_s(&file, path.c_str(), mode) == 0 ? file : nullptr;
}

std::FILE* OpenOwnFile(const std::string& path) {
    return hosted::OpenOwnFile(path);
}

}  // namespace platform
