#include "tests/wizard/WizardTest.h"

namespace {

class ClosingTest : public WizardTest {
protected:
    [[nodiscard]] std::string Log() const {
        return machine().Content(R"(C:\ProgramData\Halvorn\Logs\Tessaly Suite Installer.log)");
    }
    const std::string kCancelLine = "Cancel invoked";
};

TEST_F(ClosingTest, TheTitleBarEndsTheFirstPage) {
    HasEveryHost();
    RunningWizard wizard(folder);
    wizard.PageWith(id::Agree);
    RunningWizard::CloseFromTitleBar(wizard.Window());
    EXPECT_EQ(wizard.ExitStatus(), 0U);
}

TEST_F(ClosingTest, TheTitleBarEndsTheSelection) {
    HasEveryHost();
    RunningWizard wizard(folder);
    GoToSelection(wizard);
    RunningWizard::CloseFromTitleBar(wizard.Window());
    EXPECT_EQ(wizard.ExitStatus(), 0U);
    EXPECT_FALSE(IsRegistered());
}

TEST_F(ClosingTest, TheTitleBarEndsAnInstallWithoutWaitingForIt) {
    HasEveryHost();
    HoldAtScript("requirements");
    RunningWizard wizard(folder);
    GoToInstalling(wizard);
    WaitUntilHeld();
    RunningWizard::CloseFromTitleBar(wizard.Window());
    EXPECT_EQ(wizard.ExitStatus(), 0U);
    EXPECT_TRUE(machine().HasFile(R"(C:\hold.txt)"));
    LetGo();
    EXPECT_FALSE(IsRegistered());
    // Unlike the button it does not ask the engine to stop.
    EXPECT_NE(Log().find("Running payload script"), std::string::npos) << Log();
    EXPECT_EQ(Log().find(kCancelLine), std::string::npos) << Log();
}

TEST_F(ClosingTest, CancelAsksARunningInstallToStop) {
    HasEveryHost();
    HoldAtScript("requirements");
    RunningWizard wizard(folder);
    GoToInstalling(wizard);
    WaitUntilHeld();
    wizard.Press(wizard.Window(), id::Cancel);
    EXPECT_EQ(wizard.ExitStatus(), 0U);
    LetGo();
    EXPECT_NE(Log().find(kCancelLine), std::string::npos) << Log();
}

TEST_F(ClosingTest, TheTitleBarEndsTheFinishedWizard) {
    HasEveryHost();
    RunningWizard wizard(folder);
    GoToFinal(wizard);
    RunningWizard::CloseFromTitleBar(wizard.Window());
    EXPECT_EQ(wizard.ExitStatus(), 0U);
    EXPECT_TRUE(IsRegistered());
}

TEST_F(ClosingTest, DisagreeEndsTheWizard) {
    HasEveryHost();
    RunningWizard wizard(folder);
    const auto before = machine().FilesWithoutFolders();
    wizard.Press(wizard.PageWith(id::Disagree), id::Disagree);
    EXPECT_EQ(wizard.ExitStatus(), 0U);
    EXPECT_EQ(machine().FilesWithoutFolders(), before);
}

TEST_F(ClosingTest, CancelEndsTheFirstPageAndTheSelection) {
    HasEveryHost();
    const auto before = machine().FilesWithoutFolders();
    {
        RunningWizard wizard(folder);
        wizard.Press(wizard.Window(), id::Cancel);
        EXPECT_EQ(wizard.ExitStatus(), 0U);
    }
    RunningWizard wizard(folder);
    GoToSelection(wizard);
    wizard.Press(wizard.Window(), id::Cancel);
    EXPECT_EQ(wizard.ExitStatus(), 0U);
    EXPECT_EQ(machine().FilesWithoutFolders(), before);
}

TEST_F(ClosingTest, AViewerThatIsOpenGoesWithTheWizard) {
    HasEveryHost();
    RunningWizard wizard(folder);
    wizard.Press(wizard.PageWith(id::ReadLicense), id::ReadLicense);
    EXPECT_TRUE(Eventually([&] { return wizard.Viewers().size() == 1; }));
    wizard.Press(wizard.Window(), id::Cancel);
    EXPECT_EQ(wizard.ExitStatus(), 0U);
}

}  // namespace
