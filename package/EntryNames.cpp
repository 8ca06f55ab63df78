#include "package/EntryNames.h"

#include <algorithm>
#include <array>
#include <string_view>

#include "hvframework/StringUtils.h"
#include "platform/name_case.h"
#include "platform/utf8.h"

namespace HV {
namespace {

constexpr std::string_view kSeparators = "/\\";

/// In units of UTF-16, as the file systems count.
constexpr std::size_t kLongestComponent = 255;

std::string UpperCase(std::string_view text) {
    std::string upper(text);
    std::ranges::transform(upper, upper.begin(), [](char c) { return c >= 'a' && c <= 'z' ? char(c - 'a' + 'A') : c; });
    return upper;
}

/// Takes the component before the next separator, and the separator, off the front of `rest`.
std::string_view TakeComponent(std::string_view& rest) {
    const auto end = std::min(rest.find_first_of(kSeparators), rest.size());
    const std::string_view component = rest.substr(0, end);
    rest.remove_prefix(std::min(end + 1, rest.size()));
    return component;
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

/// Wildcards, quotes and the like, the sign of drives and streams, and control characters.
bool CanStandInAName(char c) {
    constexpr std::string_view kNever = "<>:\"|?*";
    return static_cast<unsigned char>(c) >= 0x20 && kNever.find(c) == std::string_view::npos;
}

/// Each character of UTF-8 begins with a byte of its own, and those of four bytes take two units in UTF-16.
bool IsTooLong(std::string_view component) {
    std::size_t units = 0;
    for (const char c : component) {
        const auto byte = static_cast<unsigned char>(c);
        const bool begins = (byte & 0xC0U) != 0x80;
        units += byte >= 0xF0 ? 2 : begins ? 1 : 0;
    }
    return units > kLongestComponent;
}

/// Windows drops blanks and dots at the end of a component, which turns ".. " into a step up.
bool IsSafeComponent(std::string_view component) {
    if (component.empty() || component == ".") {
        return true;
    }
    return component.back() != '.' && component.back() != ' ' && std::ranges::all_of(component, CanStandInAName) &&
           !NamesDevice(component) && !IsTooLong(component);
}

}  // namespace

bool IsSafeEntryName(const std::string& name) {
    if (name.empty() || kSeparators.find(name.front()) != std::string_view::npos) {
        return false;
    }
    std::string_view rest(name);
    while (!rest.empty()) {
        if (!IsSafeComponent(TakeComponent(rest))) {
            return false;
        }
    }
    return true;
}

std::string EntryPath(const std::string& name) {
    std::string path;
    std::string_view rest(name);
    while (!rest.empty()) {
        const std::string_view component = TakeComponent(rest);
        if (!component.empty() && component != ".") {
            path.append(path.empty() ? "" : "/").append(component);
        }
    }
    return path;
}

std::string EntryNameOnWindows(const std::string& name) {
    const std::string path = EntryPath(name);
    const bool ascii = std::ranges::all_of(path, [](char c) { return static_cast<unsigned char>(c) < 0x80; });
    return ascii ? UpperCase(path) : platform::Utf8FromWide(platform::NameInUpperCase(platform::WideFromUtf8(path)));
}

}  // namespace HV
