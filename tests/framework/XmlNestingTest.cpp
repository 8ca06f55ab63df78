#include "hvframework/XmlNesting.h"

#include <gtest/gtest.h>
#include <tinyxml.h>

#include <algorithm>
#include <array>
#include <random>
#include <string_view>

namespace {

std::string Padded(std::string_view text) {
    return std::string(text) + std::string(HVL::kXmlPadding, '\0');
}

std::size_t Scanned(std::string_view text) {
    return HVL::MeasureXml(Padded(text)).deepest;
}

std::size_t DepthBelow(const TiXmlNode& node) {
    std::size_t deepest = 0;
    for (const TiXmlNode* child = node.FirstChild(); child != nullptr; child = child->NextSibling()) {
        deepest = std::max(deepest, DepthBelow(*child) + (child->ToElement() != nullptr ? 1 : 0));
    }
    return deepest;
}

std::size_t AttributesBelow(const TiXmlNode& node) {
    std::size_t most = 0;
    if (const TiXmlElement* element = node.ToElement()) {
        for (const TiXmlAttribute* each = element->FirstAttribute(); each != nullptr; each = each->Next()) {
            ++most;
        }
    }
    for (const TiXmlNode* child = node.FirstChild(); child != nullptr; child = child->NextSibling()) {
        most = std::max(most, AttributesBelow(*child));
    }
    return most;
}

/// What the library really made of the text.
HVL::XmlShape Made(std::string_view text) {
    TiXmlDocument document;
    document.Parse(Padded(text).c_str(), nullptr, TIXML_ENCODING_UNKNOWN);
    return {DepthBelow(document), AttributesBelow(document)};
}

/// How deep the library really went.
std::size_t Reached(std::string_view text) {
    return Made(text).deepest;
}

std::size_t ScannedAttributes(std::string_view text) {
    return HVL::MeasureXml(Padded(text)).mostAttributes;
}

std::string Repeated(std::string_view text, int times) {
    std::string all;
    for (int i = 0; i < times; ++i) {
        all += text;
    }
    return all;
}

TEST(XmlNesting, CountsElementsWithinElements) {
    EXPECT_EQ(Scanned(""), 0U);
    EXPECT_EQ(Scanned("no xml"), 0U);
    EXPECT_EQ(Scanned("<a/>"), 1U);
    EXPECT_EQ(Scanned("<a><b/><b><c>text</c></b><b/></a>"), 3U);
    EXPECT_EQ(Scanned("<?xml version='1.0'?><!-- <x><y><z><q> --><a b='<c><d><e>'><![CDATA[<f><g>]]><h/></a>"), 2U);
}

TEST(XmlNesting, ManySiblingsAreNotDeep) {
    EXPECT_EQ(Scanned("<a>" + Repeated("<b><c/></b>", 50000) + "</a>"), 3U);
}

TEST(XmlNesting, CountsWhatIsNeverClosed) {
    EXPECT_EQ(Scanned(Repeated("<a>", 100000)), 100000U);
}

TEST(XmlNesting, IsNotDeceivedByEndTagsThatAreNone) {
    const std::array<std::string_view, 10> disguises{
        "<a b='</a>'>", "<a b=\"</a>\">",  "<a><!-- </a> -->",           "<a><![CDATA[</a>]]>",
        "<a><? </a ?>", "<a><!x </a >",    "<a><?xml version='></a>'?>", "<a b = '/></a>'>",
        "<a b=</a\t>",  "<a><!--></a>-->",
    };
    int tried = 0;
    for (const std::string_view disguise : disguises) {
        const std::string text = Repeated(disguise, 50);
        EXPECT_GE(Scanned(text), Reached(text)) << disguise;
        EXPECT_GE(Reached(text), 1U) << disguise;
        ++tried;
    }
    EXPECT_EQ(tried, 10);
}

TEST(XmlNesting, SeesThroughCharactersThatSwallowAnEndTag) {
    for (const std::string_view start :
         {"\xEF\xBB\xBF", "<?xml version='1.0'?>", "<?xml version='1.0' encoding='utf8'?>"}) {
        const std::string text = std::string(start) + Repeated("<a>\xE0</a>", 60) + "x";
        EXPECT_GE(Scanned(text), 60U) << start;
        EXPECT_EQ(Reached(text), 60U) << start;
    }
}

TEST(XmlNesting, SeesThroughByteOrderMarksBeforeAQuote) {
    const std::string text = "\xEF\xBB\xBF" + Repeated("<a b=\xEF\xBB\xBF'></a>'>", 60);
    EXPECT_GE(Scanned(text), 60U);
    EXPECT_EQ(Reached(text), 60U);
}

TEST(XmlNesting, IsNeverLessThanWhatTheLibraryReaches) {
    constexpr std::array<std::string_view, 40> kPieces{
        "<a>",      "</a>",      "<b ",    "/>",   ">",    "<",    "</",           "'",    "\"",           "=",
        " ",        "c",         "c='",    "c=\"", "<!--", "-->",  "<![CDATA[",    "]]>",  "<?xml",        "?>",
        "version=", "encoding=", "'utf8'", "<?x",  "<!x",  "\xE0", "\xC3\xA9",     "\xF0", "\xEF\xBB\xBF", "&amp;",
        "&#x3C;",   "&",         "\n",     "text", "<_",   "\x80", "\xEF\xBF\xBE", "/",    "</a >",        "<a b='x'>"};
    std::mt19937 random(20240607);
    std::uniform_int_distribution<std::size_t> piece(0, kPieces.size() - 1);
    int deeper = 0;
    int dressed = 0;
    for (int round = 0; round < 100000; ++round) {
        std::string text = round % 3 == 0 ? "\xEF\xBB\xBF" : "";
        for (std::size_t count = 1 + piece(random); count > 0; --count) {
            text += kPieces[piece(random)];
        }
        const HVL::XmlShape made = Made(text);
        ASSERT_GE(Scanned(text), made.deepest) << text;
        ASSERT_GE(ScannedAttributes(text), made.mostAttributes) << text;
        deeper += made.deepest > 1 ? 1 : 0;
        dressed += made.mostAttributes > 0 ? 1 : 0;
    }
    EXPECT_GT(deeper, 2000) << "too few of the texts nest anything";
    EXPECT_GT(dressed, 500) << "too few of the texts have an attribute";
}

TEST(XmlNesting, CountsTheAttributesOfTheElementThatHasTheMost) {
    EXPECT_EQ(ScannedAttributes("<a/>"), 0U);
    EXPECT_EQ(ScannedAttributes("<a b='1' c=\"2\" d=3 ><e f='g=h i=j'/></a>"), 3U);
    EXPECT_EQ(ScannedAttributes("<?xml version='1.0'?><a><b c=''/><b c='' d=''/></a>"), 2U);
    std::string crowd;
    for (int number = 0; number < 80000; ++number) {
        crowd += " a" + std::to_string(number) + "=''";
    }
    EXPECT_EQ(ScannedAttributes("<a" + crowd + "/>"), 80000U);
    EXPECT_EQ(ScannedAttributes("<a" + crowd), 80000U) << "what is never closed counts";
}

TEST(XmlNesting, SaysWhatIsTooMuch) {
    EXPECT_EQ(HVL::ExcessOfXml(Padded("<a b='c'/>")), "");
    EXPECT_EQ(HVL::ExcessOfXml(Padded(Repeated("<a>", 201))), "elements are nested more than 200 deep");
    EXPECT_EQ(HVL::ExcessOfXml(Padded("<a" + Repeated(" b=''", 256) + "/>")), "");
    EXPECT_EQ(HVL::ExcessOfXml(Padded("<a" + Repeated(" b=''", 257) + "/>")),
              "an element has more than 256 attributes");
    EXPECT_EQ(HVL::ExcessOfXml(Padded(std::string(4194304, ' '))), "");
    EXPECT_EQ(HVL::ExcessOfXml(Padded(std::string(4194305, ' '))), "the text is longer than 4194304 bytes");
}

}  // namespace
