// Which questions the model asks for which host, and how often. The system's answers are written by the test: among
// them are processes without a name, and a list that cannot be had.
#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <stdexcept>

#include "installer/InstallerModel.h"
#include "tests/support/Machine.h"
#include "tests/support/ScriptedProcesses.h"

namespace {

using Names = std::vector<std::string>;

class ScriptedModelProcessesTest : public testing::Test {
protected:
    // The model takes a first snapshot when it is made.
    ScriptedModelProcessesTest() {
        EXPECT_EQ(script.snapshots, 1);
        script.snapshots = 0;
    }

    void Uses(const std::vector<std::string>& hostRefs) {
        HV::PackageInfo package;
        package.hostRefs = hostRefs;
        model.packages.push_back(package);
    }

    /// A process of every name that stands in a question, and of names that stand in none.
    void RunsEverything() {
        script.Runs("")
            .Runs(R"(C:\a\AfterFX.exe)")
            .Runs(R"(C:\a\Adobe Premiere Pro.exe)")
            .Runs(R"(C:\a\EDIUS)")
            .Runs(R"(C:\a\EDIUS.exe)")
            .Runs(R"(C:\a\AvidMediaComposer.exe)")
            .Runs(R"(C:\a\Resolve.exe)")
            .Runs(R"(C:\a\vegas180.exe)")
            .Runs(R"(C:\a\HitFilm.exe)")
            .Runs(R"(C:\a\explorer.exe)");
    }

    Names Found() {
        std::vector<HV::ProcessRecord> found(1);
        const bool any = model.FindRunningHosts(found);
        EXPECT_EQ(any, !found.empty());
        Names names;
        std::ranges::transform(found, std::back_inserter(names), &HV::ProcessRecord::name);
        return names;
    }

    Machine machine;
    ProcessScript& script = ProcessScript::Renew();
    HV::InstallerModel model{{}};
};

TEST_F(ScriptedModelProcessesTest, AsksForEachHostInItsWay) {
    RunsEverything();
    const std::map<std::string, Names> answers = {{"aftereffects", {"AfterFX.exe"}},
                                                  {"aftereffectsMC", {"AfterFX.exe"}},
                                                  {"premiere", {"Adobe Premiere Pro.exe"}},
                                                  {"aftereffects+premiere", {"AfterFX.exe", "Adobe Premiere Pro.exe"}},
                                                  {"edius", {"EDIUS"}},
                                                  {"finalcutprox", {}},
                                                  {"hitfilm", {""}},
                                                  {"mediacomposer", {"AvidMediaComposer.exe"}},
                                                  {"motion", {}},
                                                  {"ofx", {}},
                                                  {"resolve", {"Resolve.exe"}},
                                                  {"vegas", {}},
                                                  {"Resolve", {}},
                                                  {"", {}}};
    int asked = 0;
    for (const auto& [hostRef, names] : answers) {
        model.packages.clear();
        Uses({hostRef});
        EXPECT_EQ(Found(), names) << hostRef;
        ++asked;
    }
    EXPECT_EQ(asked, 14);
}

TEST_F(ScriptedModelProcessesTest, TakesAProgramNamedNaForAHostWithoutAProgram) {
    script.Runs(R"(C:\a\n\a)").Runs("C:\\a\\n/a");
    Uses({"motion"});
    EXPECT_EQ(Found(), Names{"n/a"});
    Uses({"finalcutprox"});
    EXPECT_EQ(Found(), (Names{"n/a", "n/a"}));
}

TEST_F(ScriptedModelProcessesTest, AsksInTheOrderInWhichHostsAreFirstNamed) {
    RunsEverything();
    Uses({"resolve", "mediacomposer"});
    Uses({"mediacomposer", "aftereffects", "resolve"});
    EXPECT_EQ(Found(), (Names{"Resolve.exe", "AvidMediaComposer.exe", "AfterFX.exe"}));
}

TEST_F(ScriptedModelProcessesTest, AsksForAfterEffectsOnceWhateverNamesIt) {
    RunsEverything();
    Uses({"aftereffects", "aftereffectsMC", "aftereffects+premiere"});
    EXPECT_EQ(Found(), (Names{"AfterFX.exe", "Adobe Premiere Pro.exe"}));
}

TEST_F(ScriptedModelProcessesTest, AsksForPremiereOnceWhateverNamesIt) {
    RunsEverything();
    Uses({"aftereffects+premiere"});
    Uses({"premiere", "aftereffects"});
    EXPECT_EQ(Found(), (Names{"AfterFX.exe", "Adobe Premiere Pro.exe"}));
}

TEST_F(ScriptedModelProcessesTest, LooksForPremiereAnywhereInAPath) {
    script.Runs(R"(C:\Old Adobe Premiere Pro.exe of mine\viewer.exe)")
        .Runs(R"(C:\a\Not Adobe Premiere Pro.exe)")
        .Runs(R"(C:\a\adobe premiere pro.exe)")
        .Runs(R"(C:\Adobe Premiere Pro\other.exe)");
    Uses({"premiere"});
    EXPECT_EQ(Found(), (Names{"viewer.exe", "Not Adobe Premiere Pro.exe"}));
}

TEST_F(ScriptedModelProcessesTest, AsksAfreshEachTime) {
    RunsEverything();
    Uses({"aftereffects+premiere"});
    EXPECT_EQ(Found().size(), 2U);
    EXPECT_EQ(Found().size(), 2U);
}

TEST_F(ScriptedModelProcessesTest, FindsAProcessAsOftenAsQuestionsMeanIt) {
    script.Runs(R"(C:\Adobe Premiere Pro.exe\AfterFX.exe)");
    Uses({"aftereffects+premiere"});
    EXPECT_EQ(Found(), (Names{"AfterFX.exe", "AfterFX.exe"}));
}

TEST_F(ScriptedModelProcessesTest, CountsHiddenAndUnneededPackagesToo) {
    RunsEverything();
    HV::PackageInfo package;
    package.show = false;
    package.requiresHost = false;
    package.hostRefs = {"resolve"};
    model.packages.push_back(package);
    EXPECT_EQ(Found(), Names{"Resolve.exe"});
}

TEST_F(ScriptedModelProcessesTest, TakesNoSnapshotWhenNoPackageUsesAHost) {
    RunsEverything();
    Uses({});
    Uses({});
    EXPECT_EQ(Found(), Names());
    EXPECT_EQ(script.snapshots, 0);
}

TEST_F(ScriptedModelProcessesTest, TakesOneSnapshotForAllQuestions) {
    Uses({"vegas"});
    Found();
    EXPECT_EQ(script.snapshots, 1);
    Uses({"resolve", "premiere"});
    Found();
    EXPECT_EQ(script.snapshots, 2);
}

TEST_F(ScriptedModelProcessesTest, TakesASnapshotForTheManager) {
    script.Runs(R"(C:\a\Halvorn Application Manager.exe)");
    EXPECT_TRUE(model.ManagerIsRunning());
    EXPECT_EQ(script.snapshots, 1);
    script.processes.clear();
    EXPECT_FALSE(model.ManagerIsRunning());
    EXPECT_EQ(script.snapshots, 2);
}

TEST_F(ScriptedModelProcessesTest, FindsNothingWhenTheListCannotBeHad) {
    RunsEverything();
    script.Runs(R"(C:\a\Halvorn Application Manager.exe)");
    Uses({"resolve", "hitfilm"});
    EXPECT_EQ(Found().size(), 2U);
    script.listFails = true;
    EXPECT_EQ(Found(), Names());
    EXPECT_FALSE(model.ManagerIsRunning());
}

TEST_F(ScriptedModelProcessesTest, FindsForHitFilmAProcessThatCannotBeNamed) {
    script.Runs("").Runs("no-backslash.exe");
    script.processes.push_back({.number = 4});
    Uses({"hitfilm"});
    std::vector<HV::ProcessRecord> found;
    EXPECT_TRUE(model.FindRunningHosts(found));
    ASSERT_EQ(found.size(), 3U);
    EXPECT_THROW(static_cast<void>(HV::HostDisplayName(found[0])), std::out_of_range);
}

}  // namespace
