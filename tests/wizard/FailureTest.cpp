#include "tests/wizard/WizardTest.h"

namespace {

using FailureTest = WizardTest;

TEST_F(FailureTest, TellsTheUserAndLeavesTheMachineAsItWas) {
    HasHosts("everything");
    // A file where the first package's folder has to be.
    machine().Has(R"(C:\Program Files\Common Files\Halvorn)", "in the way");
    const auto before = machine().FilesWithoutFolders();
    const std::string registry = machine().Registry();
    RunningWizard wizard(folder);
    GoToInstalling(wizard);
    const Box box = wizard.WaitForBox("Installation Failed");
    ExpectBox(box,
              "An error prevented the install from completing. The installation log has been written to the Halvorn "
              "logs directory in ProgramData.",
              {IDOK}, true, wizard.Window());
    // Behind the box: the bar is empty again.
    EXPECT_TRUE(wizard.Shows(wizard.Page(), {look::Filled({0, 76, 390, 77}, look::Track)}));
    KeepPicture("failed", wizard.Window());
    wizard.Answer(box, box.buttons.front());
    EXPECT_EQ(wizard.ExitStatus(), 0U);
    EXPECT_EQ(machine().FilesWithoutFolders(), before);
    EXPECT_EQ(machine().Registry(), registry);
}

}  // namespace
