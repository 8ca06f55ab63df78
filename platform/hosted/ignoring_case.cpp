#include "platform/hosted/ignoring_case.h"

#include <algorithm>
#include <cstdint>
#include <string>

#include "platform/utf8.h"

#ifdef _WIN32
#include "platform/win32.h"
#else
#include <locale.h>
#include <wctype.h>
#endif

namespace hosted {
namespace {

unsigned char UpperCaseOfAscii(char c) {
    return static_cast<unsigned char>(c >= 'a' && c <= 'z' ? c - 'a' + 'A' : c);
}

#ifdef _WIN32
wchar_t UpperCaseOfOther(wchar_t c) {
    wchar_t upper = c;
    LCMapStringEx(LOCALE_NAME_INVARIANT, LCMAP_UPPERCASE, &c, 1, &upper, 1, nullptr, nullptr, 0);
    return upper;
}
#else
wchar_t UpperCaseOfOther(wchar_t c) {
    // The C library's own, which is there whatever languages are installed.
    static const locale_t locale = newlocale(LC_CTYPE_MASK, "C.UTF-8", nullptr);
    return locale != nullptr ? static_cast<wchar_t>(towupper_l(static_cast<wint_t>(c), locale)) : c;
}
#endif

bool IsAscii(wchar_t c) {
    return static_cast<std::uint32_t>(c) <= 0x7F;
}

wchar_t UpperCase(wchar_t c) {
    if (IsAscii(c)) {
        return static_cast<wchar_t>(UpperCaseOfAscii(static_cast<char>(c)));
    }
    // For Windows no other letter has its upper case in ASCII: the Turkish i without its dot stays what it is.
    const wchar_t upper = UpperCaseOfOther(c);
    return IsAscii(upper) ? c : upper;
}

std::wstring UpperCase(std::string_view text) {
    std::wstring wide = platform::WideFromUtf8(text);
    std::transform(wide.begin(), wide.end(), wide.begin(), [](wchar_t c) { return UpperCase(c); });
    return wide;
}

bool IsAscii(std::string_view text) {
    return std::all_of(text.begin(), text.end(), [](char c) { return static_cast<unsigned char>(c) <= 0x7F; });
}

}  // namespace

bool LessIgnoringCase::operator()(std::string_view left, std::string_view right) const {
    if (!IsAscii(left) || !IsAscii(right)) {
        return UpperCase(left) < UpperCase(right);
    }
    return std::lexicographical_compare(left.begin(), left.end(), right.begin(), right.end(),
                                        [](char a, char b) { return UpperCaseOfAscii(a) < UpperCaseOfAscii(b); });
}

bool EqualsIgnoringCase(std::string_view left, std::string_view right) {
    if (!IsAscii(left) || !IsAscii(right)) {
        return UpperCase(left) == UpperCase(right);
    }
    return std::equal(left.begin(), left.end(), right.begin(), right.end(),
                      [](char a, char b) { return UpperCaseOfAscii(a) == UpperCaseOfAscii(b); });
}

}  // namespace hosted
