// The checks before an install where no real process will do: many hosts, nameless processes, no list at all.
#include <stdexcept>

#include "tests/installer/WizardTest.h"
#include "tests/support/ScriptedProcesses.h"

namespace {

using HV::WizardState;

class ScriptedHosts : public WizardTest {
protected:
    ScriptedHosts() { ProcessScript::Renew(); }
    ~ScriptedHosts() override { ProcessScript::Renew(); }

    static constexpr const char* kAfterEffects = R"(C:\Program Files\Adobe\AfterFX.exe)";
};

TEST_F(ScriptedHosts, AreNamedInTheOrderInWhichThePackagesUseThem) {
    HasHostsOf("everything");
    Ships(HostProduct("a", "resolve"));
    Ships(HostProduct("b", "mediacomposer"));
    Ships(HostProduct("c", "aftereffects+premiere"));
    ProcessScript::Current()
        .Runs(kAfterEffects)
        .Runs(R"(C:\Program Files\Adobe\Adobe Premiere Pro 2022\Adobe Premiere Pro.exe)")
        .Runs(R"(C:\Program Files\Avid\AvidMediaComposer.exe)")
        .Runs(R"(C:\Program Files\Blackmagic Design\Resolve.exe)")
        .Runs(R"(C:\Windows\explorer.exe)");
    GoToSelection();
    toolkit.AnswerNext(kRetry, [] { ProcessScript::Renew().Runs(kAfterEffects); });
    toolkit.AnswerNext(kRetry, [] { ProcessScript::Renew(); });
    Install();
    EXPECT_EQ(toolkit.boxes,
              (std::vector{HostsRun("Resolve, AvidMediaComposer, After Effects and Adobe Premiere Pro are host "
                                    "applications for products in the installer; please quit these applications and "
                                    "retryor cancel to exit the installer."),
                           HostsRun("After Effects is a host application for products in the installer; please quit "
                                    "this application and retry or cancel to exit the installer.")}));
    EXPECT_EQ(wizard.state, WizardState::Installing);
}

TEST_F(ScriptedHosts, EndInAnErrorThatNobodyCatchesWhenHitFilmHasNoName) {
    // HitFilm has no process name of its own, so every nameless process passes for it, and none of them can be told to
    // the user. The error leaves the controller; nothing on the way may swallow it.
    HasHostsOf("hitfilm");
    Ships(HostProduct("steady", "hitfilm"));
    ProcessScript::Current().Runs("");
    GoToSelection();
    try {
        Install();
        ADD_FAILURE() << "a process without a name has been told";
    } catch (const std::out_of_range& error) {
        EXPECT_STREQ(error.what(), "invalid string position");
    }
    EXPECT_TRUE(toolkit.boxes.empty());
    EXPECT_EQ(wizard.state, WizardState::Selection);
    EXPECT_EQ(wizard.job, nullptr);
}

TEST_F(ScriptedHosts, AreTakenForGoneWhenThereIsNoListOfProcesses) {
    HasHostsOf("motion-design");
    Ships(HostProduct("glow", "aftereffects"));
    ProcessScript::Current()
        .Runs(kAfterEffects)
        .Runs(R"(C:\Program Files\Halvorn\Halvorn Application Manager.exe)")
        .listFails = true;
    GoToSelection();
    Install();
    EXPECT_TRUE(toolkit.boxes.empty());
    EXPECT_EQ(wizard.state, WizardState::Installing);
}

TEST_F(ScriptedHosts, AreLookedForInAFreshListAtEachCheck) {
    HasHostsOf("motion-design");
    Ships(HostProduct("glow", "aftereffects"));
    ProcessScript::Current().Runs(kAfterEffects);
    GoToSelection();
    EXPECT_EQ(ProcessScript::Current().snapshots, 0);
    toolkit.AnswerNext(kRetry);
    toolkit.AnswerNext(kOk);
    Install();
    EXPECT_EQ(ProcessScript::Current().snapshots, 3) << "one for the manager, one for each look at the hosts";
}

TEST_F(ScriptedHosts, AreNotLookedForWhenNoPackageUsesAny) {
    Ships(Product("titler"));
    ProcessScript::Current().Runs(kAfterEffects).Runs("");
    GoToSelection();
    Install();
    EXPECT_EQ(ProcessScript::Current().snapshots, 1) << "one for the manager";
    EXPECT_TRUE(toolkit.boxes.empty());
}

}  // namespace
