#include <gtest/gtest.h>

#include <map>
#include <sstream>
#include <string>
#include <vector>

#include "platform/filesystem.h"

// What the logic relies on in a path. That the two targets agree in everything else is the differential test's claim.

namespace {

struct PathCase {
    fs::path given;
    fs::path expected;
};

TEST(Path, JoinsWithABackslashWhereASeparatorIsMissing) {
    EXPECT_EQ((fs::path("C:\\a") / "b").native(), L"C:\\a\\b");
    EXPECT_EQ((fs::path("C:\\a\\") / "b").native(), L"C:\\a\\b");
    EXPECT_EQ((fs::path("C:/a/") / "b").native(), L"C:/a/b");
    EXPECT_EQ((fs::path("C:\\a") / "\\b").native(), L"C:\\a\\b");
    EXPECT_EQ((fs::path("C:") / "b").native(), L"C:b");
}

TEST(Path, JoiningNothingChangesNothing) {
    EXPECT_EQ((fs::path("C:\\a") / "").native(), L"C:\\a");
    EXPECT_EQ((fs::path() / "a").native(), L"a");
}

TEST(Path, JoiningAnAbsolutePathKeepsWhatStoodThere) {
    EXPECT_EQ((fs::path("C:\\a") / "D:\\b").native(), L"C:\\a\\D:\\b");
}

TEST(Path, NamesParentsUpToTheRootAndThenNothing) {
    const std::vector<PathCase> cases = {
        {"C:\\a\\b.txt", "C:\\a"},
        {"C:\\a\\", "C:\\a"},
        {"C:\\a", "C:\\"},
        {"C:\\", "C:"},
        {"C:", ""},
        {"C:x", "C:"},
        {"a", ""},
        {"\\a", "\\"},
        {"\\", ""},
        {"\\\\server\\share", "\\\\server\\"},
        {"\\\\server", ""},
    };
    int ran = 0;
    for (const PathCase& item : cases) {
        EXPECT_EQ(item.given.parent_path().native(), item.expected.native()) << item.given;
        ++ran;
    }
    EXPECT_EQ(ran, 11);
}

TEST(Path, NamesTheLastElement) {
    const std::vector<PathCase> cases = {
        {"C:\\a\\b.txt", "b.txt"},
        {"C:\\a\\", "."},
        {"C:\\", "\\"},
        {"C:", "C:"},
        {"C:x", "x"},
        {"a", "a"},
        {"..", ".."},
        {"", ""},
    };
    int ran = 0;
    for (const PathCase& item : cases) {
        EXPECT_EQ(item.given.filename().native(), item.expected.native()) << item.given;
        ++ran;
    }
    EXPECT_EQ(ran, 8);
}

TEST(Path, SplitsANameAtItsLastDot) {
    EXPECT_EQ(fs::path("C:\\a\\suite.tar.gz").stem(), fs::path("suite.tar"));
    EXPECT_EQ(fs::path("C:\\a\\suite.tar.gz").extension(), fs::path(".gz"));
    EXPECT_EQ(fs::path("C:\\a\\.profile").extension(), fs::path(".profile"));
    EXPECT_EQ(fs::path("C:\\a.b\\c").extension(), fs::path());
    EXPECT_EQ(fs::path("..").extension(), fs::path());
}

TEST(Path, IsAbsoluteOnlyWithADriveAndARoot) {
    EXPECT_TRUE(fs::path("C:\\a").is_absolute());
    EXPECT_TRUE(fs::path("\\\\server\\share").is_absolute());
    EXPECT_FALSE(fs::path("C:a").is_absolute());
    EXPECT_FALSE(fs::path("\\a").is_absolute());
    EXPECT_FALSE(fs::path("a").is_absolute());
}

TEST(Path, ComparesElementByElement) {
    EXPECT_EQ(fs::path("C:\\a\\b"), fs::path("C:/a//b"));
    EXPECT_NE(fs::path("C:\\a\\b"), fs::path("C:\\A\\b"));
    EXPECT_NE(fs::path("C:\\a"), fs::path("C:\\a\\"));
    EXPECT_LT(fs::path("a\\z"), fs::path("a b\\a"));
}

TEST(Path, ServesAsAKey) {
    std::map<fs::path, int> values;
    values["C:\\a\\b"] = 1;
    values["C:/a/b"] = 2;
    EXPECT_EQ(values.size(), 1u);
}

TEST(Path, GivesItsElementsInOrder) {
    std::vector<std::wstring> elements;
    for (const fs::path& element : fs::path("C:\\a/b\\")) {
        elements.push_back(element.native());
    }
    EXPECT_EQ(elements, (std::vector<std::wstring>{L"C:", L"/", L"a", L"b", L"."}));
}

TEST(Path, StreamsInQuotesWithAmpersandsDoubled) {
    std::ostringstream stream;
    stream << fs::path("C:\\a b\\c&d");
    EXPECT_EQ(stream.str(), "\"C:\\a b\\c&&d\"");
}

TEST(Path, ReadsAndGivesNarrowTextAsUtf8) {
    const std::string narrow = "C:\\\xC3\x9C\\\xE6\x97\xA5.txt";
    EXPECT_EQ(fs::path(narrow).native(), L"C:\\\u00DC\\\u65E5.txt");
    EXPECT_EQ(fs::path(narrow).string(), narrow);
    EXPECT_EQ(fs::path(L"\U0001D11E").string(), "\xF0\x9D\x84\x9E");
    EXPECT_EQ(fs::path("\xF0\x9D\x84\x9E").native(), L"\U0001D11E");
}

TEST(Path, PutsAReplacementCharacterWhereNarrowTextIsMalformed) {
    const std::vector<std::pair<std::string, std::wstring>> cases = {
        {"a\xFFz", L"a\uFFFDz"},                            // no lead byte at all
        {"a\xC3", L"a\uFFFD"},                              // cut
        {"a\xE6\x97z", L"a\uFFFDz"},                        // cut inside
        {"a\x80\x80", L"a\uFFFD\uFFFD"},                    // followers without a lead
        {"a\xC0\xAF", L"a\uFFFD\uFFFD"},                    // overlong
        {"\xED\xA0\x80", L"\uFFFD\uFFFD\uFFFD"},            // half a pair of surrogates
        {"\xF4\x90\x80\x80", L"\uFFFD\uFFFD\uFFFD\uFFFD"},  // above the last character
    };
    int ran = 0;
    for (const auto& [narrow, wide] : cases) {
        EXPECT_EQ(fs::path(narrow).native(), wide);
        ++ran;
    }
    EXPECT_EQ(ran, 7);
}

TEST(Path, PutsAReplacementCharacterWhereWideTextIsMalformed) {
    EXPECT_EQ(fs::path(std::wstring(L"a") + static_cast<wchar_t>(0xD800) + L"z").string(), "a\xEF\xBF\xBDz");
    EXPECT_EQ(fs::path(std::wstring(1, static_cast<wchar_t>(0xDC00))).string(), "\xEF\xBF\xBD");
}

}  // namespace
