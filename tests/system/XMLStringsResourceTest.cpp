#include "system/XMLStringsResource.h"

#include <gtest/gtest.h>

#include "tests/support/CapturedStreams.h"

namespace {

using HV::XMLStringsResource;

/// A table with these elements in its language "en".
std::string Table(const std::string& strings) {
    return R"(<hvstrings version="1.0"><strings lang="en">)" + strings + "</strings></hvstrings>";
}

/// What Parse makes of a table, and what it says of it.
class StringsTest : public testing::Test {
protected:
    bool Parse(const std::string& xml) {
        CapturedStreams streams;
        const bool parsed = table.Parse(xml);
        said = streams.Errors();
        EXPECT_EQ(streams.Output(), "");
        return parsed;
    }

    std::string Get(const std::string& key) {
        CapturedStreams streams;
        std::string text = table.GetString(key);
        said = streams.Errors();
        EXPECT_EQ(streams.Output(), "");
        return text;
    }

    XMLStringsResource table;
    std::string said;
};

TEST_F(StringsTest, GivesTheTextOfAKey) {
    EXPECT_TRUE(Parse(Table(R"(<string key="a">one</string><string key="b">two</string>)")));
    EXPECT_EQ(said, "");
    EXPECT_EQ(Get("a"), "one");
    EXPECT_EQ(Get("b"), "two");
    EXPECT_EQ(said, "");
}

TEST_F(StringsTest, WarnsOfAnUnknownKey) {
    ASSERT_TRUE(Parse(Table(R"(<string key="a">one</string>)")));
    EXPECT_EQ(Get("A"), "");
    EXPECT_EQ(said, "WARNING: did not find string resource with key A for language-code \"en\"\n");
}

TEST_F(StringsTest, WarnsOfAMissingLanguage) {
    ASSERT_TRUE(
        Parse(R"(<hvstrings version="1.0"><strings lang="de"><string key="a">eins</string></strings></hvstrings>)"));
    EXPECT_EQ(Get("a"), "");
    EXPECT_EQ(said, "WARNING: lang en not found in this string resource collection.\n");
}

TEST_F(StringsTest, WarnsBeforeAnythingIsRead) {
    EXPECT_EQ(Get("a"), "");
    EXPECT_EQ(said, "WARNING: lang en not found in this string resource collection.\n");
}

TEST_F(StringsTest, TakesEnglishOutOfSeveralLanguages) {
    ASSERT_TRUE(Parse(R"(<hvstrings version="1.0"><strings lang="de"><string key="a">eins</string></strings>)"
                      R"(<strings lang="en"><string key="a">one</string></strings></hvstrings>)"));
    EXPECT_EQ(Get("a"), "one");
}

TEST_F(StringsTest, IsSilentAboutTextThatIsNoXml) {
    int texts = 0;
    for (const char* text : {"", "   ", "hvstrings", "<hvstrings", "<hvstrings version=\"1.0\"><strings lang=\"en\">",
                             "<hvstrings version=\"1.0\"></strings>", "\xFF\xFE<\0h", "{}"}) {
        EXPECT_FALSE(Parse(text)) << text;
        EXPECT_EQ(said, "") << text;
        ++texts;
    }
    EXPECT_EQ(texts, 8);
}

TEST_F(StringsTest, RefusesADocumentWithoutElement) {
    EXPECT_FALSE(Parse("<!-- nothing here -->"));
    EXPECT_EQ(said, "ERROR: root element hvstrings not found.\n");
}

TEST_F(StringsTest, RefusesAnotherRoot) {
    EXPECT_FALSE(Parse(R"(<HVStrings version="1.0"><strings lang="en"/></HVStrings>)"));
    EXPECT_EQ(said, "ERROR: root element hvstrings not found.\n");
}

TEST_F(StringsTest, RefusesATableWithoutVersion) {
    EXPECT_FALSE(Parse(R"(<hvstrings><strings lang="en"/></hvstrings>)"));
    EXPECT_EQ(said, "ERROR: hvstrings element has no version attribute.\n");
}

TEST_F(StringsTest, TakesAnyVersion) {
    EXPECT_TRUE(Parse(R"(<hvstrings version=""><strings lang="en"/></hvstrings>)"));
}

TEST_F(StringsTest, RefusesATableWithoutLanguagesInSilence) {
    EXPECT_FALSE(Parse(R"(<hvstrings version="1.0"></hvstrings>)"));
    EXPECT_EQ(said, "");
    EXPECT_FALSE(Parse(R"(<hvstrings version="1.0"><string key="a">one</string></hvstrings>)"));
    EXPECT_EQ(said, "");
}

TEST_F(StringsTest, RefusesALanguageWithoutName) {
    EXPECT_FALSE(Parse(R"(<hvstrings version="1.0"><strings><string key="a">one</string></strings></hvstrings>)"));
    EXPECT_EQ(said, "ERROR: strings element has no lang attribute.\n");
}

TEST_F(StringsTest, RefusesALanguageThatComesTwiceAndKeepsTheFirst) {
    EXPECT_FALSE(Parse(R"(<hvstrings version="1.0"><strings lang="en"><string key="a">one</string></strings>)"
                       R"(<strings lang="en"><string key="a">two</string></strings></hvstrings>)"));
    EXPECT_EQ(said, "ERROR: duplicate lang attribute value encountered: en\n");
    EXPECT_EQ(Get("a"), "one");
}

TEST_F(StringsTest, RefusesATextWithoutKey) {
    EXPECT_FALSE(Parse(Table(R"(<string key="a">one</string><string os="mac">two</string>)")));
    EXPECT_EQ(said, "ERROR: string element encountered with no key attribute.\n");
}

TEST_F(StringsTest, RefusesAnEmptySystem) {
    EXPECT_FALSE(Parse(Table(R"(<string key="a" os="">one</string>)")));
    EXPECT_EQ(said, "ERROR: empty os attribute value encountered.\n");
}

TEST_F(StringsTest, SaysOnlyTheFirstFault) {
    EXPECT_FALSE(Parse(R"(<hvstrings version="1.0"><strings lang="en"><string/><string key="a" os=""/></strings>)"
                       R"(<strings/></hvstrings>)"));
    EXPECT_EQ(said, "ERROR: string element encountered with no key attribute.\n");
}

TEST_F(StringsTest, KeepsTheLanguagesBeforeAFault) {
    EXPECT_FALSE(Parse(R"(<hvstrings version="1.0"><strings lang="en"><string key="a">one</string></strings>)"
                       R"(<strings lang="de"><string>eins</string></strings></hvstrings>)"));
    EXPECT_EQ(Get("a"), "one");
}

TEST_F(StringsTest, DropsTheLanguageThatHasAFault) {
    EXPECT_FALSE(Parse(R"(<hvstrings version="1.0"><strings lang="en"><string key="a">one</string><string/></strings>)"
                       R"(</hvstrings>)"));
    EXPECT_EQ(Get("a"), "");
    EXPECT_EQ(said, "WARNING: lang en not found in this string resource collection.\n");
}

TEST_F(StringsTest, ForgetsAnEarlierTable) {
    ASSERT_TRUE(Parse(Table(R"(<string key="a">one</string>)")));
    EXPECT_FALSE(Parse("no table"));
    EXPECT_EQ(Get("a"), "");
    ASSERT_TRUE(Parse(Table(R"(<string key="b">two</string>)")));
    EXPECT_EQ(Get("a"), "");
    EXPECT_EQ(Get("b"), "two");
}

TEST_F(StringsTest, DoesNotSeeATextForAnotherSystem) {
    ASSERT_TRUE(Parse(Table(R"(<string key="a" os="mac">one</string>)")));
    EXPECT_EQ(Get("a"), "");
    EXPECT_EQ(said, "WARNING: did not find string resource with key a for language-code \"en\"\n");
}

TEST_F(StringsTest, TakesTheTextForThisSystemWhereverItStands) {
    ASSERT_TRUE(Parse(Table(R"(<string key="a" os="win">one</string><string key="a" os="mac">two</string>)"
                            R"(<string key="b" os="mac">three</string><string key="b" os="win">four</string>)")));
    EXPECT_EQ(Get("a"), "one");
    EXPECT_EQ(Get("b"), "four");
}

TEST_F(StringsTest, ComparesTheSystemExactly) {
    ASSERT_TRUE(Parse(Table(R"(<string key="a" os="windows">one</string><string key="b" os="Win">two</string>)"
                            R"(<string key="c" os="*">three</string>)")));
    EXPECT_EQ(Get("a"), "");
    EXPECT_EQ(Get("b"), "");
    EXPECT_EQ(Get("c"), "");
}

TEST_F(StringsTest, TakesTheLastOfTwoTextsOfOneKey) {
    ASSERT_TRUE(Parse(Table(R"(<string key="a">one</string><string key="a">two</string>)")));
    EXPECT_EQ(Get("a"), "two");
}

TEST_F(StringsTest, KnowsAnEmptyText) {
    ASSERT_TRUE(Parse(Table(R"(<string key="a"/><string key="b"></string><string key="">c</string>)")));
    EXPECT_EQ(Get("a"), "");
    EXPECT_EQ(said, "");
    EXPECT_EQ(Get("b"), "");
    EXPECT_EQ(said, "");
    EXPECT_EQ(Get(""), "c");
}

TEST_F(StringsTest, TakesNoTextAfterACommentOrAnElement) {
    ASSERT_TRUE(Parse(Table(R"(<string key="a"><!-- first -->one</string><string key="b"><b/>two</string>)")));
    EXPECT_EQ(Get("a"), "");
    EXPECT_EQ(Get("b"), "");
    EXPECT_EQ(said, "");
}

TEST_F(StringsTest, TakesTheTextBeforeAnElement) {
    ASSERT_TRUE(Parse(Table(R"(<string key="a">one<b/>two</string>)")));
    EXPECT_EQ(Get("a"), "one");
}

TEST_F(StringsTest, MakesOneBlankOfALineBreakAndItsIndent) {
    ASSERT_TRUE(Parse(Table("<string key=\"a\">\r\n    one\r\n\t   two  </string>")));
    EXPECT_EQ(Get("a"), "one two");
}

TEST_F(StringsTest, ReadsEntitiesAndLiteralText) {
    ASSERT_TRUE(
        Parse(Table(R"(<string key="a">&lt;A &amp; B&gt;</string><string key="b"><![CDATA[ <i> ]]></string>)")));
    EXPECT_EQ(Get("a"), "<A & B>");
    EXPECT_EQ(Get("b"), " <i> ");
}

TEST_F(StringsTest, PassesOverOtherElements) {
    ASSERT_TRUE(Parse(R"(<?xml version="1.0" encoding="UTF-8"?><!-- table --><hvstrings version="1.0"><note/>)"
                      R"(<strings lang="en"><note>x</note><string key="a">one</string></strings></hvstrings>)"));
    EXPECT_EQ(Get("a"), "one");
}

TEST_F(StringsTest, ReadsATableWithAByteOrderMark) {
    ASSERT_TRUE(Parse("\xEF\xBB\xBF" + Table("<string key=\"a\">\xC3\xBC</string>")));
    EXPECT_EQ(Get("a"), "\xC3\xBC");
}

TEST_F(StringsTest, ReadsATableOfThreeMegabytes) {
    std::string strings;
    int count = 0;
    for (; strings.size() < 3'000'000; ++count) {
        strings += "<string key=\"" + std::to_string(count) + "\">" + std::string(200, 'x') + "</string>";
    }
    ASSERT_TRUE(Parse(Table(strings)));
    EXPECT_EQ(Get(std::to_string(count - 1)), std::string(200, 'x'));
    table.ReplaceAll("x", "y");
    EXPECT_EQ(Get("0"), std::string(200, 'y'));
}

TEST_F(StringsTest, ReadsOneTextOfThreeMegabytes) {
    ASSERT_TRUE(Parse(Table("<string key=\"a\">" + std::string(3'000'000, 'x') + "</string>")));
    EXPECT_EQ(Get("a").size(), 3'000'000U);
}

TEST_F(StringsTest, RefusesATableOfTenMegabytesInSilence) {
    EXPECT_FALSE(Parse(Table("<string key=\"a\">" + std::string(10'000'000, 'x') + "</string>")));
    EXPECT_EQ(said, "");
}

TEST_F(StringsTest, RefusesElementsNestedBeyondReasonInSilence) {
    std::string deep;
    for (int i = 0; i < 100'000; ++i) {
        deep += "<string key=\"a\">";
    }
    EXPECT_FALSE(Parse(Table(deep)));
    EXPECT_EQ(said, "");
}

TEST_F(StringsTest, SurvivesATextThatEndsWithinACharacter) {
    const std::string whole = "\xEF\xBB\xBF" + Table("<string key=\"a\">\xF0\x9F\x8E\xAC</string>");
    std::size_t cuts = 0;
    for (; cuts < whole.size(); ++cuts) {
        EXPECT_FALSE(Parse(whole.substr(0, cuts))) << cuts;
    }
    EXPECT_EQ(cuts, whole.size());
    EXPECT_TRUE(Parse(whole));
    EXPECT_FALSE(Parse(whole.substr(0, whole.find('\xF0') + 1) + "</string>"));
}

/// What one replacement makes of a text.
std::string Replaced(const std::string& text, const std::string& token, const std::string& replacement) {
    XMLStringsResource table;
    EXPECT_TRUE(table.Parse(Table("<string key=\"a\">" + text + "</string>")));
    table.ReplaceAll(token, replacement);
    return table.GetString("a");
}

TEST(StringsReplacement, FillsInEveryOccurrence) {
    EXPECT_EQ(Replaced("${endl}a${endl}b${endl}", "${endl}", "\r\n"), "\r\na\r\nb\r\n");
    EXPECT_EQ(Replaced("xTxT", "T", "U"), "xUxU");
    EXPECT_EQ(Replaced("TTT", "T", ""), "");
}

/// A table that shows the texts of every language.
class OpenTable : public XMLStringsResource {
public:
    using XMLStringsResource::languages;
};

TEST(StringsReplacement, FillsInEveryTextOfEveryLanguage) {
    OpenTable table;
    ASSERT_TRUE(table.Parse(
        R"(<hvstrings version="1.0"><strings lang="de"><string key="a">T auf Deutsch</string></strings>)"
        R"(<strings lang="en"><string key="a">T</string><string key="b">xT</string><string key="c">c</string></strings>)"
        R"(<strings lang="fr"><string key="b">T, en T</string></strings></hvstrings>)"));
    table.ReplaceAll("T", "U");
    const decltype(table.languages) expected = {
        {"de", {{"a", "U auf Deutsch"}}}, {"en", {{"a", "U"}, {"b", "xU"}, {"c", "c"}}}, {"fr", {{"b", "U, en U"}}}};
    EXPECT_EQ(table.languages, expected);
}

TEST(StringsReplacement, DoesNotLookAtWhatItHasInserted) {
    EXPECT_EQ(Replaced("T and T again", "T", "TT"), "TT and TT again");
}

TEST(StringsReplacement, KeepsATokenThatIsPushedBeyondTheOldEnd) {
    EXPECT_EQ(Replaced("${PRODUCTNAME} or ${PRODUCTNAME}", "${PRODUCTNAME}",
                       "The Complete Tessaly Collection for Motion Design"),
              "The Complete Tessaly Collection for Motion Design or ${PRODUCTNAME}");
    EXPECT_EQ(Replaced("TaaaT", "T", "1234"), "1234aaaT");
}

TEST(StringsReplacement, KeepsATokenThatIsPushedToTheOldEnd) {
    EXPECT_EQ(Replaced("TaT", "T", "12"), "12aT");
}

TEST(StringsReplacement, FillsInATokenThatBeginsBeforeTheOldEnd) {
    EXPECT_EQ(Replaced("TaTb", "T", "12"), "12a12b");
    EXPECT_EQ(Replaced("TT", "T", "U"), "UU");
}

TEST(StringsReplacement, LeavesTextsWithoutTheTokenAlone) {
    EXPECT_EQ(Replaced("${VERSION}", "${version}", "1"), "${VERSION}");
    EXPECT_EQ(Replaced("", "T", "U"), "");
    EXPECT_EQ(Replaced("abc", "", "U"), "abc");
}

TEST(StringsReplacement, LeavesTwoBlanksWhereThereIsNoVersion) {
    XMLStringsResource table;
    ASSERT_TRUE(table.Parse(Table(R"(<string key="installer.title">${PRODUCTNAME} ${VERSION} Installer</string>)")));
    table.ReplaceAll("${PRODUCTNAME}", "Tessaly Suite");
    table.ReplaceAll("${VERSION}", "");
    EXPECT_EQ(table.GetString("installer.title"), "Tessaly Suite  Installer");
}

TEST(StringsReplacement, ExpandsAVariableWithinANameThatCameBefore) {
    XMLStringsResource table;
    ASSERT_TRUE(table.Parse(Table(R"(<string key="a">${PRODUCTNAME} is here for you now</string>)")));
    table.ReplaceAll("${PRODUCTNAME}", "Suite ${VERSION}");
    table.ReplaceAll("${VERSION}", "4.2");
    EXPECT_EQ(table.GetString("a"), "Suite 4.2 is here for you now");
}

TEST(StringsText, IsEmptyInAProgramWithoutTable) {
    EXPECT_EQ(HV::LoadStringsText(), "");
}

}  // namespace
