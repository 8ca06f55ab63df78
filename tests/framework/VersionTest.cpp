#include "hvframework/Version.h"

#include <gtest/gtest.h>

#include <array>
#include <cstdlib>

namespace HVL {
namespace {

using Parts = std::array<std::int32_t, 4>;
using ShortParts = std::array<std::int32_t, 3>;

Parts PartsOf(const std::string& text) {
    Parts parts = {77, 77, 77, 77};
    Version(text).GetParts(parts[0], parts[1], parts[2], parts[3]);
    return parts;
}

ShortParts ShortPartsOf(const std::string& text) {
    ShortParts parts = {77, 77, 77};
    Version(text).GetShortParts(parts[0], parts[1], parts[2]);
    return parts;
}

bool Less(const std::string& left, const std::string& right) {
    return Version(left).IsLess(Version(right));
}

bool Equal(const std::string& left, const std::string& right) {
    return Version(left).IsEqual(Version(right));
}

TEST(Version, KeepsItsTextAsItCame) {
    EXPECT_EQ(Version().text, "");
    EXPECT_EQ(Version(" 2.0-d1 ").text, " 2.0-d1 ");
}

TEST(Version, ReadsFourNumbers) {
    EXPECT_EQ(PartsOf("10.20.30.40"), (Parts{10, 20, 30, 40}));
}

TEST(Version, TreatsMissingNumbersAsZero) {
    EXPECT_EQ(PartsOf("7"), (Parts{7, 0, 0, 0}));
    EXPECT_EQ(PartsOf("7."), (Parts{7, 0, 0, 0}));
    EXPECT_EQ(PartsOf("7.1"), (Parts{7, 1, 0, 0}));
    EXPECT_EQ(PartsOf("7.1.2"), (Parts{7, 1, 2, 0}));
    EXPECT_EQ(PartsOf(".1..3"), (Parts{0, 1, 0, 3}));
}

TEST(Version, IgnoresWhatStandsAfterTheFourthNumber) {
    EXPECT_EQ(PartsOf("1.2.3.4.5"), (Parts{1, 2, 3, 4}));
}

TEST(Version, EndsANumberAtTheFirstCharacterThatIsNoDigit) {
    EXPECT_EQ(PartsOf("2.0-d1"), (Parts{2, 0, 0, 0}));
    EXPECT_EQ(PartsOf("2b3.4"), (Parts{2, 4, 0, 0}));
}

TEST(Version, ReadsATextWithoutNumbersAsZeros) {
    EXPECT_EQ(PartsOf("abc"), (Parts{0, 0, 0, 0}));
    EXPECT_EQ(PartsOf(""), (Parts{0, 0, 0, 0}));
}

TEST(Version, ReadsNegativeNumbers) {
    EXPECT_EQ(PartsOf("-1.0"), (Parts{-1, 0, 0, 0}));
    EXPECT_TRUE(Less("-1.0", "0.0"));
}

TEST(Version, ReadsANumberTooLongFor32BitsAsTheRuntimeDoes) {
    EXPECT_EQ(PartsOf("99999999999.1")[0], std::atoi("99999999999"));
}

TEST(Version, OrdersByTheFirstNumberThatDiffers) {
    EXPECT_TRUE(Less("1.9.9.9", "2"));
    EXPECT_TRUE(Less("1.9", "1.10"));
    EXPECT_TRUE(Less("3.1.1", "3.1.2"));
    EXPECT_TRUE(Less("10.0.0", "10.0.0.1"));
    EXPECT_FALSE(Less("2", "1.9.9.9"));
    EXPECT_FALSE(Less("1.10", "1.9"));
    EXPECT_FALSE(Less("10.0.0.1", "10.0.0"));
}

TEST(Version, OfEqualNumbersIsNotLess) {
    EXPECT_FALSE(Less("1.2", "1.2.0.0"));
}

TEST(Version, IsEqualWhenAllFourNumbersAre) {
    EXPECT_TRUE(Equal("1.0", "1"));
    EXPECT_TRUE(Equal("0", ""));
    EXPECT_TRUE(Equal("1.2", "1.2.0.0"));
    EXPECT_TRUE(Equal("1.2-beta", "1.2"));
    EXPECT_FALSE(Equal("10.0.0.1", "10.0.0"));
}

TEST(Version, DoesNotCountTheTextAfterANumber) {
    const Version first("2.0-d1");
    const Version second("2.0-d2");
    EXPECT_TRUE(first.IsEqual(second));
    EXPECT_TRUE(first.IsLessOrEqual(second));
    EXPECT_TRUE(first.IsGreaterOrEqual(second));
    EXPECT_FALSE(first.IsLess(second));
    EXPECT_FALSE(first.IsGreater(second));
}

TEST(Version, ComparesInAllFiveWays) {
    const Version lower("1.9");
    const Version higher("1.10");
    EXPECT_TRUE(lower.IsLess(higher));
    EXPECT_FALSE(lower.IsEqual(higher));
    EXPECT_TRUE(lower.IsLessOrEqual(higher));
    EXPECT_FALSE(lower.IsGreater(higher));
    EXPECT_FALSE(lower.IsGreaterOrEqual(higher));
    EXPECT_FALSE(higher.IsLessOrEqual(lower));
    EXPECT_TRUE(higher.IsGreater(lower));
    EXPECT_TRUE(higher.IsGreaterOrEqual(lower));
}

TEST(Version, HasShortPartsOfOneNumber) {
    EXPECT_EQ(ShortPartsOf("7"), (ShortParts{7, 0, 0}));
    EXPECT_EQ(ShortPartsOf("7."), (ShortParts{7, 0, 0}));
    EXPECT_EQ(ShortPartsOf(""), (ShortParts{0, 0, 0}));
}

TEST(Version, HasShortPartsOfTwoNumbers) {
    EXPECT_EQ(ShortPartsOf("7.1"), (ShortParts{7, 1, 0}));
    EXPECT_EQ(ShortPartsOf("7.1-d2"), (ShortParts{7, 1, 0}));
}

TEST(Version, TakesTheLastNumberForTheShortPatch) {
    EXPECT_EQ(ShortPartsOf("7.1.2"), (ShortParts{7, 1, 2}));
    EXPECT_EQ(ShortPartsOf("7.1.2.3"), (ShortParts{7, 1, 3}));
    EXPECT_EQ(ShortPartsOf("1.2.3.4"), (ShortParts{1, 2, 4}));
    EXPECT_EQ(ShortPartsOf("1..5"), (ShortParts{1, 0, 5}));
    EXPECT_EQ(PartsOf("1.2.3.4")[2], 3);
}

TEST(Version, IsWrittenFromThreeNumbers) {
    Version version("8");
    version.SetFromParts(13, 0, 5);
    EXPECT_EQ(version.text, "13.0.5");
    version.SetFromParts(4294967295U, 1, 0);
    EXPECT_EQ(version.text, "4294967295.1.0");
}

}  // namespace
}  // namespace HVL
