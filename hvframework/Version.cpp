#include "hvframework/Version.h"

#include <array>
#include <cstdlib>
#include <utility>

namespace HVL {
namespace {

// The number at `position`. A part needs no cutting out: reading stops by itself at the next dot.
std::int32_t NumberAt(const std::string& text, std::size_t position) {
    return std::atoi(text.c_str() + position);
}

// Ordered as versions are: std::array compares element by element.
std::array<std::int32_t, 4> Numbers(const Version& version) {
    std::array<std::int32_t, 4> numbers;
    version.GetParts(numbers[0], numbers[1], numbers[2], numbers[3]);
    return numbers;
}

}  // namespace

Version::Version(std::string versionText) : text(std::move(versionText)) {}

bool Version::IsLess(const Version& other) const {
    return Numbers(*this) < Numbers(other);
}

bool Version::IsEqual(const Version& other) const {
    return Numbers(*this) == Numbers(other);
}

bool Version::IsLessOrEqual(const Version& other) const {
    return IsLess(other) || IsEqual(other);
}

bool Version::IsGreater(const Version& other) const {
    return !IsLess(other) && !IsEqual(other);
}

bool Version::IsGreaterOrEqual(const Version& other) const {
    return !IsLess(other);
}

void Version::GetParts(std::int32_t& major, std::int32_t& minor, std::int32_t& patch, std::int32_t& build) const {
    major = NumberAt(text, 0);
    minor = patch = build = 0;
    std::size_t dot = text.find('.');
    for (std::int32_t* part : {&minor, &patch, &build}) {
        if (dot == std::string::npos) {
            return;
        }
        *part = NumberAt(text, dot + 1);
        dot = text.find('.', dot + 1);
    }
}

// The patch stands after the last dot here, wherever that is, and not after the second as in GetParts: hosts are
// shown and compared by these three numbers, so making the two agree would change which versions of a host are found.
void Version::GetShortParts(std::int32_t& major, std::int32_t& minor, std::int32_t& patch) const {
    major = NumberAt(text, 0);
    minor = patch = 0;
    const std::size_t first = text.find('.');
    if (first == std::string::npos) {
        return;
    }
    minor = NumberAt(text, first + 1);
    const std::size_t last = text.rfind('.');
    if (last != first) {
        patch = NumberAt(text, last + 1);
    }
}

void Version::SetFromParts(std::uint32_t major, std::uint32_t minor, std::uint32_t patch) {
    text = std::to_string(major) + "." + std::to_string(minor) + "." + std::to_string(patch);
}

}  // namespace HVL
