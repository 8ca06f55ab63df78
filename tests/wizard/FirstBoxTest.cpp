#include <filesystem>

#include "tests/wizard/WizardTest.h"

namespace {

/// The boxes that come at the start have no owner: the window behind them takes the mouse, and does nothing for it.
class FirstBoxTest : public WizardTest {
protected:
    /// The way to an install first, then every other button.
    static void PressEverythingBehind(RunningWizard& wizard, const Box& box) {
        const HWND window = wizard.Window();
        const HWND page = wizard.PageWith(id::Agree);
        wizard.Press(page, id::Agree);
        int given = 0;
        for (const int command :
             {id::Continue, id::Continue, id::Back, id::WhatsNew, id::Resources, id::Cancel, id::Close}) {
            RunningWizard::Command(window, command);
            ++given;
        }
        for (const int command : {id::ReadLicense, id::Disagree}) {
            wizard.Press(page, command);
            ++given;
        }
        EXPECT_EQ(given, 9);

        EXPECT_TRUE(wizard.IsRunning());
        EXPECT_TRUE(IsWindow(box.handle));
        EXPECT_TRUE(wizard.Viewers().empty());
        EXPECT_EQ(wizard.Page(), page);
        EXPECT_TRUE(IsWindowEnabled(GetDlgItem(page, id::Agree)));
        EXPECT_FALSE(IsWindowEnabled(GetDlgItem(window, id::Continue)));
    }

    void ExpectEndWithoutAnInstall(const std::string& title) {
        const auto before = machine().FilesWithoutFolders();
        RunningWizard wizard(folder);
        const Box box = wizard.WaitForBox(title);
        PressEverythingBehind(wizard, box);
        wizard.AnswerOk(box);
        EXPECT_EQ(wizard.ExitStatus(), 0U);
        EXPECT_EQ(machine().FilesWithoutFolders(), before);
        EXPECT_FALSE(IsRegistered());
    }
};

TEST_F(FirstBoxTest, RefusedPackagesCannotBeInstalledFromBehindIt) {
    HasEveryHost();
    BreakPackage("com.halvorn.tessaly.glow.zip");
    ExpectEndWithoutAnInstall("Error: invalid installer packages.");
}

TEST_F(FirstBoxTest, NothingIsInstalledFromBehindItForHostsThatAreNotThere) {
    std::vector<std::filesystem::path> others;
    for (const auto& entry : std::filesystem::directory_iterator(folder + "\\packages")) {
        const std::string name = entry.path().filename().string();
        if (name != "suite.json" && name != "com.halvorn.tessaly.glow.zip") {
            others.push_back(entry.path());
        }
    }
    for (const auto& other : others) {
        std::filesystem::remove(other);
    }
    ExpectEndWithoutAnInstall("Error: no hosts found.");
}

TEST_F(FirstBoxTest, NobodyAgreesBeforeTheWarningIsRead) {
    RunningWizard wizard(folder);
    const Box box = wizard.WaitForBox("Warning: missing hosts.");
    PressEverythingBehind(wizard, box);
    wizard.AnswerOk(box);
    EXPECT_TRUE(Eventually([&] { return TextOf(GetDlgItem(wizard.Window(), id::Continue)) == "Continue"; }));
    GoToSelection(wizard);
    EXPECT_FALSE(IsRegistered());
}

}  // namespace
