// What has to be quit before an install: real programs run here, under the names of hosts.
#include <stdexcept>

#include "tests/installer/WizardTest.h"
#include "tests/support/RunningProgram.h"

namespace {

using HV::WizardState;

constexpr const char* kManager = R"(C:\Program Files\Halvorn\Halvorn Application Manager.exe)";
constexpr const char* kAfterEffects = R"(C:\Program Files\Adobe\Adobe After Effects 2022\Support Files\AfterFX.exe)";
constexpr const char* kOlderAfterEffects =
    R"(C:\Program Files\Adobe\Adobe After Effects CC 2019\Support Files\AfterFX.exe)";

const ShownBox kAfterEffectsRuns = HostsRun(
    "After Effects is a host application for products in the installer; please quit this application and "
    "retry or cancel to exit the installer.");

class RunningHosts : public WizardTest {
protected:
    RunningHosts() {
        HasHostsOf("motion-design");
        Ships(HostProduct("glow", "aftereffects"));
        Ships(Product("titler"));
    }

    /// Presses Install and expects the process to end with status 0 there.
    void InstallAndEnd() {
        try {
            Install();
            ADD_FAILURE() << "the wizard goes on";
        } catch (const WizardEnded& end) {
            EXPECT_EQ(end.status, 0U);
        }
        EXPECT_EQ(wizard.state, WizardState::Selection);
        EXPECT_EQ(wizard.job, nullptr);
        EXPECT_EQ(wizard.installingPage, nullptr);
    }
};

TEST_F(RunningHosts, LetTheInstallBeginWhenThereAreNone) {
    GoToSelection();
    Install();
    EXPECT_EQ(wizard.state, WizardState::Installing);
    EXPECT_TRUE(toolkit.boxes.empty());
}

TEST_F(RunningHosts, AreNotReachedWhenTheManagersBoxIsCancelled) {
    const RunningProgram manager(machine, kManager);
    GoToSelection();
    toolkit.AnswerNext(kCancel);
    InstallAndEnd();
    EXPECT_EQ(toolkit.boxes, std::vector{kManagerRuns});
    EXPECT_EQ(toolkit.exits, std::vector{0U});
}

TEST_F(RunningHosts, AreReachedWhenTheManagerHasGoneAtARetry) {
    RunningProgram manager(machine, kManager);
    GoToSelection();
    toolkit.AnswerNext(kRetry);
    toolkit.AnswerNext(kRetry, [&] { manager.End(); });
    Install();
    EXPECT_EQ(toolkit.boxes, (std::vector{kManagerRuns, kManagerRuns}));
    EXPECT_EQ(wizard.state, WizardState::Installing);
}

TEST_F(RunningHosts, AreLookedForAfterTheManager) {
    RunningProgram manager(machine, kManager);
    const RunningProgram host(machine, kAfterEffects);
    GoToSelection();
    toolkit.AnswerNext(kRetry, [&] { manager.End(); });
    toolkit.AnswerNext(kCancel);
    InstallAndEnd();
    EXPECT_EQ(toolkit.boxes, (std::vector{kManagerRuns, kAfterEffectsRuns}));
}

TEST_F(RunningHosts, AreReachedWhenTheManagersBoxGivesNeitherRetryNorCancel) {
    const RunningProgram manager(machine, kManager);
    GoToSelection();
    toolkit.AnswerNext(0);
    Install();
    EXPECT_EQ(toolkit.boxes, std::vector{kManagerRuns});
    EXPECT_EQ(wizard.state, WizardState::Installing);
}

TEST_F(RunningHosts, EndTheProcessAtCancel) {
    const RunningProgram host(machine, kAfterEffects);
    GoToSelection();
    toolkit.AnswerNext(kCancel);
    InstallAndEnd();
    EXPECT_EQ(toolkit.boxes, std::vector{kAfterEffectsRuns});
    EXPECT_EQ(
        toolkit.CallsFrom("MessageBeep 48"),
        (std::vector<std::string>{"MessageBeep 48", "MessageBoxA \"Host applications running.\"", "ExitProcess 0"}));
}

TEST_F(RunningHosts, AreLookedForAgainAtEachRetry) {
    RunningProgram host(machine, kAfterEffects);
    GoToSelection();
    toolkit.AnswerNext(kRetry);
    toolkit.AnswerNext(kRetry, [&] { host.End(); });
    Install();
    EXPECT_EQ(toolkit.boxes, (std::vector{kAfterEffectsRuns, kAfterEffectsRuns}));
    EXPECT_EQ(wizard.state, WizardState::Installing);
}

TEST_F(RunningHosts, MayStayWhenTheirBoxGivesNeitherRetryNorCancel) {
    const RunningProgram host(machine, kAfterEffects);
    GoToSelection();
    toolkit.AnswerNext(kOk);
    Install();
    EXPECT_EQ(toolkit.boxes, std::vector{kAfterEffectsRuns});
    EXPECT_EQ(wizard.state, WizardState::Installing);
}

TEST_F(RunningHosts, AreNamedOncePerCopy) {
    const RunningProgram one(machine, kAfterEffects);
    RunningProgram two(machine, kOlderAfterEffects);
    GoToSelection();
    toolkit.AnswerNext(kRetry, [&] { two.End(); });
    toolkit.AnswerNext(kCancel);
    InstallAndEnd();
    EXPECT_EQ(toolkit.boxes,
              (std::vector{HostsRun("After Effects and After Effects are host applications for products in the "
                                    "installer; please quit these applications and retryor cancel to exit the "
                                    "installer."),
                           kAfterEffectsRuns}));
}

TEST_F(RunningHosts, CountWithoutTheirProductsBeingChosen) {
    const RunningProgram host(machine, kAfterEffects);
    GoToSelection();
    toolkit.Toggle("com.halvorn.glow");
    toolkit.AnswerNext(kCancel);
    InstallAndEnd();
    EXPECT_EQ(toolkit.boxes, std::vector{kAfterEffectsRuns});
}

TEST_F(RunningHosts, AreLookedForAfterTheChoice) {
    const RunningProgram host(machine, kAfterEffects);
    GoToSelection();
    toolkit.DeselectAll();
    toolkit.AnswerNext(kOk);
    Install();
    EXPECT_EQ(toolkit.boxes, std::vector{kNothingSelected});
}

TEST_F(RunningHosts, EndInAnErrorThatNobodyCatchesWhenTheirNameIsTooShort) {
    // Premiere Pro is searched for in the whole path, so a program in a folder of that name is one; and the text for
    // the box cannot be made from three letters. Nothing on the way catches that.
    Ships(HostProduct("cuts", "premiere"));
    const RunningProgram host(machine, R"(C:\Program Files\Adobe Premiere Pro.exe\abc)");
    GoToSelection();
    EXPECT_THROW(Install(), std::out_of_range);
    EXPECT_TRUE(toolkit.boxes.empty());
}

class RunningHostsUnused : public WizardTest {};

TEST_F(RunningHostsUnused, AreNotMinded) {
    Ships(Product("titler"));
    const RunningProgram host(machine, kAfterEffects);
    GoToSelection();
    Install();
    EXPECT_TRUE(toolkit.boxes.empty());
    EXPECT_EQ(wizard.state, WizardState::Installing);
}

}  // namespace
