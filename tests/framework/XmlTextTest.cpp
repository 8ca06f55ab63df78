#include "hvframework/XmlText.h"

#include <gtest/gtest.h>

namespace {

TEST(ReadXml, ReadsATextAndSaysNothing) {
    TiXmlDocument document;
    EXPECT_EQ(HVL::ReadXml("<a b='c'/>", document), "");
    ASSERT_NE(document.FirstChildElement("a"), nullptr);
    EXPECT_STREQ(document.FirstChildElement("a")->Attribute("b"), "c");
}

TEST(ReadXml, SaysWhyATextIsNoXml) {
    TiXmlDocument document;
    EXPECT_EQ(HVL::ReadXml("<a>", document), "Error reading Element value.");
}

TEST(ReadXml, DoesNotReadWhatTheLibraryWouldNotSurvive) {
    std::string deep;
    for (int level = 0; level < 201; ++level) {
        deep += "<a>";
    }
    TiXmlDocument document;
    EXPECT_EQ(HVL::ReadXml(deep, document), "elements are nested more than 200 deep");
    EXPECT_EQ(document.FirstChild(), nullptr);
}

TEST(ReadXml, SurvivesATextThatEndsWithinACharacter) {
    TiXmlDocument document;
    EXPECT_NE(HVL::ReadXml("<?xml version='1.0' encoding='UTF-8'?><a>\xE6", document), "");
}

}  // namespace
