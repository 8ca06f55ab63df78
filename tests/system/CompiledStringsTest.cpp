// A program that carries the wizard's table of texts.
#include <gtest/gtest.h>

#include <map>

#include "system/XMLStringsResource.h"

namespace {

TEST(CompiledStrings, AreTheWholeTable) {
    const std::string text = HV::LoadStringsText();
    EXPECT_EQ(text.find('\0'), std::string::npos);
    EXPECT_EQ(text.compare(0, 5, "<?xml"), 0);
    EXPECT_NE(text.find("</hvstrings>"), std::string::npos);
    EXPECT_EQ(HV::LoadStringsText(), text);
}

TEST(CompiledStrings, AreTheTextsOfTheWizard) {
    HV::XMLStringsResource table;
    ASSERT_TRUE(table.Parse(HV::LoadStringsText()));
    const std::map<std::string, std::string> texts = {
        {"installer.title", "${PRODUCTNAME} ${VERSION} Installer"},
        {"installer.title.noversion", "${PRODUCTNAME} Installer"},
        {"installer.welcome.p-1",
         "This will install ${PRODUCTNAME} ${VERSION} on your computer.${endl}It is recommended you close all other "
         "applications before continuing."},
        {"installer.welcome.sysreq", "Windows 10${endl}After Effects/Premiere Pro CC 2018+"},
        {"installer.wait.message", "Installing ${PRODUCTNAME}, please wait..."}};
    int checked = 0;
    for (const auto& [key, text] : texts) {
        EXPECT_EQ(table.GetString(key), text) << key;
        ++checked;
    }
    EXPECT_EQ(checked, 5);
}

}  // namespace
