#include "tools/hvpack/Zip64Count.h"

#include <array>
#include <cstdio>
#include <string>

#include "platform/win32.h"

namespace HVPack {
namespace {

constexpr std::size_t kEndLength = 22;
constexpr std::size_t kDirectorySizeAt = 12;
constexpr std::size_t kDirectoryOffsetAt = 16;

using End = std::array<char, kEndLength>;

void Append(std::string& bytes, std::uint64_t value, int length) {
    for (int byte = 0; byte < length; ++byte) {
        bytes += static_cast<char>((value >> (8 * byte)) & 0xFF);
    }
}

std::uint64_t FourBytesAt(const End& end, std::size_t at) {
    std::uint64_t value = 0;
    for (std::size_t byte = 4; byte-- > 0;) {
        value = value << 8 | static_cast<unsigned char>(end[at + byte]);
    }
    return value;
}

/// The Zip64 end of the directory, and the record by which readers find it.
std::string Zip64End(const End& end, std::uint64_t count, std::uint64_t position) {
    std::string bytes;
    Append(bytes, 0x06064b50, 4);
    Append(bytes, 44, 8);  // what follows
    Append(bytes, 45, 2);  // made by, and needed to read, the version of the format that has wide fields
    Append(bytes, 45, 2);
    Append(bytes, 0, 8);  // one disk
    Append(bytes, count, 8);
    Append(bytes, count, 8);
    Append(bytes, FourBytesAt(end, kDirectorySizeAt), 8);
    Append(bytes, FourBytesAt(end, kDirectoryOffsetAt), 8);
    Append(bytes, 0x07064b50, 4);
    Append(bytes, 0, 4);
    Append(bytes, position, 8);
    Append(bytes, 1, 4);
    return bytes;
}

bool InsertBeforeEnd(std::FILE* file, std::uint64_t position, std::uint64_t count) {
    End end{};
    if (std::fseek(file, -static_cast<long>(end.size()), SEEK_END) != 0 ||
        std::fread(end.data(), 1, end.size(), file) != end.size() ||
        std::fseek(file, -static_cast<long>(end.size()), SEEK_END) != 0) {
        return false;
    }
    const std::string bytes = Zip64End(end, count, position) + std::string(end.data(), end.size());
    return std::fwrite(bytes.data(), 1, bytes.size(), file) == bytes.size();
}

}  // namespace

bool AddZip64Count(const fs::path& archive, std::uint64_t count) {
    boost::system::error_code error;
    const std::uint64_t size = fs::file_size(archive, error);
    std::FILE* file = nullptr;
    if (error || size < kEndLength || fopen_s(&file, archive.string().c_str(), "r+b") != 0) {
        return false;
    }
    const bool inserted = InsertBeforeEnd(file, size - kEndLength, count);
    return std::fclose(file) == 0 && inserted;
}

}  // namespace HVPack
