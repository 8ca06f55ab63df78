#include "tests/wizard/WizardTest.h"

namespace {

using LinksTest = WizardTest;

TEST_F(LinksTest, OpensBothPagesInTheBrowser) {
    HasEveryHost();
    RunningWizard wizard(folder);
    GoToFinal(wizard);
    const std::string opened = R"(C:\browser.txt)";
    const std::string first = "https://www.example.com/tessaly/whats-new/\n";
    const std::string second = "https://www.example.com/tessaly/resources/\n";
    wizard.Press(wizard.Window(), id::WhatsNew);
    EXPECT_TRUE(Eventually([&] { return machine().HasFile(opened) && machine().Content(opened) == first; }));
    wizard.Press(wizard.Window(), id::Resources);
    EXPECT_TRUE(Eventually([&] { return machine().Content(opened) == first + second; })) << machine().Content(opened);
    EXPECT_TRUE(wizard.IsRunning());
}

TEST_F(LinksTest, OpensAPageInAWindowOfItsUsualSize) {
    HasEveryHost();
    machine().Loads(
        "REGEDIT4\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Classes\\https\\shell\\open\\command]\n"
        "@=\"\\\"Z:" HV_PROGRAM_FOLDER "/link_probe.exe\\\" \\\"%1\\\"\"\n");
    RunningWizard wizard(folder);
    GoToFinal(wizard);
    wizard.Press(wizard.Window(), id::Resources);
    const std::string opened = R"(C:\opened.txt)";
    EXPECT_TRUE(Eventually([&] { return machine().HasFile(opened) && machine().Content(opened).ends_with('\n'); }));
    EXPECT_EQ(machine().Content(opened), "1 https://www.example.com/tessaly/resources/\n");
}

}  // namespace
