// Which real programs the model takes for running hosts.
#include <gtest/gtest.h>

#include "installer/InstallerModel.h"
#include "tests/support/Machine.h"
#include "tests/support/RunningProgram.h"

namespace {

using Names = std::vector<std::string>;

class ModelProcessesTest : public testing::Test {
protected:
    void Uses(const std::vector<std::string>& hostRefs) {
        HV::PackageInfo package;
        package.hostRefs = hostRefs;
        model.packages.push_back(package);
    }

    /// The names of the running hosts on drive C. What runs outside of the machine may be a host too, of somebody who
    /// works on this computer.
    Names Found() {
        std::vector<HV::ProcessRecord> found;
        const bool any = model.FindRunningHosts(found);
        EXPECT_EQ(any, !found.empty());
        Names names;
        for (const HV::ProcessRecord& record : found) {
            if (record.fullPath.starts_with("C:\\")) {
                names.push_back(record.name);
            }
        }
        return names;
    }

    Machine machine;
    HV::InstallerModel model{{}};
};

TEST_F(ModelProcessesTest, SeesAfterEffectsUntilItEnds) {
    Uses({"aftereffects"});
    EXPECT_EQ(Found(), Names());
    RunningProgram host(machine, R"(C:\Program Files\Adobe\Adobe After Effects 2022\Support Files\AfterFX.exe)");
    EXPECT_EQ(Found(), Names{"AfterFX.exe"});
    host.End();
    EXPECT_EQ(Found(), Names());
}

TEST_F(ModelProcessesTest, SeesEachHostThatHasAName) {
    Uses({"resolve", "mediacomposer", "premiere", "aftereffects"});
    const RunningProgram afterEffects(machine, R"(C:\Program Files\Adobe\After Effects\AfterFX.exe)");
    const RunningProgram premiere(machine, R"(C:\Program Files\Adobe\Premiere\Adobe Premiere Pro.exe)");
    const RunningProgram composer(machine, R"(C:\Program Files\Avid\Avid Media Composer\AvidMediaComposer.exe)");
    const RunningProgram resolve(machine, R"(C:\Program Files\Blackmagic Design\DaVinci Resolve\Resolve.exe)");
    EXPECT_EQ(Found(), (Names{"Resolve.exe", "AvidMediaComposer.exe", "Adobe Premiere Pro.exe", "AfterFX.exe"}));
}

TEST_F(ModelProcessesTest, SeesTwoCopiesTwice) {
    Uses({"aftereffects", "aftereffects+premiere"});
    const RunningProgram first(machine, R"(C:\Program Files\Adobe\Adobe After Effects 2021\AfterFX.exe)");
    const RunningProgram second(machine, R"(C:\Program Files\Adobe\Adobe After Effects 2022\AfterFX.exe)");
    EXPECT_EQ(Found(), (Names{"AfterFX.exe", "AfterFX.exe"}));
}

TEST_F(ModelProcessesTest, TakesAFolderNamedAsPremiereForPremiere) {
    Uses({"premiere"});
    const RunningProgram helper(machine, R"(C:\Program Files\Adobe Premiere Pro.exe\dynamiclink.exe)");
    EXPECT_EQ(Found(), Names{"dynamiclink.exe"});
}

TEST_F(ModelProcessesTest, SeesEdiusOnlyWithoutItsExtension) {
    Uses({"edius"});
    const RunningProgram real(machine, R"(C:\Program Files\Grass Valley\EDIUS 9\EDIUS.exe)");
    EXPECT_EQ(Found(), Names());
    const RunningProgram bare(machine, R"(C:\Program Files\Grass Valley\EDIUS)");
    EXPECT_EQ(Found(), Names{"EDIUS"});
}

TEST_F(ModelProcessesTest, DoesNotAskForVegas) {
    Uses({"vegas", "ofx"});
    const RunningProgram vegas(machine, R"(C:\Program Files\VEGAS\VEGAS Pro 18.0\vegas180.exe)");
    EXPECT_EQ(Found(), Names());
}

TEST_F(ModelProcessesTest, SeesTheManagerUntilItEnds) {
    EXPECT_FALSE(model.ManagerIsRunning());
    RunningProgram manager(machine, R"(C:\Program Files\Halvorn\Halvorn Application Manager.exe)");
    EXPECT_TRUE(model.ManagerIsRunning());
    manager.End();
    EXPECT_FALSE(model.ManagerIsRunning());
}

TEST_F(ModelProcessesTest, TakesNoOtherProgramForTheManager) {
    const RunningProgram updater(machine, R"(C:\Program Files\Halvorn\halvorn application manager.exe)");
    const RunningProgram helper(machine, R"(C:\Program Files\Halvorn Application Manager.exe\helper.exe)");
    EXPECT_FALSE(model.ManagerIsRunning());
}

}  // namespace
