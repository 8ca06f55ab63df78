#include "hvframework/StringUtils.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdint>
#include <limits>

#include "platform/win32.h"
#include "tests/support/Machine.h"

namespace HVL::StringUtils {
namespace {

using testing::ElementsAre;

TEST(StartsWith, ComparesByteByByte) {
    EXPECT_TRUE(StartsWith("preflight-x", "preflight-"));
    EXPECT_FALSE(StartsWith("Preflight-x", "preflight-"));
}

TEST(StartsWith, IsFalseForAPrefixLongerThanTheText) {
    EXPECT_FALSE(StartsWith("pre", "preflight-"));
}

TEST(StartsWith, IsTrueForTheWholeTextAndForNothing) {
    EXPECT_TRUE(StartsWith("pre", "pre"));
    EXPECT_TRUE(StartsWith("pre", ""));
    EXPECT_TRUE(StartsWith("", ""));
}

TEST(EndsWith, ComparesByteByByte) {
    EXPECT_TRUE(EndsWith("a.hvpkg", ".hvpkg"));
    EXPECT_FALSE(EndsWith("a.HVPKG", ".hvpkg"));
}

TEST(EndsWith, IsFalseForASuffixLongerThanTheText) {
    EXPECT_FALSE(EndsWith("kg", ".hvpkg"));
}

TEST(EndsWith, IsTrueForTheWholeTextAndForNothing) {
    EXPECT_TRUE(EndsWith("kg", "kg"));
    EXPECT_TRUE(EndsWith("kg", ""));
}

TEST(Split, GivesEveryPieceEmptyOnesIncluded) {
    EXPECT_THAT(Split(",a,,b", ','), ElementsAre("", "a", "", "b"));
}

TEST(Split, GivesALastEmptyPieceForATrailingSeparator) {
    EXPECT_THAT(Split("a,b,", ','), ElementsAre("a", "b", ""));
}

TEST(Split, GivesTheTextItselfWithoutASeparator) {
    EXPECT_THAT(Split("a b", ','), ElementsAre("a b"));
    EXPECT_THAT(Split("", ','), ElementsAre(""));
}

TEST(ToString, WritesSignedDecimals) {
    EXPECT_EQ(ToString(0), "0");
    EXPECT_EQ(ToString(-2), "-2");
    EXPECT_EQ(ToString(131072), "131072");
    EXPECT_EQ(ToString(std::numeric_limits<std::int64_t>::min()), "-9223372036854775808");
}

TEST(ReplaceAll, ReplacesEveryOccurrence) {
    EXPECT_EQ(ReplaceAll("a/b/c", "/", "\\"), "a\\b\\c");
    EXPECT_EQ(ReplaceAll("%N and %N", "%N", ""), " and ");
}

TEST(ReplaceAll, DoesNotSearchWhatItInserted) {
    EXPECT_EQ(ReplaceAll("aa", "a", "aa"), "aaaa");
    EXPECT_EQ(ReplaceAll("abb", "ab", "a"), "ab");
}

TEST(ReplaceAll, LeavesATextWithoutTheTokenAlone) {
    EXPECT_EQ(ReplaceAll("text", "token", "x"), "text");
    EXPECT_EQ(ReplaceAll("text", "", "x"), "text");
    EXPECT_EQ(ReplaceAll("", "token", "x"), "");
}

TEST(RemoveChar, RemovesEveryOneOfThem) {
    EXPECT_EQ(RemoveChar("\"a\" \"b\"", '"'), "a b");
    EXPECT_EQ(RemoveChar("abc", 'x'), "abc");
    EXPECT_EQ(RemoveChar("xx", 'x'), "");
}

TEST(StripQuotes, RemovesOneQuoteFromEachEnd) {
    EXPECT_EQ(StripQuotes("\"a b\""), "a b");
    EXPECT_EQ(StripQuotes("'a b'"), "a b");
    EXPECT_EQ(StripQuotes("\"\"a\"\""), "\"a\"");
}

TEST(StripQuotes, LooksAtEachEndByItself) {
    EXPECT_EQ(StripQuotes("\"a"), "a");
    EXPECT_EQ(StripQuotes("a'"), "a");
    EXPECT_EQ(StripQuotes("\"a'"), "a");
}

TEST(StripQuotes, LeavesOtherTextsAlone) {
    EXPECT_EQ(StripQuotes("a \"b\" c"), "a \"b\" c");
    EXPECT_EQ(StripQuotes(""), "");
}

TEST(StripQuotes, TakesALoneQuoteOnce) {
    EXPECT_EQ(StripQuotes("\""), "");
    EXPECT_EQ(StripQuotes("''"), "");
}

TEST(Trim, TakesWhiteSpaceFromBothEndsAlone) {
    EXPECT_EQ(Trim(" \t\n\v\f\ra b\r\f\v\n\t "), "a b");
    EXPECT_EQ(Trim("a"), "a");
    EXPECT_EQ(Trim(kWhiteSpace), "");
    EXPECT_EQ(Trim(""), "");
}

TEST(LetterCase, IsChangedForTheLettersOfAsciiAlone) {
    EXPECT_EQ(ToLower("@AZ[`az{ \xC3\x84"), "@az[`az{ \xC3\x84");
    EXPECT_EQ(ToUpper("@AZ[`az{ \xC3\xA4"), "@AZ[`AZ{ \xC3\xA4");
    EXPECT_EQ(ToLower('Q'), 'q');
    EXPECT_EQ(ToLower(std::string()), "");
}

class EnvironmentValue : public testing::Test {
protected:
    Machine machine;
};

TEST_F(EnvironmentValue, IsTheVariablesText) {
    SetEnvironmentVariableA("HV_TEST_VALUE", "C:\\Some Place");
    EXPECT_EQ(GetEnvironmentValue("HV_TEST_VALUE"), "C:\\Some Place");
}

TEST_F(EnvironmentValue, IsEmptyForAVariableThatIsNotSet) {
    SetEnvironmentVariableA("HV_TEST_VALUE", nullptr);
    EXPECT_EQ(GetEnvironmentValue("HV_TEST_VALUE"), "");
}

TEST_F(EnvironmentValue, IsReadIntoABufferOf8192Bytes) {
    SetEnvironmentVariableA("HV_TEST_VALUE", std::string(8191, 'x').c_str());
    EXPECT_EQ(GetEnvironmentValue("HV_TEST_VALUE"), std::string(8191, 'x'));
    SetEnvironmentVariableA("HV_TEST_VALUE", std::string(8192, 'x').c_str());
    EXPECT_EQ(GetEnvironmentValue("HV_TEST_VALUE"), "");
}

}  // namespace
}  // namespace HVL::StringUtils
