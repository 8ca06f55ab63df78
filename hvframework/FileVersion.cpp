#include "hvframework/FileVersion.h"

#include <cstring>
#include <optional>
#include <vector>

#include "platform/win32.h"

namespace HVL {
namespace {

/// The fixed part of the version block of `path`.
std::optional<VS_FIXEDFILEINFO> ReadFixedFileInfo(const std::string& path) {
    DWORD handle = 0;
    const DWORD size = GetFileVersionInfoSizeA(path.c_str(), &handle);
    if (size == 0) {
        return std::nullopt;
    }
    std::vector<unsigned char> block(size);
    void* value = nullptr;
    UINT length = 0;
    if (!GetFileVersionInfoA(path.c_str(), 0, size, block.data()) ||
        !VerQueryValueA(block.data(), "\\", &value, &length)) {
        return std::nullopt;
    }
    // The block is the executable's own text: a root value that is too short, or that the block does not hold whole, is
    // no version.
    const auto offset = static_cast<unsigned char*>(value) - block.data();
    VS_FIXEDFILEINFO info{};
    if (length < sizeof info || block.size() < static_cast<std::size_t>(offset) + sizeof info) {
        return std::nullopt;
    }
    std::memcpy(&info, value, sizeof info);
    return info;
}

}  // namespace

bool GetFileVersion(const std::string& path, Version& version) {
    version.text.clear();
    const auto info = ReadFixedFileInfo(path);
    if (!info) {
        return false;
    }
    const bool hasProductVersion = info->dwProductVersionMS != 0 || info->dwProductVersionLS != 0;
    const DWORD high = hasProductVersion ? info->dwProductVersionMS : info->dwFileVersionMS;
    const DWORD low = hasProductVersion ? info->dwProductVersionLS : info->dwFileVersionLS;
    // The fourth number is left out: hosts are told apart by three.
    version.SetFromParts(high >> 16, high & 0xffff, low >> 16);
    return true;
}

}  // namespace HVL
