#include <gtest/gtest.h>
#include <tinyxml.h>

#include <map>
#include <string>

#include "tests/resources/ResourceFile.h"

namespace {

/// Key, with the operating system after it where one is named, to text.
using Texts = std::map<std::string, std::string>;

Texts TextsOf(const TiXmlElement& strings) {
    Texts texts;
    for (const auto* string = strings.FirstChildElement("string"); string != nullptr;
         string = string->NextSiblingElement("string")) {
        const char* system = string->Attribute("os");
        const std::string key = string->Attribute("key");
        texts[system == nullptr ? key : key + " " + system] = string->GetText();
    }
    return texts;
}

}  // namespace

TEST(StringTable, HoldsTheWizardsTextsInEnglish) {
    TiXmlDocument document;
    document.Parse(ResourceFile("hvstrings.xml").c_str());
    ASSERT_FALSE(document.Error()) << document.ErrorDesc();
    const TiXmlElement* root = document.RootElement();
    ASSERT_EQ(root->ValueStr(), "hvstrings");
    EXPECT_STREQ(root->Attribute("version"), "1.0");
    const TiXmlElement* strings = root->FirstChildElement("strings");
    ASSERT_NE(strings, nullptr);
    EXPECT_STREQ(strings->Attribute("lang"), "en");
    EXPECT_EQ(strings->NextSiblingElement(), nullptr);

    Texts texts = TextsOf(*strings);
    EXPECT_EQ(texts.erase("installer.welcome.sysreq mac"), 1U) << "passed over on Windows, whatever it says";
    EXPECT_EQ(
        texts,
        (Texts{
            {"installer.title", "${PRODUCTNAME} ${VERSION} Installer"},
            {"installer.title.noversion", "${PRODUCTNAME} Installer"},
            {"installer.welcome.p-1",
             "This will install ${PRODUCTNAME} ${VERSION} on your computer.${endl}It is recommended you close all "
             "other applications before continuing."},
            {"installer.welcome.sysreq win", "Windows 10${endl}After Effects/Premiere Pro CC 2018+"},
            {"installer.wait.message", "Installing ${PRODUCTNAME}, please wait..."},
        }));
}
