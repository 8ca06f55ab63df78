// How a line falls apart.
#include "hvdeploy/src/ArgumentLine.h"

#include <gtest/gtest.h>

namespace {

using Texts = std::vector<std::string>;

Texts Pieces(const std::string& line) {
    Texts pieces;
    EXPECT_EQ(HV::SplitArgumentLine(line, pieces), HV::LineSplit::Done) << line;
    return pieces;
}

HV::LineSplit Split(const std::string& line) {
    Texts pieces{"left over"};
    return HV::SplitArgumentLine(line, pieces);
}

TEST(ArgumentLine, IsBlankWhenNothingButWhiteSpaceIsThere) {
    EXPECT_EQ(Split(""), HV::LineSplit::Blank);
    EXPECT_EQ(Split(" \t\n\v\f\r"), HV::LineSplit::Blank);
}

TEST(ArgumentLine, ClearsTheListThatItFills) {
    Texts pieces{"left over"};
    EXPECT_EQ(HV::SplitArgumentLine(" ", pieces), HV::LineSplit::Blank);
    EXPECT_TRUE(pieces.empty());
}

TEST(ArgumentLine, SeparatesAtEveryKindOfWhiteSpace) {
    EXPECT_EQ(Pieces("a b\tc\nd\ve\ff\rg"), (Texts{"a", "b", "c", "d", "e", "f", "g"}));
}

TEST(ArgumentLine, DropsEmptyPieces) {
    EXPECT_EQ(Pieces("  a \t  b  "), (Texts{"a", "b"}));
}

TEST(ArgumentLine, IsOneArgumentWithoutASeparator) {
    EXPECT_EQ(Pieces("   --verbose"), (Texts{"--verbose"}));
}

TEST(ArgumentLine, KeepsABlankInsideDoubleQuotesAndTheQuotes) {
    EXPECT_EQ(Pieces(R"(dir="C:\a b" --verbose)"), (Texts{R"(dir="C:\a b")", "--verbose"}));
}

TEST(ArgumentLine, KeepsABlankInsideSingleQuotesAndTheQuotes) {
    EXPECT_EQ(Pieces("skip='a b' --verbose"), (Texts{"skip='a b'", "--verbose"}));
}

TEST(ArgumentLine, TakesQuotesInTheMiddleOfAWord) {
    EXPECT_EQ(Pieces("a\"b c\"d e"), (Texts{"a\"b c\"d", "e"}));
}

TEST(ArgumentLine, SeparatesBetweenTwoQuotedPairs) {
    EXPECT_EQ(Pieces("\"a b\" \"c d\" 'e f' 'g h'"), (Texts{"\"a b\"", "\"c d\"", "'e f'", "'g h'"}));
}

TEST(ArgumentLine, RefusesAnOddNumberOfDoubleQuotes) {
    EXPECT_EQ(Split("dir=\"C:\\a b"), HV::LineSplit::UnbalancedQuotes);
    EXPECT_EQ(Split("\""), HV::LineSplit::UnbalancedQuotes);
    EXPECT_EQ(Split("\"a\" \"b"), HV::LineSplit::UnbalancedQuotes);
}

TEST(ArgumentLine, HidesADoubleQuoteBetweenApostrophes) {
    EXPECT_EQ(Pieces("skip='5\" disc' --verbose"), (Texts{"skip='5\" disc'", "--verbose"}));
}

TEST(ArgumentLine, IgnoresALoneApostrophe) {
    EXPECT_EQ(Pieces("skip=it's here"), (Texts{"skip=it's", "here"}));
}

TEST(ArgumentLine, IgnoresTheLastOfThreeApostrophes) {
    EXPECT_EQ(Pieces("'a b' c'd e"), (Texts{"'a b'", "c'd", "e"}));
}

TEST(ArgumentLine, PairsAnApostropheInsideDoubleQuotesWithTheNextOfTheLine) {
    // The pair of apostrophes swallows the closing double quote, and one is left.
    EXPECT_EQ(Split("dir=\"it's here\" skip=that's"), HV::LineSplit::UnbalancedQuotes);
    // With two swallowed the line is balanced, and one argument reaches from the first apostrophe to the second.
    EXPECT_EQ(Pieces("a\" b's \" \" c's d\" e"), (Texts{"a\" b's \" \" c's d\"", "e"}));
}

TEST(ArgumentLine, FindsNoDoubleQuotesThatApostrophesHide) {
    EXPECT_EQ(Pieces("'\"' a b '\"'"), (Texts{"'\"'", "a", "b", "'\"'"}));
}

}  // namespace
