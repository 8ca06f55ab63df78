#include <algorithm>
#include <array>
#include <cstdio>
#include <memory>
#include <new>
#include <string_view>

#include "hvframework/FileUtils.h"
#include "hvframework/Log.h"
#include "hvframework/StringUtils.h"
#include "package/ZipEntries.h"
#include "platform/files.h"

namespace HV {
namespace {

/// Room for one entry at a time. It is made anew, to the exact size, only for an entry that is larger than all before,
/// after the old room is gone: the largest entry sets the peak.
class EntryBuffer {
public:
    /// Null when there is not enough memory.
    char* Reserve(std::size_t size) {
        if (size > room_) {
            bytes_.reset();
            bytes_.reset(new (std::nothrow) char[size]);
            room_ = bytes_ ? size : 0;
        }
        return bytes_.get();
    }

private:
    std::unique_ptr<char[]> bytes_;
    std::size_t room_ = 0;
};

bool WriteAll(std::FILE* file, const char* bytes, std::size_t size) {
    // Unbuffered: the bytes go to the system in one piece, and a full disk shows here and not when the file is closed.
    std::setvbuf(file, nullptr, _IONBF, 0);
    return std::fwrite(bytes, 1, size, file) == size;
}

/// Fills the open target with the current entry. An entry without bytes leaves it empty.
bool WriteCurrentEntry(ZipEntries& archive, EntryBuffer& buffer, std::FILE* file) {
    const auto size = static_cast<std::size_t>(archive.EntrySize());
    if (size == 0) {
        return true;
    }
    char* bytes = buffer.Reserve(size);
    return bytes != nullptr && archive.ReadEntry(bytes) && WriteAll(file, bytes, size);
}

bool ExtractCurrentEntry(ZipEntries& archive, EntryBuffer& buffer, const std::string& target) {
    std::FILE* const file = platform::OpenStream(target, "wb");
    if (file == nullptr) {
        return false;
    }
    const bool written = WriteCurrentEntry(archive, buffer, file);
    return std::fclose(file) == 0 && written;
}

int ExtractFile(ZipEntries& archive, EntryBuffer& buffer, const std::string& name, const std::string& destination) {
    if (!IsSafeEntryName(name) || !archive.OpenEntry(name)) {
        HVL_LOG(Error, "ERROR: failed to open zip file entry " << name);
        return -1;
    }
    const bool extracted = ExtractCurrentEntry(archive, buffer, HVL::FileUtils::JoinPath(destination, name));
    if (!archive.CloseEntry() || !extracted) {
        HVL_LOG(Error, "ERROR: failed to write zip entry file " << name);
        return -1;
    }
    return 0;
}

/// Parents are found by `\`, so that is how the folder is handed on; an archive need not list a folder's parents.
int MakeEntryDirectory(const std::string& name, const std::string& joined) {
    if (!IsSafeEntryName(name)) {
        return -1;
    }
    std::string path = HVL::FileUtils::StripTrailingSeparator(joined);
    std::ranges::replace(path, '/', '\\');
    return HVL::FileUtils::CreateDirectories(path);
}

int ExtractDirectory(const std::string& name, const std::string& destination) {
    const std::string path = HVL::FileUtils::JoinPath(destination, name);
    const int result = MakeEntryDirectory(name, path);
    if (result != 0) {
        HVL_LOG(Error, "ERROR: failed to create directory " << path);
    }
    return result;
}

std::string UpperCase(std::string_view text) {
    std::string upper(text);
    std::ranges::transform(upper, upper.begin(), [](char c) { return c >= 'a' && c <= 'z' ? char(c - 'a' + 'A') : c; });
    return upper;
}

/// Names that reach a device from any folder, whatever extension follows. The superscript digits count as digits.
bool NamesDevice(std::string_view component) {
    std::string stem = UpperCase(component.substr(0, component.find('.')));
    stem.erase(stem.find_last_not_of(' ') + 1);
    static constexpr std::array<std::string_view, 6> kDevices{"CON", "PRN", "AUX", "NUL", "CONIN$", "CONOUT$"};
    static constexpr std::array<std::string_view, 13> kPorts{"0", "1", "2", "3",        "4",        "5",       "6",
                                                             "7", "8", "9", "\xC2\xB9", "\xC2\xB2", "\xC2\xB3"};
    const bool port = HVL::StringUtils::StartsWith(stem, "COM") || HVL::StringUtils::StartsWith(stem, "LPT");
    return std::ranges::find(kDevices, stem) != kDevices.end() ||
           (port && std::ranges::find(kPorts, std::string_view(stem).substr(3)) != kPorts.end());
}

/// Windows drops blanks and dots at the end of a component, which turns ".. " into a step up.
bool IsSafeComponent(std::string_view component) {
    if (component.empty() || component == ".") {
        return true;
    }
    return component.back() != '.' && component.back() != ' ' && !NamesDevice(component);
}

}  // namespace

bool IsSafeEntryName(const std::string& name) {
    constexpr std::string_view kSeparators = "/\\";
    if (name.empty() || kSeparators.find(name.front()) != std::string_view::npos ||
        name.find(':') != std::string::npos) {
        return false;
    }
    std::string_view rest(name);
    while (!rest.empty()) {
        const auto end = std::min(rest.find_first_of(kSeparators), rest.size());
        if (!IsSafeComponent(rest.substr(0, end))) {
            return false;
        }
        rest.remove_prefix(std::min(end + 1, rest.size()));
    }
    return true;
}

int ExtractZip(const std::string& archivePath, const std::string& destination) {
    HVL_LOG(Debug, "DEBUG - extracting " << archivePath);
    HVL_LOG(Debug, "  to directory: " << destination);
    // Whether the destination could be made shows in what is put into it.
    static_cast<void>(HVL::FileUtils::CreateDirectories(destination));
    ZipEntries archive(archivePath);
    for (const std::string& name : archive.Directories()) {
        if (const int result = ExtractDirectory(name, destination); result != 0) {
            return result;
        }
    }
    EntryBuffer buffer;
    for (const std::string& name : archive.Files()) {
        if (const int result = ExtractFile(archive, buffer, name, destination); result != 0) {
            return result;
        }
    }
    return 0;
}

}  // namespace HV
