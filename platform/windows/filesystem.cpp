#include "platform/windows/filesystem.h"

#include <algorithm>
#include <codecvt>
#include <cwchar>
#include <locale>

#include "platform/utf8.h"
#include "platform/win32.h"

namespace platform {
namespace {

/// Narrow text is what the system and the runtime take it for: in the process's code page. The manifest asks for UTF-8,
/// and Windows before version 1903 does not know how to give it.
bool IsUtf8Process() {
    static const bool isUtf8 = GetACP() == CP_UTF8;
    return isUtf8;
}

std::wstring WideFromCodePage(std::string_view text) {
    const int size = static_cast<int>(text.size());
    std::wstring wide(text.size(), L'\0');  // a byte is never more than one unit in such a code page
    const int length = MultiByteToWideChar(CP_ACP, 0, text.data(), size, wide.data(), size);
    wide.resize(static_cast<std::size_t>(length));
    return wide;
}

/// What the code page lacks becomes "?", which is in no file's name: a letter that only looks alike would be another
/// file's.
std::string CodePageFromWide(std::wstring_view text) {
    const int size = static_cast<int>(text.size());
    std::string narrow(text.size() * 4, '\0');
    const int length = WideCharToMultiByte(CP_ACP, WC_NO_BEST_FIT_CHARS, text.data(), size, narrow.data(),
                                           static_cast<int>(narrow.size()), "?", nullptr);
    narrow.resize(static_cast<std::size_t>(length));
    return narrow;
}

/// The process's code page for the library's paths. It is always handed a whole text, and room for the longest result.
class NarrowTextFacet : public std::codecvt<wchar_t, char, std::mbstate_t> {
protected:
    result do_in(std::mbstate_t&, const char* from, const char* fromEnd, const char*& fromNext, wchar_t* to,
                 wchar_t* toEnd, wchar_t*& toNext) const override {
        const std::string_view text(from, fromEnd);
        return Convert(IsUtf8Process() ? WideFromUtf8(text) : WideFromCodePage(text), fromEnd, fromNext, to, toEnd,
                       toNext);
    }
    result do_out(std::mbstate_t&, const wchar_t* from, const wchar_t* fromEnd, const wchar_t*& fromNext, char* to,
                  char* toEnd, char*& toNext) const override {
        const std::wstring_view text(from, fromEnd);
        return Convert(IsUtf8Process() ? Utf8FromWide(text) : CodePageFromWide(text), fromEnd, fromNext, to, toEnd,
                       toNext);
    }
    result do_unshift(std::mbstate_t&, char* to, char*, char*& toNext) const override {
        toNext = to;
        return noconv;
    }
    bool do_always_noconv() const noexcept override { return false; }
    int do_encoding() const noexcept override { return 0; }
    int do_length(std::mbstate_t&, const char* from, const char* fromEnd, std::size_t most) const override {
        return static_cast<int>(std::min(static_cast<std::size_t>(fromEnd - from), most));
    }
    int do_max_length() const noexcept override { return 4; }

private:
    template <class From, class To>
    static result Convert(const std::basic_string<To>& converted, const From* fromEnd, const From*& fromNext, To* to,
                          To* toEnd, To*& toNext) {
        if (static_cast<std::size_t>(toEnd - to) < converted.size()) {
            return error;
        }
        fromNext = fromEnd;
        toNext = std::copy(converted.begin(), converted.end(), to);
        return ok;
    }
};

}  // namespace

bool DecodePathsAsTheProcessDoes() {
    static const bool done = [] {
        fs::path::imbue(std::locale(std::locale(), new NarrowTextFacet));
        return true;
    }();
    return done;
}

}  // namespace platform
