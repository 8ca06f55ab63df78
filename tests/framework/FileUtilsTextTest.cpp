#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <set>
#include <string_view>
#include <thread>

#include "hvframework/FileUtils.h"
#include "platform/win32.h"
#include "tests/support/Machine.h"

// What FileUtils makes of texts alone: no file is looked at.
namespace HVL::FileUtils {
namespace {

using testing::ElementsAre;

struct Example {
    const char* input;
    const char* expected;
};

TEST(JoinPath, PutsASeparatorBetween) {
    EXPECT_EQ(JoinPath(R"(C:\a)", "b"), R"(C:\a\b)");
}

TEST(JoinPath, AddsNoneWhenTheFirstPartEndsInOne) {
    EXPECT_EQ(JoinPath(R"(C:\)", "b"), R"(C:\b)");
}

TEST(JoinPath, TakesAForwardSlashForAnOrdinaryCharacter) {
    EXPECT_EQ(JoinPath("C:/a/", "b"), R"(C:/a/\b)");
}

TEST(JoinPath, LeavesTheSecondPartAsItIs) {
    EXPECT_EQ(JoinPath(R"(C:\a)", R"(\b)"), R"(C:\a\\b)");
    EXPECT_EQ(JoinPath(R"(C:\a)", ""), R"(C:\a\)");
}

TEST(JoinPath, BeginsWithASeparatorWhenTheFirstPartIsEmpty) {
    EXPECT_EQ(JoinPath("", "Halvorn"), R"(\Halvorn)");
}

TEST(StripTrailingSeparator, RemovesOneOfEitherKind) {
    EXPECT_EQ(StripTrailingSeparator(R"(C:\a\)"), R"(C:\a)");
    EXPECT_EQ(StripTrailingSeparator("C:/a/"), "C:/a");
    EXPECT_EQ(StripTrailingSeparator(R"(C:\a\\)"), R"(C:\a\)");
}

TEST(StripTrailingSeparator, LeavesOtherTextsAlone) {
    EXPECT_EQ(StripTrailingSeparator(R"(C:\a)"), R"(C:\a)");
    EXPECT_EQ(StripTrailingSeparator(""), "");
}

TEST(GetFileName, IsTheLastComponent) {
    const Example examples[] = {
        {"", ""},         {"name", "name"}, {R"(C:\a\b)", "b"}, {R"(C:\a\b\)", "b"},
        {R"(a\b\)", "b"}, {R"(a\)", "a"},   {R"(C:\)", "C:"},   {R"(\a)", "a"},
        {R"(\a\)", "a"},  {R"(\)", ""},     {R"(a\\)", ""},     {R"(C:\a/b)", "a/b"},
    };
    int count = 0;
    for (const auto& [input, expected] : examples) {
        EXPECT_EQ(GetFileName(input), expected) << input;
        ++count;
    }
    EXPECT_EQ(count, 12);
}

TEST(GetParentPath, IsWhatStandsBeforeTheLastComponent) {
    const Example examples[] = {
        {"", ""},        {"name", "."},    {R"(C:\a\b)", R"(C:\a)"}, {R"(C:\a\b\)", R"(C:\a)"},
        {R"(a\b)", "a"}, {R"(a\b\)", "a"}, {R"(a\\)", "a"},          {R"(\\server\share)", R"(\\server)"},
        {"C:/a/b", "."},
    };
    int count = 0;
    for (const auto& [input, expected] : examples) {
        EXPECT_EQ(GetParentPath(input), expected) << input;
        ++count;
    }
    EXPECT_EQ(count, 9);
}

TEST(GetParentPath, KeepsTheSeparatorOfADriveRoot) {
    EXPECT_EQ(GetParentPath(R"(C:\)"), R"(C:\)");
    EXPECT_EQ(GetParentPath(R"(C:\a)"), R"(C:\)");
    EXPECT_EQ(GetParentPath(R"(C:\a\)"), R"(C:\)");
    EXPECT_EQ(GetParentPath(R"(C:\\)"), R"(C:\)");
}

TEST(GetParentPath, KeepsALoneSeparator) {
    EXPECT_EQ(GetParentPath(R"(\)"), R"(\)");
    EXPECT_EQ(GetParentPath(R"(\a)"), R"(\)");
    EXPECT_EQ(GetParentPath(R"(\a\)"), R"(\)");
    EXPECT_EQ(GetParentPath(R"(\\)"), R"(\)");
}

TEST(GetParentPath, IsADotForOneComponentWithATrailingSeparator) {
    EXPECT_EQ(GetParentPath(R"(a\)"), ".");
}

TEST(GetVolumeRoot, GoesUpToTheFirstColonAndSeparator) {
    EXPECT_EQ(GetVolumeRoot(R"(C:\a\b)"), R"(C:\)");
    EXPECT_EQ(GetVolumeRoot(R"(\\?\C:\a)"), R"(\\?\C:\)");
    EXPECT_EQ(GetVolumeRoot(R"(C:\D:\)"), R"(C:\)");
}

TEST(GetVolumeRoot, IsEmptyWithoutThem) {
    EXPECT_EQ(GetVolumeRoot(R"(\\server\share)"), "");
    EXPECT_EQ(GetVolumeRoot("C:/a"), "");
    EXPECT_EQ(GetVolumeRoot("C:"), "");
    EXPECT_EQ(GetVolumeRoot(""), "");
}

TEST(MatchesWildcard, TakesAStarForAnyRunOfCharacters) {
    EXPECT_TRUE(MatchesWildcard("*", ""));
    EXPECT_TRUE(MatchesWildcard("*", "abc"));
    EXPECT_TRUE(MatchesWildcard("a*", "a"));
    EXPECT_TRUE(MatchesWildcard("vegas*.exe", "vegas180.exe"));
    EXPECT_TRUE(MatchesWildcard("vegas*.exe", "vegas.exe"));
    EXPECT_TRUE(MatchesWildcard("**b**", "abc"));
    EXPECT_FALSE(MatchesWildcard("vegas*.exe", "vegas180.exe.bak"));
    EXPECT_FALSE(MatchesWildcard("a*", "ba"));
}

TEST(MatchesWildcard, TakesAQuestionMarkForOneCharacter) {
    EXPECT_TRUE(MatchesWildcard("a?c", "abc"));
    EXPECT_FALSE(MatchesWildcard("a?c", "ac"));
    EXPECT_FALSE(MatchesWildcard("a?", "a"));
    EXPECT_TRUE(MatchesWildcard("?*", "a"));
    EXPECT_FALSE(MatchesWildcard("?*", ""));
}

TEST(MatchesWildcard, ComparesTheWholeTextInItsCase) {
    EXPECT_FALSE(MatchesWildcard("A*", "abc"));
    EXPECT_FALSE(MatchesWildcard("ab", "abc"));
    EXPECT_FALSE(MatchesWildcard("abc", "ab"));
    EXPECT_TRUE(MatchesWildcard("", ""));
    EXPECT_FALSE(MatchesWildcard("", "a"));
}

TEST(MatchesWildcard, HasNoOtherSpecialCharacters) {
    EXPECT_TRUE(MatchesWildcard("[a].\\+", "[a].\\+"));
    EXPECT_FALSE(MatchesWildcard("[a]", "a"));
    EXPECT_TRUE(MatchesWildcard("a/*", "a/b/c"));
}

TEST(MatchesWildcard, RetriesAfterTheLastStar) {
    EXPECT_TRUE(MatchesWildcard("*ab", "aab"));
    EXPECT_TRUE(MatchesWildcard("*abac", "ababac"));
    EXPECT_TRUE(MatchesWildcard("a*b*c", "a1b2b3c"));
    EXPECT_FALSE(MatchesWildcard("a*b*c", "a1c2c"));
}

TEST(MatchesWildcard, StaysQuickWhereManyStarsFail) {
    std::string pattern;
    for (int count = 0; count < 50; ++count) {
        pattern += "a*";
    }
    EXPECT_FALSE(MatchesWildcard(pattern + "b", std::string(20000, 'a')));
}

// A random identifier of version 4: `h` is any lower-case hexadecimal digit, `v` the digit that tells the variant.
constexpr std::string_view kIdentifier = "hhhhhhhh-hhhh-4hhh-vhhh-hhhhhhhhhhhh";

bool IsIdentifier(std::string_view text) {
    return std::equal(text.begin(), text.end(), kIdentifier.begin(), kIdentifier.end(), [](char found, char wanted) {
        const std::string_view allowed = wanted == 'h' ? "0123456789abcdef" : wanted == 'v' ? "89ab" : "";
        return allowed.empty() ? found == wanted : allowed.find(found) != std::string_view::npos;
    });
}

bool IsNamed(const std::string& path, const std::string& begin) {
    return path.starts_with(begin) && IsIdentifier(path.substr(begin.size()));
}

TEST(MakeTempPath, PutsARandomIdentifierAfterThePrefix) {
    EXPECT_PRED2(IsNamed, MakeTempPath("tmp", R"(C:\Temp)"), R"(C:\Temp\tmp)");
    EXPECT_PRED2(IsNamed, MakeTempPath("", R"(C:\)"), R"(C:\)");
}

TEST(MakeTempPath, CutsThePrefixTo30Characters) {
    EXPECT_PRED2(IsNamed, MakeTempPath("123456789012345678901234567890", "d"), R"(d\123456789012345678901234567890)");
    EXPECT_PRED2(IsNamed, MakeTempPath("123456789012345678901234567890x", "d"), R"(d\123456789012345678901234567890)");
}

TEST(MakeTempPath, CutsNoCharacterInTwo) {
    const std::string prefix = "12345678901234567890123456789\xc3\xa4";
    EXPECT_PRED2(IsNamed, MakeTempPath(prefix, "d"), R"(d\12345678901234567890123456789)");
}

TEST(MakeTempPath, KeepsNothingAfterItsOwnMark) {
    EXPECT_PRED2(IsNamed, MakeTempPath("a-tmpXb", "d"), R"(d\a)");
    EXPECT_PRED2(IsNamed, MakeTempPath("a-tmpx", "d"), R"(d\a-tmpx)");
}

TEST(MakeTempPath, NeverGivesANameTwice) {
    std::vector<std::vector<std::string>> made(4);
    std::vector<std::thread> threads;
    for (auto& paths : made) {
        threads.emplace_back([&paths] {
            for (int count = 0; count < 500; ++count) {
                paths.push_back(MakeTempPath("tmp", "d"));
            }
        });
    }
    std::for_each(threads.begin(), threads.end(), [](std::thread& thread) { thread.join(); });
    std::set<std::string> names;
    for (const auto& paths : made) {
        names.insert(paths.begin(), paths.end());
    }
    EXPECT_EQ(names.size(), 2000U);
}

class UniqueName : public testing::Test {
protected:
    /// Searches while the first `taken` candidates exist, and records all of them.
    bool Search(const std::string& path, std::size_t taken) {
        return GetUniqueFileName(path, [&](const std::string& candidate) {
            candidates.push_back(candidate);
            return candidates.size() <= taken;
        });
    }

    std::vector<std::string> candidates;
};

TEST_F(UniqueName, IsThePathItselfWhenThatIsFree) {
    EXPECT_TRUE(Search(R"(C:\a\un.bat)", 0));
    EXPECT_THAT(candidates, ElementsAre(R"(C:\a\un.bat)"));
}

TEST_F(UniqueName, CountsBeforeTheExtension) {
    EXPECT_TRUE(Search(R"(C:\a\un.x.bat)", 2));
    EXPECT_THAT(candidates, ElementsAre(R"(C:\a\un.x.bat)", R"(C:\a\un.x-1.bat)", R"(C:\a\un.x-2.bat)"));
}

TEST_F(UniqueName, CountsAfterAPathWithoutAnExtension) {
    EXPECT_TRUE(Search(R"(C:\a.b\un)", 2));
    EXPECT_THAT(candidates, ElementsAre(R"(C:\a.b\un)", R"(C:\a.b\un-1)", R"(C:\a.b\un-2)"));
}

TEST_F(UniqueName, SearchesBesideARelativePath) {
    EXPECT_TRUE(Search("un.bat", 1));
    EXPECT_THAT(candidates, ElementsAre("un.bat", R"(.\un-1.bat)"));
}

TEST_F(UniqueName, IsFlaggedGoodWithTheLastCounter) {
    EXPECT_TRUE(Search(R"(C:\un.bat)", 131072));
    EXPECT_EQ(candidates.back(), R"(C:\un-131072.bat)");
}

TEST_F(UniqueName, GoesOnSearchingPastTheLastCounterButIsFlagged) {
    EXPECT_FALSE(Search(R"(C:\un.bat)", 131073));
    EXPECT_EQ(candidates.back(), R"(C:\un-131073.bat)");
    candidates.clear();
    EXPECT_FALSE(Search(R"(C:\un.bat)", 131080));
    EXPECT_EQ(candidates.back(), R"(C:\un-131080.bat)");
}

class WellKnownPlaces : public testing::Test {
protected:
    Machine machine;
};

TEST_F(WellKnownPlaces, ComeFromTheEnvironment) {
    SetEnvironmentVariableA("Temp", R"(C:\Other Temp)");
    SetEnvironmentVariableA("USERPROFILE", R"(C:\Users\Someone)");
    EXPECT_EQ(GetTempDirectory(), R"(C:\Other Temp)");
    EXPECT_EQ(GetUserHomeDirectory(), R"(C:\Users\Someone)");
}

TEST_F(WellKnownPlaces, AreEmptyWhenTheEnvironmentNamesNone) {
    SetEnvironmentVariableA("Temp", nullptr);
    SetEnvironmentVariableA("USERPROFILE", nullptr);
    EXPECT_EQ(GetTempDirectory(), "");
    EXPECT_EQ(GetUserHomeDirectory(), "");
}

}  // namespace
}  // namespace HVL::FileUtils
