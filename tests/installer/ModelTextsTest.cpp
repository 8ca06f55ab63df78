// The texts of the wizard, with the suite's name and version in them.
#include "tests/installer/ModelTest.h"

namespace {

using ModelTextsTest = ModelTest;

TEST_F(ModelTextsTest, HoldTheSuitesNameAndVersion) {
    setup.HasSuite();
    setup.Ships(Product("glow"));
    const HV::InstallerModel& model = Load();
    EXPECT_EQ(model.GetString("installer.title"), "Tessaly Suite 4.2.0 Installer");
    EXPECT_EQ(model.GetString("installer.title.noversion"), "Tessaly Suite Installer");
    EXPECT_EQ(model.GetString("installer.welcome.p-1"),
              "This will install Tessaly Suite 4.2.0 on your computer.\r\n"
              "It is recommended you close all other applications before continuing.");
    EXPECT_EQ(model.GetString("installer.welcome.sysreq"), "Windows 10\r\nAfter Effects/Premiere Pro CC 2018+");
    EXPECT_EQ(model.GetString("installer.wait.message"), "Installing Tessaly Suite, please wait...");
}

TEST_F(ModelTextsTest, AreThereThoughTheFolderIsBad) {
    const HV::InstallerModel& model = Load();
    EXPECT_FALSE(model.valid);
    EXPECT_EQ(model.GetString("installer.title"), "  Installer") << "no name, no version, the blanks between them";
    EXPECT_EQ(model.GetString("installer.wait.message"), "Installing , please wait...");
}

TEST_F(ModelTextsTest, HoldTwoBlanksForAnEmptyVersion) {
    setup.HasSuite(R"({"display_name": "Tessaly"})");
    EXPECT_EQ(Load().GetString("installer.title"), "Tessaly  Installer");
}

TEST_F(ModelTextsTest, FillInTheVersionOfANameThatAsksForIt) {
    setup.HasSuite(R"({"display_name": "T${VERSION}", "version": "4"})");
    EXPECT_EQ(Load().GetString("installer.title.noversion"), "T4 Installer");
}

TEST_F(ModelTextsTest, BreakTheLineOfAVersionThatAsksForIt) {
    setup.HasSuite(R"({"display_name": "Tessaly", "version": "4${endl}"})");
    EXPECT_EQ(Load().GetString("installer.title"), "Tessaly 4\r\n Installer");
}

TEST_F(ModelTextsTest, DoNotFillInTheNameOfAVersionThatAsksForIt) {
    setup.HasSuite(R"({"display_name": "Tessaly", "version": "${PRODUCTNAME}"})");
    EXPECT_EQ(Load().GetString("installer.title"), "Tessaly ${PRODUCTNAME} Installer");
}

TEST_F(ModelTextsTest, AreEmptyForAnUnknownKey) {
    const HV::InstallerModel& model = Load();
    CapturedStreams streams;
    EXPECT_EQ(model.GetString("installer.nothing"), "");
    EXPECT_NE(streams.Errors(), "");
}

}  // namespace
