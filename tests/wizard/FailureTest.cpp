#include "tests/wizard/WizardTest.h"

namespace {

using FailureTest = WizardTest;

TEST_F(FailureTest, TellsTheUserAndLeavesTheMachineAsItWas) {
    HasEveryHost();
    // A file where the first package's folder has to be.
    machine().Has(R"(C:\Program Files\Common Files\Halvorn)", "in the way");
    const auto before = machine().FilesWithoutFolders();
    RunningWizard wizard(folder);
    GoToSelection(wizard);
    const std::string registry = Registry();
    wizard.Press(wizard.Window(), id::Continue);
    const Box box = wizard.WaitForBox("Installation Failed");
    ExpectBox(box,
              "An error prevented the install from completing. The installation log has been written to the Halvorn "
              "logs directory in ProgramData.",
              {IDOK}, true, wizard.Window());
    // Behind the box: the bar is empty again.
    EXPECT_TRUE(wizard.Shows(wizard.Page(), {look::Filled({0, 76, 390, 77}, look::Track)}));
    KeepPicture("failed", wizard.Window());
    wizard.AnswerOk(box);
    EXPECT_EQ(wizard.ExitStatus(), 0U);
    EXPECT_EQ(machine().FilesWithoutFolders(), before);
    EXPECT_TRUE(Registry() == registry) << "the registry is another";
}

}  // namespace
