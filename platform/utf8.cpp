#include "platform/utf8.h"

#include <algorithm>
#include <cstdint>

namespace platform {
namespace {

constexpr char32_t Replacement = 0xFFFD;
constexpr bool WideIsUtf16 = sizeof(wchar_t) == 2;

/// What a lead byte announces: how many bytes follow, and between which bounds the first of them lies. The bounds keep
/// out overlong forms, surrogates and what lies above U+10FFFF.
struct Lead {
    int followers = -1;
    unsigned char lowest = 0x80;
    unsigned char highest = 0xBF;
};

Lead ReadLead(unsigned char byte) {
    if (byte < 0x80) {
        return {.followers = 0};
    }
    if (byte >= 0xC2 && byte <= 0xDF) {
        return {.followers = 1};
    }
    if (byte >= 0xE0 && byte <= 0xEF) {
        return {.followers = 2,
                .lowest = static_cast<unsigned char>(byte == 0xE0 ? 0xA0 : 0x80),
                .highest = static_cast<unsigned char>(byte == 0xED ? 0x9F : 0xBF)};
    }
    if (byte >= 0xF0 && byte <= 0xF4) {
        return {.followers = 3,
                .lowest = static_cast<unsigned char>(byte == 0xF0 ? 0x90 : 0x80),
                .highest = static_cast<unsigned char>(byte == 0xF4 ? 0x8F : 0xBF)};
    }
    return {};
}

/// Takes one character, or one malformed piece, off the front of `text`.
char32_t TakeCharacter(std::string_view& text) {
    const auto first = static_cast<unsigned char>(text.front());
    text.remove_prefix(1);
    Lead lead = ReadLead(first);
    if (lead.followers < 0) {
        return Replacement;
    }
    char32_t character = lead.followers == 0 ? first : static_cast<char32_t>(first & (0x3F >> lead.followers));
    for (int i = 0; i < lead.followers; ++i) {
        if (text.empty()) {
            return Replacement;
        }
        const auto next = static_cast<unsigned char>(text.front());
        if (next < lead.lowest || next > lead.highest) {
            return Replacement;
        }
        text.remove_prefix(1);
        character = (character << 6) | (next & 0x3Fu);
        lead.lowest = 0x80;
        lead.highest = 0xBF;
    }
    return character;
}

void AppendWide(std::wstring& wide, char32_t character) {
    if (WideIsUtf16 && character > 0xFFFF) {
        wide.push_back(static_cast<wchar_t>(0xD7C0 + (character >> 10)));
        wide.push_back(static_cast<wchar_t>(0xDC00 + (character & 0x3FF)));
    } else {
        wide.push_back(static_cast<wchar_t>(character));
    }
}

bool IsLowSurrogate(char32_t unit) {
    return unit >= 0xDC00 && unit <= 0xDFFF;
}
bool IsSurrogate(char32_t unit) {
    return unit >= 0xD800 && unit <= 0xDFFF;
}

char32_t UnitValue(wchar_t unit) {
    return WideIsUtf16 ? static_cast<char32_t>(static_cast<std::uint16_t>(unit)) : static_cast<char32_t>(unit);
}

/// Takes one character off the front of `text`; half a pair of surrogates counts as malformed.
char32_t TakeCharacter(std::wstring_view& text) {
    const char32_t first = UnitValue(text.front());
    text.remove_prefix(1);
    if (!IsSurrogate(first)) {
        return first > 0x10FFFF ? Replacement : first;
    }
    if (!WideIsUtf16 || IsLowSurrogate(first) || text.empty() || !IsLowSurrogate(UnitValue(text.front()))) {
        return Replacement;
    }
    const char32_t second = UnitValue(text.front());
    text.remove_prefix(1);
    return 0x10000 + ((first - 0xD800) << 10) + (second - 0xDC00);
}

void AppendFollower(std::string& narrow, char32_t bits) {
    narrow.push_back(static_cast<char>(0x80 | (bits & 0x3F)));
}

void AppendUtf8(std::string& narrow, char32_t character) {
    if (character < 0x80) {
        narrow.push_back(static_cast<char>(character));
    } else if (character < 0x800) {
        narrow.push_back(static_cast<char>(0xC0 | (character >> 6)));
        AppendFollower(narrow, character);
    } else if (character < 0x10000) {
        narrow.push_back(static_cast<char>(0xE0 | (character >> 12)));
        AppendFollower(narrow, character >> 6);
        AppendFollower(narrow, character);
    } else {
        narrow.push_back(static_cast<char>(0xF0 | (character >> 18)));
        AppendFollower(narrow, character >> 12);
        AppendFollower(narrow, character >> 6);
        AppendFollower(narrow, character);
    }
}

}  // namespace

std::wstring WideFromUtf8(std::string_view text) {
    std::wstring wide;
    wide.reserve(text.size());
    while (!text.empty()) {
        AppendWide(wide, TakeCharacter(text));
    }
    return wide;
}

std::string Utf8FromWide(std::wstring_view text) {
    std::string narrow;
    narrow.reserve(text.size());
    while (!text.empty()) {
        AppendUtf8(narrow, TakeCharacter(text));
    }
    return narrow;
}

bool IsUtf8(std::string_view text) {
    const bool ascii = std::ranges::all_of(text, [](char c) { return static_cast<unsigned char>(c) < 0x80; });
    return ascii || Utf8FromWide(WideFromUtf8(text)) == text;
}

}  // namespace platform
