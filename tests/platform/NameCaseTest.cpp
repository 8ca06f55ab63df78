#include "platform/name_case.h"

#include <gtest/gtest.h>

#include "platform/utf8.h"

namespace {

std::wstring Upper(const std::string& utf8) {
    return platform::NameInUpperCase(platform::WideFromUtf8(utf8));
}

TEST(NameCase, FoldsLettersOfEveryAlphabet) {
    EXPECT_EQ(Upper("az AZ 09 [`{~"), L"AZ AZ 09 [`{~");
    EXPECT_EQ(Upper("\xC3\xA0\xC3\xBE\xC3\xBF"), Upper("\xC3\x80\xC3\x9E\xC5\xB8"));
    EXPECT_EQ(Upper("\xCE\xB1\xCF\x83\xCF\x89"), Upper("\xCE\x91\xCE\xA3\xCE\xA9"));
    EXPECT_EQ(Upper("\xD0\xB6\xD1\x8F"), Upper("\xD0\x96\xD0\xAF"));
    EXPECT_EQ(Upper("\xD5\xA1"), Upper("\xD4\xB1"));
}

TEST(NameCase, LeavesAloneWhatHasNoUpperCaseOfOneCharacter) {
    const std::wstring text = platform::WideFromUtf8("\xC3\x9F \xC3\x97 \xC3\xB7 \xE5\x85\x89 \xF0\x9F\x98\x80");
    EXPECT_EQ(platform::NameInUpperCase(text), text);
}

TEST(NameCase, IsItsOwnUpperCase) {
    int folded = 0;
    for (wchar_t unit = 1; unit < 0xFFFF; ++unit) {
        const std::wstring name(1, unit);
        const std::wstring upper = platform::NameInUpperCase(name);
        folded += upper != name ? 1 : 0;
        EXPECT_EQ(platform::NameInUpperCase(upper), upper) << static_cast<int>(unit);
    }
    EXPECT_GT(folded, 1000);
}

TEST(Utf8, IsToldFromWhatOnlyResemblesIt) {
    for (const char* text : {"", "plain", "Gl\xC3\xBChen", "\xE5\x85\x89", "\xF0\x9F\x98\x80", "\xEF\xBF\xBD"}) {
        EXPECT_TRUE(platform::IsUtf8(text)) << text;
    }
    for (const char* text : {"\xFF", "a\x80", "\xC3", "\xC0\xAF", "\xE0\x80\xAF", "\xED\xA0\x80", "\xF4\x90\x80\x80"}) {
        EXPECT_FALSE(platform::IsUtf8(text)) << text;
    }
}

}  // namespace
