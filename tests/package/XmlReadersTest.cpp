#include "package/XmlReaders.h"

#include <gtest/gtest.h>

namespace {

/// An element that is parsed from its text and stays as long as the object.
class Parsed {
public:
    explicit Parsed(const char* xml) { document_.Parse(xml, nullptr, TIXML_ENCODING_UTF8); }
    [[nodiscard]] const TiXmlElement& Root() const { return *document_.RootElement(); }

private:
    TiXmlDocument document_;
};

TEST(XmlReaders, AttributeGivesItsValueAndPresence) {
    const Parsed xml(R"(<a name="value" empty=""/>)");
    std::string out = "left over";
    EXPECT_TRUE(HV::GetAttribute(xml.Root(), "name", out));
    EXPECT_EQ(out, "value");
    EXPECT_TRUE(HV::GetAttribute(xml.Root(), "empty", out));
    EXPECT_EQ(out, "");
}

TEST(XmlReaders, AbsentAttributeClearsTheText) {
    const Parsed xml(R"(<a Name="value"/>)");
    std::string out = "left over";
    EXPECT_FALSE(HV::GetAttribute(xml.Root(), "name", out));
    EXPECT_EQ(out, "");
}

TEST(XmlReaders, BooleanIsTrueForTwoWordsOnly) {
    const Parsed xml(R"(<a b1="true" b2="1" b3="True" b4="TRUE" b5="yes" b6="" b7="0" b8="false" b9=" true"/>)");
    int trues = 0;
    int read = 0;
    for (const TiXmlAttribute* at = xml.Root().FirstAttribute(); at != nullptr; at = at->Next(), ++read) {
        bool out = true;
        EXPECT_TRUE(HV::GetBoolAttribute(xml.Root(), at->Name(), out));
        trues += out ? 1 : 0;
        EXPECT_EQ(out, std::string(at->Name()) <= "b2") << at->Name();
    }
    EXPECT_EQ(read, 9);
    EXPECT_EQ(trues, 2);
}

TEST(XmlReaders, AbsentBooleanLeavesTheValueAlone) {
    const Parsed xml("<a/>");
    bool yes = true;
    bool no = false;
    EXPECT_FALSE(HV::GetBoolAttribute(xml.Root(), "b", yes));
    EXPECT_FALSE(HV::GetBoolAttribute(xml.Root(), "b", no));
    EXPECT_TRUE(yes);
    EXPECT_FALSE(no);
}

TEST(XmlReaders, ChildTextIsThatOfTheFirstChildOfTheName) {
    const Parsed xml("<a><other>x</other><t>first</t><t>second</t></a>");
    std::string out;
    EXPECT_TRUE(HV::GetChildText(xml.Root(), "t", out));
    EXPECT_EQ(out, "first");
}

TEST(XmlReaders, TextStandsAfterCommentsAndOtherElements) {
    const Parsed xml("<a><t><!-- why -->what</t><u><b/>later</u></a>");
    std::string out;
    EXPECT_TRUE(HV::GetChildText(xml.Root(), "t", out));
    EXPECT_EQ(out, "what");
    EXPECT_TRUE(HV::GetChildText(xml.Root(), "u", out));
    EXPECT_EQ(out, "later");
}

TEST(XmlReaders, ElementWithoutTextNodeHasNoText) {
    const Parsed xml("<a><t></t><u><b>deeper</b></u><v/></a>");
    int read = 0;
    for (const char* name : {"t", "u", "v", "missing"}) {
        std::string out = "left over";
        EXPECT_FALSE(HV::GetChildText(xml.Root(), name, out)) << name;
        EXPECT_EQ(out, "") << name;
        ++read;
    }
    EXPECT_EQ(read, 4);
}

TEST(XmlReaders, ChildrenAreThoseOfTheFirstGroupInOrder) {
    const Parsed xml(R"(<a><g><i n="1"/><x/><i n="2"/></g><g><i n="3"/></g></a>)");
    std::vector<const TiXmlElement*> items;
    EXPECT_TRUE(HV::GetChildren(xml.Root(), "g", "i", items));
    ASSERT_EQ(items.size(), 2U);
    EXPECT_STREQ(items[0]->Attribute("n"), "1");
    EXPECT_STREQ(items[1]->Attribute("n"), "2");
}

TEST(XmlReaders, MissingOrEmptyGroupGivesNoChildren) {
    const Parsed xml("<a><g><x/></g></a>");
    std::vector<const TiXmlElement*> items{&xml.Root()};
    EXPECT_FALSE(HV::GetChildren(xml.Root(), "g", "i", items));
    EXPECT_TRUE(items.empty());
    items.push_back(&xml.Root());
    EXPECT_FALSE(HV::GetChildren(xml.Root(), "h", "i", items));
    EXPECT_TRUE(items.empty());
}

}  // namespace
