// The install: the engine's line, the polls, and every way in which it ends.
#include <algorithm>
#include <ctime>

#include "tests/installer/WizardTest.h"
#include "tests/support/FolderAccess.h"

namespace {

using HV::WizardPart;
using HV::WizardState;

class WizardInstall : public WizardTest {
protected:
    static constexpr const char* kLogPrefix = R"(C:\ProgramData\Halvorn\logs\com.halvorn.tessaly-suite-)";

    /// The time that the line carries; -1 when the line is not `before`, a time and `after`.
    [[nodiscard]] static std::int64_t TimeIn(const std::string& line, const std::string& before,
                                             const std::string& after) {
        if (!line.starts_with(before) || !line.ends_with(after) || line.size() <= before.size() + after.size()) {
            return -1;
        }
        const std::string time = line.substr(before.size(), line.size() - before.size() - after.size());
        return std::ranges::all_of(time, [](char c) { return c >= '0' && c <= '9'; }) ? std::stoll(time) : -1;
    }

    /// Expects the line of an install that skips as told.
    void ExpectLine(const std::string& skip, std::time_t earliest) const {
        const std::string before = "--verbose " + skip + "log=\"" + kLogPrefix;
        const std::string after = std::string("-log.txt\" --legacyuninstall dir=\"") + kPackages + "\"";
        const std::int64_t time = TimeIn(Line(), before, after);
        EXPECT_GE(time, earliest) << Line();
        EXPECT_LE(time, std::time(nullptr)) << Line();
    }
};

TEST_F(WizardInstall, EndsWithTheFinalPage) {
    Ships(Product("glow"));
    Ships(Hidden("core"));
    GoToSelection();
    const std::vector<int> percents = InstallAndPoll();
    EXPECT_EQ(percents.back(), 100);
    EXPECT_TRUE(std::ranges::is_sorted(percents));
    EXPECT_EQ(toolkit.Installing().status, "Installation complete.");
    EXPECT_EQ(toolkit.CallsFrom("KillTimer Progress"),
              (std::vector<std::string>{"KillTimer Progress", "CreateFinalPage", "ShowWindow InstallingPage 0",
                                        "ShowFinalButtons", "ShowWindow FinalPage 5", "SetTimer Grow 50"}));
    EXPECT_EQ(toolkit.VisiblePages(), std::vector{WizardPart::FinalPage});
    EXPECT_EQ(toolkit.timers, (std::map<unsigned, unsigned>{{HV::kGrowTimer, 50}}));
    EXPECT_TRUE(toolkit.boxes.empty());
    EXPECT_TRUE(toolkit.quits.empty());
    WaitForJob();
    EXPECT_EQ(machine.Content(PlaceOf("glow")), TextOf("glow"));
    EXPECT_EQ(machine.Content(PlaceOf("core")), TextOf("core"));
}

TEST_F(WizardInstall, LeavesTheFinalPageByItsButtons) {
    Ships(Product("glow"));
    GoToSelection();
    (void)InstallAndPoll();
    toolkit.Press(HV::kWhatsNewCommand);
    toolkit.Press(HV::kResourcesCommand);
    EXPECT_EQ(toolkit.urls, (std::vector<std::string>{"https://www.example.com/tessaly/whats-new/",
                                                      "https://www.example.com/tessaly/resources/"}));
    EXPECT_TRUE(toolkit.quits.empty());
    toolkit.Press(HV::kCloseCommand);
    EXPECT_EQ(toolkit.quits, std::vector{0});
    EXPECT_FALSE(log.Has("CRIT hvdeploy-detail: Cancel invoked"));
}

TEST_F(WizardInstall, ShowsItsPageBeforeTheEngineStarts) {
    Ships(Product("glow"));
    GoToSelection();
    output.gate.HoldAt("hvdeploy version");
    Install();
    EXPECT_EQ(toolkit.CallsFrom("CreateInstallingPage \"Detecting host applications...\" 0"),
              (std::vector<std::string>{"CreateInstallingPage \"Detecting host applications...\" 0",
                                        "ShowWindow SelectionPage 0", "ShowWindow InstallingPage 5",
                                        "EnableWindow BackButton false", "EnableWindow ContinueButton false",
                                        "SetTimer Progress 333"}));
    EXPECT_EQ(wizard.state, WizardState::Installing);
    EXPECT_EQ(wizard.installingPage, &toolkit.Installing());
    EXPECT_EQ(toolkit.VisiblePages(), std::vector{WizardPart::InstallingPage});
    EXPECT_FALSE(toolkit.CanPress(HV::kContinueCommand));
    EXPECT_FALSE(toolkit.CanPress(HV::kBackCommand));
    EXPECT_TRUE(toolkit.CanPress(HV::kCancelCommand));
    EXPECT_EQ(toolkit.Installing().status, "Detecting host applications...");
    EXPECT_EQ(toolkit.Installing().percent, 0);
    // The engine has prepared itself on this thread before its own came to be.
    ASSERT_TRUE(output.gate.WaitUntilHeld());
    toolkit.Tick(HV::kProgressTimer);
    EXPECT_EQ(toolkit.Installing().status, "Preparing to install...");
    EXPECT_EQ(toolkit.Installing().percent, 1);
    EXPECT_EQ(toolkit.timers, (std::map<unsigned, unsigned>{{HV::kProgressTimer, 333}}));
}

TEST_F(WizardInstall, SkipsNothingWhenEverythingIsChosen) {
    Ships(Product("glow"));
    Ships(Product("keyer"));
    GoToSelection();
    const std::time_t now = std::time(nullptr);
    (void)InstallAndPoll();
    ExpectLine("", now);
    EXPECT_EQ(Argument("skip="), "");
}

TEST_F(WizardInstall, SkipsWhatIsNotChosenAndNeverTheHidden) {
    Ships(Product("blur"));
    Ships(Product("glow"));
    Ships(Product("keyer"));
    Ships(Hidden("core"));
    GoToSelection();
    toolkit.Toggle("com.halvorn.keyer");
    toolkit.Toggle("com.halvorn.blur");
    const std::time_t now = std::time(nullptr);
    (void)InstallAndPoll();
    ExpectLine("skip=\"com.halvorn.blur,com.halvorn.keyer\" ", now);
    EXPECT_EQ(Argument("skip="), "\"com.halvorn.blur,com.halvorn.keyer\"");
    EXPECT_FALSE(machine.Exists(PlaceOf("blur")));
    EXPECT_FALSE(machine.Exists(PlaceOf("keyer")));
    EXPECT_EQ(machine.Content(PlaceOf("glow")), TextOf("glow"));
    EXPECT_EQ(machine.Content(PlaceOf("core")), TextOf("core"));
}

TEST_F(WizardInstall, SkipsProductsThatLackTheirHosts) {
    Ships(HostProduct("cuts", "resolve"));
    Ships(Product("glow"));
    toolkit.AnswerNext(kOk);
    GoToSelection();
    toolkit.SelectAll();
    const std::time_t now = std::time(nullptr);
    (void)InstallAndPoll();
    ExpectLine("skip=\"com.halvorn.cuts\" ", now);
}

TEST_F(WizardInstall, MakesTwoFoldersAndNoLog) {
    // The categories of the log stand before the line is read, so the argument "log=" changes nothing.
    Ships(Product("glow"));
    GoToSelection();
    EXPECT_FALSE(machine.Exists(R"(C:\ProgramData\Halvorn)"));
    (void)InstallAndPoll();
    WaitForJob();
    // Every user of the machine may log there.
    EXPECT_TRUE(OthersMayWrite(machine, R"(C:\ProgramData\Halvorn)"));
    EXPECT_TRUE(OthersMayWrite(machine, R"(C:\ProgramData\Halvorn\logs)"));
    int below = 0;
    for (const auto& [name, content] : machine.FilesWithoutFolders()) {
        EXPECT_FALSE(name.starts_with(R"(C:\ProgramData\Halvorn\logs)")) << name;
        ++below;
    }
    EXPECT_GT(below, 0) << "there is nothing at all";
    const std::string quoted = Argument("log=");
    ASSERT_TRUE(quoted.starts_with(std::string("\"") + kLogPrefix)) << quoted;
    EXPECT_FALSE(machine.Exists(quoted.substr(1, quoted.size() - 2)));
    EXPECT_TRUE(log.Has("INFO hvdeploy-detail: Installation complete.")) << "the log goes where it went before";
}

TEST_F(WizardInstall, TakesFoldersThatAreThereAlready) {
    machine.Has(R"(C:\ProgramData\Halvorn\logs\older.txt)", "kept");
    Ships(Product("glow"));
    GoToSelection();
    (void)InstallAndPoll();
    EXPECT_EQ(machine.Content(R"(C:\ProgramData\Halvorn\logs\older.txt)"), "kept");
}

TEST_F(WizardInstall, GoesOnWhenTheFoldersCannotBeMade) {
    machine.Has(R"(C:\ProgramData\Halvorn)", "a file in the way");
    Ships(Product("glow"));
    GoToSelection();
    (void)InstallAndPoll();
    EXPECT_EQ(machine.Content(R"(C:\ProgramData\Halvorn)"), "a file in the way");
    EXPECT_EQ(machine.Content(PlaceOf("glow")), TextOf("glow"));
}

/// A release whose second payload cannot be placed.
class FailingInstall : public WizardTest {
protected:
    FailingInstall() {
        Ships(Product("glow").Payload("resource").File("lost.txt", "lost").To("nowhere"));
        machine.Has(PlaceOf("glow"), "the old one");
    }
};

TEST_F(FailingInstall, TellsAndEnds) {
    GoToSelection();
    Install();
    WaitForJob();
    toolkit.AnswerNext(kOk);
    TickToTheEnd();
    EXPECT_EQ(toolkit.boxes, std::vector{kInstallationFailed});
    EXPECT_EQ(wizard.state, WizardState::Failed);
    EXPECT_EQ(toolkit.Installing().percent, -1);
    EXPECT_EQ(toolkit.Installing().status, kFailureText);
    EXPECT_TRUE(toolkit.timers.empty()) << "nothing polls while the box is open";
    EXPECT_EQ(toolkit.CallsFrom("SetPercent -1"),
              (std::vector<std::string>{"SetPercent -1", std::string("SetStatusText \"") + kFailureText + "\"",
                                        "KillTimer Progress", "MessageBeep 16", "MessageBoxA \"Installation Failed\"",
                                        "ExitProcess 0"}));
    EXPECT_EQ(wizard.finalPage, nullptr);
    EXPECT_EQ(machine.Content(PlaceOf("glow")), "the old one");
}

TEST_F(FailingInstall, PassesForASuccessAtThePollThatLandsOnAHundred) {
    // A failing run reports 100 just before its failure, and a poll in between sees a run that is done.
    GoToSelection();
    HeldLog heldLog;
    heldLog.gate.HoldAt("Installation complete.");
    Install();
    ASSERT_TRUE(heldLog.gate.WaitUntilHeld());
    toolkit.Tick(HV::kProgressTimer);
    EXPECT_EQ(wizard.state, WizardState::Finished);
    EXPECT_EQ(toolkit.VisiblePages(), std::vector{WizardPart::FinalPage});
    heldLog.gate.LetGo();
    WaitForJob();
    EXPECT_EQ(wizard.job->error, -1);
    EXPECT_FALSE(toolkit.timers.contains(HV::kProgressTimer)) << "nobody polls any more";
    EXPECT_TRUE(toolkit.boxes.empty());
}

/// An install that stands still between its two payloads, the first of which has replaced a file.
class CancelledInstall : public WizardTest {
protected:
    CancelledInstall() {
        Ships(Product("glow").Payload("resource").File("more.txt", "more").To("programdata", "Products"));
        machine.Has(PlaceOf("glow"), "the old one");
        GoToSelection();
        output.gate.HoldAt("[v] Deploying payload payload-2");
        Install();
        EXPECT_TRUE(output.gate.WaitUntilHeld());
        EXPECT_EQ(machine.Content(PlaceOf("glow")), TextOf("glow"));
    }
    ~CancelledInstall() override { output.gate.LetGo(); }

    void LetTheEngineEnd() {
        output.gate.LetGo();
        WaitForJob();
    }
    static constexpr const char* kCancelLine = "CRIT hvdeploy-detail: Cancel invoked";
};

TEST_F(CancelledInstall, LeavesAtOnceAndLetsTheEngineUndo) {
    toolkit.Press(HV::kCancelCommand);
    EXPECT_EQ(toolkit.quits, std::vector{0}) << "the engine still stands where it stood";
    EXPECT_TRUE(log.Has(kCancelLine));
    EXPECT_TRUE(toolkit.boxes.empty());
    EXPECT_TRUE(toolkit.exits.empty());
    LetTheEngineEnd();
    EXPECT_EQ(machine.Content(PlaceOf("glow")), "the old one");
    EXPECT_FALSE(machine.Exists(R"(C:\ProgramData\Products\more.txt)"));
}

TEST_F(CancelledInstall, EndsInTheSameWayByClose) {
    wizard.Perform(HV::kCloseCommand);
    EXPECT_EQ(toolkit.quits, std::vector{0});
    EXPECT_TRUE(log.Has(kCancelLine));
    LetTheEngineEnd();
    EXPECT_EQ(machine.Content(PlaceOf("glow")), "the old one");
}

TEST_F(CancelledInstall, IsAFailureToAPollThatStillComes) {
    toolkit.Press(HV::kCancelCommand);
    LetTheEngineEnd();
    toolkit.AnswerNext(kOk);
    TickToTheEnd();
    EXPECT_EQ(toolkit.boxes, std::vector{kInstallationFailed});
}

// Nor by the title bar, which has no command: the tests of the window and the walks in it look at that.
TEST_F(CancelledInstall, IsNotRaisedByDisagree) {
    wizard.Perform(HV::kDisagreeCommand);
    EXPECT_EQ(toolkit.quits, std::vector{0});
    LetTheEngineEnd();
    EXPECT_FALSE(log.Has(kCancelLine));
    EXPECT_EQ(machine.Content(PlaceOf("glow")), TextOf("glow"));
    EXPECT_EQ(machine.Content(R"(C:\ProgramData\Products\more.txt)"), "more");
}

TEST_F(CancelledInstall, DoesNotListenToContinueOrBack) {
    const auto before = toolkit.calls;
    wizard.Perform(HV::kContinueCommand);
    wizard.Perform(HV::kBackCommand);
    EXPECT_EQ(toolkit.calls, before);
    EXPECT_EQ(wizard.state, WizardState::Installing);
}

TEST_F(CancelledInstall, ShowsWhatTheEngineSaidLast) {
    toolkit.Tick(HV::kProgressTimer);
    EXPECT_EQ(toolkit.Installing().status, "Installing com.halvorn.glow.hvpkg...");
    EXPECT_EQ(wizard.state, WizardState::Installing);
    EXPECT_TRUE(toolkit.timers.contains(HV::kProgressTimer));
}

/// Polls of a job that says what the test wants. It has no engine and no thread.
class Poll : public WizardTest {
protected:
    Poll() {
        Ships(Product("glow"));
        Begin();
        wizard.installingPage = toolkit.CreateInstallingPage(wizard, Model(), *wizard.window, "before", 7);
        wizard.state = WizardState::Installing;
        wizard.job = &job;
        toolkit.SetTimer(*wizard.window, HV::kProgressTimer, 333);
        toolkit.calls.clear();
    }
    ~Poll() override { wizard.job = nullptr; }

    std::vector<std::string> TickAt(std::uint32_t percent, const char* text, std::int32_t error = 0) {
        toolkit.calls.clear();
        job.update(percent, text, error);
        toolkit.Tick(HV::kProgressTimer);
        return toolkit.calls;
    }
    void EndAt(std::uint32_t percent, const char* text, std::int32_t error) {
        job.update(percent, text, error);
        toolkit.AnswerNext(kOk);
        TickToTheEnd();
    }
    using Calls = std::vector<std::string>;

    HV::DeployJob job{""};
};

TEST_F(Poll, TakesOverWhatDiffers) {
    EXPECT_EQ(TickAt(8, "before"), Calls{"SetPercent 8"});
    EXPECT_EQ(TickAt(8, "after"), Calls{"SetStatusText \"after\""});
    EXPECT_EQ(TickAt(9, "later"), (Calls{"SetPercent 9", "SetStatusText \"later\""}));
    EXPECT_EQ(TickAt(9, "later"), Calls{});
    EXPECT_EQ(wizard.state, WizardState::Installing);
    EXPECT_TRUE(toolkit.timers.contains(HV::kProgressTimer));
}

TEST_F(Poll, NeverBlanksTheStatus) {
    EXPECT_EQ(TickAt(8, ""), Calls{"SetPercent 8"});
    EXPECT_EQ(TickAt(9, nullptr), Calls{"SetPercent 9"});
    EXPECT_EQ(toolkit.Installing().status, "before");
}

TEST_F(Poll, FinishesAtAHundredExactly) {
    int polls = 0;
    for (const std::uint32_t percent : {0U, 99U, 101U, 200U, 0x7FFFFFFFU}) {
        (void)TickAt(percent, "on the way");
        EXPECT_EQ(wizard.state, WizardState::Installing) << percent;
        EXPECT_EQ(toolkit.Installing().percent, static_cast<int>(percent));
        ++polls;
    }
    EXPECT_EQ(polls, 5);
    (void)TickAt(100, "done");
    EXPECT_EQ(wizard.state, WizardState::Finished);
}

TEST_F(Poll, GoesOnAtTheMarkOfAFailureWithoutAnError) {
    (void)TickAt(HV::kFailedPercent, "odd", 0);
    EXPECT_EQ(wizard.state, WizardState::Installing);
    EXPECT_EQ(toolkit.Installing().percent, -1);
}

TEST_F(Poll, FinishesWithoutAText) {
    EXPECT_EQ(TickAt(100, ""),
              (Calls{"SetPercent 100", "KillTimer Progress", "CreateFinalPage", "ShowWindow InstallingPage 0",
                     "ShowFinalButtons", "ShowWindow FinalPage 5", "SetTimer Grow 50"}));
    EXPECT_EQ(toolkit.Installing().status, "before");
    EXPECT_TRUE(toolkit.Window().hasFinalButtons);
}

TEST_F(Poll, FailsAtAnyError) {
    EndAt(HV::kFailedPercent, kFailureText, 1);
    EXPECT_EQ(toolkit.boxes, std::vector{kInstallationFailed});
    EXPECT_EQ(toolkit.Installing().status, kFailureText);
}

TEST_F(Poll, FailsAtAHundredWithAnError) {
    EndAt(100, "Installation complete.", -1);
    EXPECT_EQ(wizard.state, WizardState::Failed);
    EXPECT_EQ(toolkit.Installing().percent, -1);
    EXPECT_EQ(wizard.finalPage, nullptr);
}

TEST_F(Poll, KeepsTheStatusAtAFailureWithoutAText) {
    EndAt(HV::kFailedPercent, "", -2);
    EXPECT_EQ(toolkit.Installing().status, "before");
    EXPECT_EQ(toolkit.calls, (Calls{"SetPercent -1", "KillTimer Progress", "MessageBeep 16",
                                    "MessageBoxA \"Installation Failed\"", "ExitProcess 0"}));
}

TEST_F(Poll, StopsItsTimerOutsideOfTheInstall) {
    int tried = 0;
    for (const WizardState state :
         {WizardState::Welcome, WizardState::Selection, WizardState::Finished, WizardState::Failed}) {
        wizard.state = state;
        toolkit.timers[HV::kProgressTimer] = 333;
        EXPECT_EQ(TickAt(100, "done"), Calls{"KillTimer Progress"});
        EXPECT_EQ(wizard.state, state);
        ++tried;
    }
    EXPECT_EQ(tried, 4);
}

TEST_F(Poll, StopsItsTimerWithoutAJob) {
    wizard.job = nullptr;
    toolkit.Tick(HV::kProgressTimer);
    EXPECT_EQ(toolkit.calls, Calls{"KillTimer Progress"});
    EXPECT_EQ(wizard.state, WizardState::Installing);
}

}  // namespace
