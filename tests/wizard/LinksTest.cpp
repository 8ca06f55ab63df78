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

}  // namespace
