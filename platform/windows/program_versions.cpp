#include "platform/program_versions.h"

#include <cstring>
#include <vector>

#include "platform/windows/win32.h"

namespace platform {
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

ProgramVersions::Numbers NumbersOf(DWORD high, DWORD low) {
    return {HIWORD(high), LOWORD(high), HIWORD(low), LOWORD(low)};
}

}  // namespace

std::optional<ProgramVersions> VersionsOfProgram(const std::string& path) {
    const auto info = ReadFixedFileInfo(path);
    if (!info) {
        return std::nullopt;
    }
    return ProgramVersions{NumbersOf(info->dwProductVersionMS, info->dwProductVersionLS),
                           NumbersOf(info->dwFileVersionMS, info->dwFileVersionLS)};
}

}  // namespace platform
