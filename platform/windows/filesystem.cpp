#include "platform/windows/filesystem.h"

#include <algorithm>
#include <codecvt>
#include <cwchar>
#include <locale>

#include "platform/utf8.h"

namespace platform {
namespace {

/// UTF-8 for the library's paths. It is always handed a whole text, and room for the longest result.
class Utf8Facet : public std::codecvt<wchar_t, char, std::mbstate_t> {
protected:
    result do_in(std::mbstate_t&, const char* from, const char* fromEnd, const char*& fromNext, wchar_t* to,
                 wchar_t* toEnd, wchar_t*& toNext) const override {
        return Convert(WideFromUtf8({from, fromEnd}), fromEnd, fromNext, to, toEnd, toNext);
    }
    result do_out(std::mbstate_t&, const wchar_t* from, const wchar_t* fromEnd, const wchar_t*& fromNext, char* to,
                  char* toEnd, char*& toNext) const override {
        return Convert(Utf8FromWide({from, fromEnd}), fromEnd, fromNext, to, toEnd, toNext);
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

bool UseUtf8InPaths() {
    static const bool done = [] {
        fs::path::imbue(std::locale(std::locale(), new Utf8Facet));
        return true;
    }();
    return done;
}

}  // namespace platform
