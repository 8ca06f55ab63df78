#include "tests/support/RunningProgram.h"
#include "tests/wizard/WizardTest.h"

namespace {

const std::string kAfterEffects = R"(C:\Program Files\Adobe\Adobe After Effects 2022\Support Files\AfterFX.exe)";
const std::string kPremiere = R"(C:\Program Files\Adobe\Adobe Premiere Pro 2022\Adobe Premiere Pro.exe)";
const std::string kTitle = "Host applications running.";
const std::string kOneHost =
    "After Effects is a host application for products in the installer; please quit this application and retry or "
    "cancel to exit the installer.";

/// A machine on which nothing is looked for by an empty name, as some hosts are: that finds whatever process cannot be
/// read at the moment. Some products lack their hosts there, of which the wizard warns at first.
class RunningHostsTest : public WizardTest {
protected:
    RunningHostsTest() { HasHosts("motion-design"); }

    static void GoOnToSelection(RunningWizard& wizard) {
        const Box warning = wizard.WaitForBox("Warning: missing hosts.");
        wizard.AnswerOk(warning);
        GoToSelection(wizard);
    }
};

TEST_F(RunningHostsTest, AsksAgainUntilTheHostHasEnded) {
    RunningProgram host(machine(), kAfterEffects);
    RunningWizard wizard(folder);
    GoOnToSelection(wizard);
    wizard.PressForBox(wizard.Window(), id::Continue);

    const Box first = wizard.WaitForBox(kTitle);
    ExpectBox(first, kOneHost, {IDCANCEL, IDRETRY}, true, nullptr);
    KeepPicture("host-running", wizard.Window());
    wizard.Answer(first, IDRETRY);
    const Box second = wizard.WaitForBox(kTitle);
    EXPECT_NE(second.handle, first.handle);
    EXPECT_FALSE(IsRegistered());

    host.End();
    wizard.Answer(second, IDRETRY);
    EXPECT_TRUE(Eventually([&] { return GetDlgItem(wizard.Window(), id::Close) != nullptr; }));
    EXPECT_TRUE(IsRegistered());
}

TEST_F(RunningHostsTest, EndsWhenTheUserCancels) {
    RunningProgram host(machine(), kAfterEffects);
    const auto before = machine().FilesWithoutFolders();
    RunningWizard wizard(folder);
    GoOnToSelection(wizard);
    wizard.PressForBox(wizard.Window(), id::Continue);
    wizard.Answer(wizard.WaitForBox(kTitle), IDCANCEL);
    EXPECT_EQ(wizard.ExitStatus(), 0U);
    EXPECT_EQ(machine().FilesWithoutFolders(), before);
}

TEST_F(RunningHostsTest, NamesEveryHostThatRunsEvenIfItsProductsAreOff) {
    const RunningProgram one(machine(), kAfterEffects);
    const RunningProgram other(machine(), kPremiere);
    RunningWizard wizard(folder);
    GoOnToSelection(wizard);
    wizard.Press(wizard.Page(), id::DeselectAll);
    wizard.Press(wizard.Page(), ProductId(9));
    wizard.PressForBox(wizard.Window(), id::Continue);
    const Box box = wizard.WaitForBox(kTitle);
    const std::string rest =
        " are host applications for products in the installer; please quit these applications and retryor cancel to "
        "exit the installer.";
    // Which of the two is named first is the packages' affair.
    EXPECT_TRUE(box.text == "After Effects and Adobe Premiere Pro" + rest ||
                box.text == "Adobe Premiere Pro and After Effects" + rest)
        << box.text;
    wizard.Answer(box, IDCANCEL);
    EXPECT_EQ(wizard.ExitStatus(), 0U);
}

TEST_F(RunningHostsTest, WantsTheManagerQuitFirst) {
    RunningProgram manager(machine(), R"(C:\Program Files\Halvorn\Halvorn Application Manager.exe)");
    const RunningProgram host(machine(), kAfterEffects);
    RunningWizard wizard(folder);
    GoOnToSelection(wizard);
    wizard.PressForBox(wizard.Window(), id::Continue);
    const Box box = wizard.WaitForBox("Halvorn Application Manager is running.");
    ExpectBox(box, "Please quit Halvorn Application Manager and retry, or cancel to exit the installer.",
              {IDCANCEL, IDRETRY}, true, nullptr);
    manager.End();
    wizard.Answer(box, IDRETRY);
    wizard.Answer(wizard.WaitForBox(kTitle), IDCANCEL);
    EXPECT_EQ(wizard.ExitStatus(), 0U);
}

}  // namespace
