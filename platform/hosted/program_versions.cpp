#include "platform/program_versions.h"

#include <algorithm>
#include <array>
#include <memory>
#include <string_view>
#include <vector>

#include "platform/raw_file.h"
#include "platform/utf8.h"

// An executable is somebody else's file: it may be cut, garbled or made to do harm. Every offset and length in it is
// checked against the file before it is followed, and the walk is as deep as a good file's and never deeper.
//
// Known are 32- and 64-bit images, and of a block its root value: what the logic asks for. The block is the image's
// resource of type 16 and name 1, in the first language that it has.
namespace platform {
namespace {

using Bytes = std::vector<unsigned char>;

std::uint32_t Number16(const Bytes& bytes, std::size_t at) {
    return bytes[at] | static_cast<std::uint32_t>(bytes[at + 1]) << 8;
}

std::uint32_t Number32(const Bytes& bytes, std::size_t at) {
    return Number16(bytes, at) | Number16(bytes, at + 2) << 16;
}

/// A piece of the file, or nothing where the file does not hold it whole.
std::optional<Bytes> Read(RawFile& file, std::uint64_t offset, std::size_t count) {
    const std::uint64_t size = file.Size();
    // Asked before memory is taken: a garbled length must not cost more than the file is long.
    if (offset > size || count > size - offset) {
        return std::nullopt;
    }
    Bytes bytes(count);
    const bool whole = file.ReadAt(offset, bytes.data(), count) == static_cast<std::int64_t>(count);
    return whole ? std::optional(std::move(bytes)) : std::nullopt;
}

/// A piece of an image, as it lies in memory and in the file.
struct Section {
    std::uint32_t address = 0;
    std::uint32_t size = 0;
    std::uint32_t offset = 0;
};

/// The part of an image's headers that leads to its resources.
struct Image {
    std::vector<Section> sections;
    std::uint32_t resources = 0;

    std::optional<std::uint64_t> FileOffset(std::uint64_t address) const {
        for (const Section& section : sections) {
            if (address >= section.address && address - section.address < section.size) {
                return section.offset + (address - section.address);
            }
        }
        return std::nullopt;
    }
};

/// Reads `count` bytes that lie at `address` once the image is loaded.
std::optional<Bytes> ReadAt(RawFile& file, const Image& image, std::uint64_t address, std::size_t count) {
    const auto offset = image.FileOffset(address);
    return offset ? Read(file, *offset, count) : std::nullopt;
}

// Offsets and numbers below are those of the Portable Executable format.

constexpr std::size_t kDosHeaderSize = 64;
constexpr std::size_t kFileHeaderSize = 24;  // with the signature "PE\0\0" before it
constexpr std::size_t kSectionHeaderSize = 40;
constexpr std::size_t kResourceDirectory = 2;  // its index in the table of data directories

/// Where in the optional header the table of data directories begins: 32- and 64-bit images differ. 0 for neither.
std::size_t DataDirectories(const Bytes& optionalHeader) {
    if (optionalHeader.size() < 2) {
        return 0;
    }
    switch (Number16(optionalHeader, 0)) {
        case 0x10b:
            return 96;
        case 0x20b:
            return 112;
        default:
            return 0;
    }
}

/// The address of the resources, 0 for an image without any.
std::uint32_t ResourceAddress(const Bytes& optionalHeader) {
    const std::size_t directories = DataDirectories(optionalHeader);
    const std::size_t entry = directories + kResourceDirectory * 8;
    if (directories == 0 || optionalHeader.size() < entry + 8 ||
        Number32(optionalHeader, directories - 4) <= kResourceDirectory) {
        return 0;
    }
    return Number32(optionalHeader, entry);
}

std::vector<Section> Sections(const Bytes& headers) {
    std::vector<Section> sections;
    for (std::size_t at = 0; at < headers.size(); at += kSectionHeaderSize) {
        sections.push_back({Number32(headers, at + 12), Number32(headers, at + 16), Number32(headers, at + 20)});
    }
    return sections;
}

/// Nothing for a file that is no image, or one without resources.
std::optional<Image> ReadImage(RawFile& file) {
    const auto dosHeader = Read(file, 0, kDosHeaderSize);
    if (!dosHeader || (*dosHeader)[0] != 'M' || (*dosHeader)[1] != 'Z') {
        return std::nullopt;
    }
    const std::uint64_t start = Number32(*dosHeader, 60);
    const auto fileHeader = Read(file, start, kFileHeaderSize);
    if (!fileHeader || Number32(*fileHeader, 0) != 0x4550) {
        return std::nullopt;
    }
    const std::size_t optionalSize = Number16(*fileHeader, 20);
    const auto optionalHeader = Read(file, start + kFileHeaderSize, optionalSize);
    const auto sections =
        Read(file, start + kFileHeaderSize + optionalSize, Number16(*fileHeader, 6) * kSectionHeaderSize);
    if (!optionalHeader || !sections || ResourceAddress(*optionalHeader) == 0) {
        return std::nullopt;
    }
    return Image{Sections(*sections), ResourceAddress(*optionalHeader)};
}

constexpr std::uint32_t kVersionType = 16;
constexpr std::uint32_t kVersionName = 1;
constexpr std::uint32_t kIsDirectory = 0x80000000;

/// The entry for `wanted` in the resource directory `directory` (an offset from the resources' start), or the first
/// entry of all when none is wanted. The entry's value is an offset too, of a directory or of a piece of data.
std::optional<std::uint32_t> FindEntry(RawFile& file, const Image& image, std::uint32_t directory,
                                       std::optional<std::uint32_t> wanted) {
    const std::uint64_t address = std::uint64_t{image.resources} + directory;
    const auto head = ReadAt(file, image, address, 16);
    if (!head) {
        return std::nullopt;
    }
    const auto entries = ReadAt(file, image, address + 16, (Number16(*head, 12) + Number16(*head, 14)) * 8);
    if (!entries) {
        return std::nullopt;
    }
    for (std::size_t at = 0; at < entries->size(); at += 8) {
        if (!wanted || Number32(*entries, at) == *wanted) {
            return Number32(*entries, at + 4);
        }
    }
    return std::nullopt;
}

/// As FindEntry(), for an entry that leads to a further directory.
std::optional<std::uint32_t> FindDirectory(RawFile& file, const Image& image, std::uint32_t directory,
                                           std::uint32_t wanted) {
    const auto entry = FindEntry(file, image, directory, wanted);
    if (!entry || (*entry & kIsDirectory) == 0) {
        return std::nullopt;
    }
    return *entry & ~kIsDirectory;
}

/// The offset of the version resource's description: type, name, and whichever language comes first.
std::optional<std::uint32_t> FindVersionData(RawFile& file, const Image& image) {
    const auto type = FindDirectory(file, image, 0, kVersionType);
    const auto name = type ? FindDirectory(file, image, *type, kVersionName) : std::nullopt;
    const auto data = name ? FindEntry(file, image, *name, std::nullopt) : std::nullopt;
    return data && (*data & kIsDirectory) == 0 ? data : std::nullopt;
}

// A version block begins with three 16-bit numbers (its length, the root value's length, a type), its name in 16-bit
// characters, and zeros up to a multiple of four; then comes the root value.
constexpr std::array<char, 16> kBlockName{"VS_VERSION_INFO"};
constexpr std::size_t kRootLengthOffset = 2;
constexpr std::size_t kBlockNameOffset = 6;
constexpr std::size_t kRootValueOffset = 40;
constexpr std::size_t kLongestBlock = 0xffff;
// Of the root value, which may be longer and must not be shorter.
constexpr std::size_t kFileVersionOffset = 8;
constexpr std::size_t kProductVersionOffset = 16;
constexpr std::size_t kRootValueSize = 52;

bool IsWellFormed(const Bytes& block) {
    if (block.size() < kRootValueOffset + kRootValueSize || Number16(block, kRootLengthOffset) < kRootValueSize ||
        block.size() - kRootValueOffset < Number16(block, kRootLengthOffset)) {
        return false;
    }
    for (std::size_t i = 0; i < kBlockName.size(); ++i) {
        if (Number16(block, kBlockNameOffset + 2 * i) != static_cast<unsigned char>(kBlockName[i])) {
            return false;
        }
    }
    return true;
}

/// The version block as it stands in the file; empty when there is none that is well-formed.
Bytes ReadVersionBlock(RawFile& file) {
    const auto image = ReadImage(file);
    const auto data = image ? FindVersionData(file, *image) : std::nullopt;
    const auto description = data ? ReadAt(file, *image, std::uint64_t{image->resources} + *data, 16) : std::nullopt;
    if (!description) {
        return {};
    }
    const std::size_t size = std::min<std::size_t>(Number32(*description, 4), kLongestBlock);
    const auto block = ReadAt(file, *image, Number32(*description, 0), size);
    return block && IsWellFormed(*block) ? *block : Bytes{};
}

/// A version in the root value: the first two numbers and then the last two, each pair the lower number first.
ProgramVersions::Numbers Version(const Bytes& block, std::size_t at) {
    const auto number = [&](std::size_t place) {
        return static_cast<std::uint16_t>(Number16(block, kRootValueOffset + at + place));
    };
    return {number(2), number(0), number(6), number(4)};
}

}  // namespace

std::optional<ProgramVersions> VersionsOfProgram(const std::string& path) {
    const auto file = OpenRawFile(WideFromUtf8(path).c_str(), RawFile::Mode::Read);
    const Bytes block = file != nullptr ? ReadVersionBlock(*file) : Bytes{};
    if (block.empty()) {
        return std::nullopt;
    }
    return ProgramVersions{Version(block, kProductVersionOffset), Version(block, kFileVersionOffset)};
}

}  // namespace platform
