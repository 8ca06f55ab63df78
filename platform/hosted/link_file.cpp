#include "platform/hosted/link_file.h"

#include <cstddef>
#include <string_view>
#include <vector>

namespace hosted {
namespace {

constexpr std::uint32_t HasTargetItems = 0x01;
constexpr std::uint32_t HasLinkInfo = 0x02;
constexpr std::uint32_t HasName = 0x04;
constexpr std::uint32_t HasIconLocation = 0x40;
constexpr std::uint32_t IsUnicode = 0x80;

constexpr std::uint32_t HeaderSize = 0x4C;
constexpr std::uint32_t ShowNormal = 1;
constexpr std::uint32_t DriveFixed = 3;

// A class or folder identifier as it lies in a file: its first three numbers in little-endian order.
constexpr std::string_view LinkClass("\x01\x14\x02\x00\x00\x00\x00\x00\xC0\x00\x00\x00\x00\x00\x00\x46", 16);
constexpr std::string_view ThisComputer("\xE0\x4F\xD0\x20\xEA\x3A\x69\x10\xA2\xD8\x08\x00\x2B\x30\x30\x9D", 16);

/// Grows a piece of the file, number by number in little-endian order.
class Bytes {
public:
    Bytes& U8(std::uint32_t number) { return Number(number, 1); }
    Bytes& U16(std::uint32_t number) { return Number(number, 2); }
    Bytes& U32(std::uint32_t number) { return Number(number, 4); }
    Bytes& Raw(std::string_view bytes) {
        text_ += bytes;
        return *this;
    }
    Bytes& Zeros(std::size_t count) {
        text_.append(count, '\0');
        return *this;
    }
    [[nodiscard]] const std::string& Text() const { return text_; }
    [[nodiscard]] std::uint32_t Size() const { return static_cast<std::uint32_t>(text_.size()); }

private:
    Bytes& Number(std::uint32_t number, int bytes) {
        for (int i = 0; i < bytes; ++i, number >>= 8) {
            text_ += static_cast<char>(number & 0xFF);
        }
        return *this;
    }

    std::string text_;
};

// UTF-16 in little-endian order, without a terminator.
std::string Utf16(std::wstring_view text) {
    Bytes bytes;
    for (const wchar_t character : text) {
        const auto code = static_cast<std::uint32_t>(character);
        if (code < 0x10000) {
            bytes.U16(code);
        } else {
            bytes.U16(0xD800 + ((code - 0x10000) >> 10)).U16(0xDC00 + ((code - 0x10000) & 0x3FF));
        }
    }
    return bytes.Text();
}

// The narrow form that the format asks for beside the wide one. Who reads it has no say in its code page, so that only
// ASCII is safe.
std::string Ascii(std::wstring_view text) {
    std::string narrow;
    for (const wchar_t character : text) {
        narrow += character < 0x80 ? static_cast<char>(character) : '_';
    }
    return narrow;
}

std::string WithSize16(const std::string& piece) {
    return Bytes().U16(static_cast<std::uint32_t>(piece.size() + 2)).Raw(piece).Text();
}

std::string WithSize32(const std::string& piece) {
    return Bytes().U32(static_cast<std::uint32_t>(piece.size() + 4)).Raw(piece).Text();
}

bool IsOnDrive(std::wstring_view path) {
    return path.size() >= 3 && path[1] == L':' && path[2] == L'\\';
}

std::vector<std::wstring_view> Components(std::wstring_view path) {
    std::vector<std::wstring_view> components;
    while (!path.empty()) {
        const std::size_t end = std::min(path.find(L'\\'), path.size());
        if (end != 0) {
            components.push_back(path.substr(0, end));
        }
        path.remove_prefix(std::min(end + 1, path.size()));
    }
    return components;
}

// A folder or file on the way to the target: the old short form, and behind it the block with the full name.
std::string FileItem(std::wstring_view name, std::uint32_t attributes, std::uint32_t size) {
    constexpr std::uint32_t folderItem = 0x31;
    constexpr std::uint32_t fileItem = 0x32;
    Bytes item;
    item.U8((attributes & AttributeDirectory) != 0 ? folderItem : fileItem).U8(0).U32(size);
    item.U32(0).U16(attributes);  // no date
    item.Raw(Ascii(name)).U8(0);
    if (item.Size() % 2 != 0) {
        item.U8(0);
    }
    constexpr std::uint32_t version = 3;
    constexpr std::uint32_t signature = 0xBEEF0004;
    constexpr std::uint32_t systemOfThatVersion = 0x14;
    const std::uint32_t blockStart = item.Size() + 2;
    Bytes block;
    block.U16(version).U32(signature).U32(0).U32(0);  // made and read at no date
    block.U16(systemOfThatVersion).U16(0).Raw(Utf16(name)).U16(0).U16(blockStart);
    return WithSize16(item.Text() + WithSize16(block.Text()));
}

// The way from the desktop to the target: this computer, the drive, then each component.
std::string TargetItems(const LinkFile& link) {
    constexpr std::uint32_t driveItem = 0x2F;
    constexpr std::size_t driveItemName = 22;
    Bytes items;
    items.Raw(WithSize16(Bytes().U8(0x1F).U8(0x50).Raw(ThisComputer).Text()));
    const std::string drive = Ascii(std::wstring_view(link.target).substr(0, 3));
    items.Raw(WithSize16(Bytes().U8(driveItem).Raw(drive).Zeros(driveItemName - drive.size()).Text()));
    const std::vector<std::wstring_view> components = Components(std::wstring_view(link.target).substr(3));
    for (std::size_t i = 0; i < components.size(); ++i) {
        const bool isTarget = i + 1 == components.size();
        items.Raw(FileItem(components[i], isTarget ? link.attributes : AttributeDirectory, isTarget ? link.size : 0));
    }
    items.U16(0);
    return Bytes().U16(items.Size()).Raw(items.Text()).Text();
}

std::string LinkInfo(const LinkFile& link) {
    constexpr std::uint32_t headerSize = 0x24;
    constexpr std::uint32_t hasVolumeAndLocalPath = 1;
    constexpr std::uint32_t labelOffset = 0x10;
    const std::string volume = WithSize32(Bytes().U32(DriveFixed).U32(0).U32(labelOffset).U8(0).Text());
    const std::string path = Ascii(link.target) + '\0';
    const std::string widePath = Utf16(link.target) + std::string(2, '\0');
    const auto pathAt = static_cast<std::uint32_t>(headerSize + volume.size());
    const auto suffixAt = static_cast<std::uint32_t>(pathAt + path.size());
    const std::uint32_t widePathAt = suffixAt + 1;
    const auto wideSuffixAt = static_cast<std::uint32_t>(widePathAt + widePath.size());
    Bytes info;
    info.U32(headerSize).U32(hasVolumeAndLocalPath).U32(headerSize).U32(pathAt);
    info.U32(0).U32(suffixAt).U32(widePathAt).U32(wideSuffixAt);  // no network path; the suffixes are empty
    info.Raw(volume).Raw(path).U8(0).Raw(widePath).U16(0);
    return WithSize32(info.Text());
}

std::string CountedText(std::wstring_view text) {
    const std::string wide = Utf16(text);
    return Bytes().U16(static_cast<std::uint32_t>(wide.size() / 2)).Raw(wide).Text();
}

std::string Header(const LinkFile& link, std::uint32_t flags) {
    constexpr std::size_t times = 3 * 8;
    constexpr std::size_t hotKeyAndReserved = 2 + 2 + 4 + 4;
    return Bytes()
        .U32(HeaderSize)
        .Raw(LinkClass)
        .U32(flags)
        .U32(link.attributes)
        .Zeros(times)
        .U32(link.size)
        .U32(0)  // the first icon
        .U32(ShowNormal)
        .Zeros(hotKeyAndReserved)
        .Text();
}

}  // namespace

std::string LinkFileBytes(const LinkFile& link) {
    std::uint32_t flags = HasLinkInfo | IsUnicode;
    std::string body;
    if (IsOnDrive(link.target)) {
        flags |= HasTargetItems;
        body += TargetItems(link);
    }
    body += LinkInfo(link);
    if (!link.description.empty()) {
        flags |= HasName;
        body += CountedText(link.description);
    }
    if (!link.icon.empty()) {
        flags |= HasIconLocation;
        body += CountedText(link.icon);
    }
    const std::string endOfExtraData(4, '\0');
    return Header(link, flags) + body + endOfExtraData;
}

}  // namespace hosted
