#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "hosts/HostAppCheck.h"
#include "hvframework/FileUtils.h"
#include "tests/hosts/TestExecutables.h"
#include "tests/support/Machine.h"

namespace {

using Texts = std::vector<std::string>;

/// One of the machines that the samples describe.
class SampleMachine : public testing::Test {
protected:
    void Is(const std::string& name) {
        std::string registry;
        const std::string file = "Z:" HV_SAMPLE_MACHINES "/" + name + ".reg";
        ASSERT_EQ(HVL::FileUtils::ReadFileToString(file, registry), 0) << file;
        machine.Loads(registry);
        check.DetectHosts();
    }

    /// "abbreviation version" of each record.
    [[nodiscard]] Texts Hosts() const {
        Texts found;
        for (const HV::HostRecord& host : check.Hosts()) {
            found.push_back(host.hostAbbreviation + " " + host.hostVersion);
        }
        return found;
    }

    Machine machine;
    HV::HostAppCheck check;
};

TEST_F(SampleMachine, HasNoHostWhenItIsClean) {
    Is("clean");
    EXPECT_EQ(Hosts(), Texts{});
}

TEST_F(SampleMachine, HasThreeAfterEffectsAndPremiereInAMotionDesignStudio) {
    Is("motion-design");
    EXPECT_EQ(Hosts(), (Texts{"aftereffects 15.0", "aftereffects 16.0", "aftereffects 22.0", "premiere 22.0"}));
}

TEST_F(SampleMachine, HasResolveAndVegasInAnEditingRoom) {
    Is("editor");
    EXPECT_EQ(Hosts(), (Texts{"resolve 17.4.6", "vegas 17.0", "vegas 18.0"}));
}

TEST_F(SampleMachine, HasEdiusAndMediaComposerAtABroadcaster) {
    Is("broadcast");
    EXPECT_EQ(Hosts(), (Texts{"edius 9.55.6018", "mediacomposer 20.12.1.56139"}));
}

TEST_F(SampleMachine, HasHitFilmWithTheVersionOfItsExecutable) {
    machine.Has(R"(C:\Program Files\FXHOME\HitFilm Pro 15\HitFilmPro.exe)", TestExecutableBytes("both-versions"));
    Is("hitfilm");
    EXPECT_EQ(Hosts(), Texts{"hitfilm 13.0.5"});
}

TEST_F(SampleMachine, HasEveryHostAtOnce) {
    Is("everything");
    EXPECT_EQ(Hosts(),
              (Texts{"aftereffects 15.0", "aftereffects 16.0", "aftereffects 22.0", "premiere 22.0", "edius 9.55.6018",
                     "hitfilm ", "mediacomposer 20.12.1.56139", "resolve 17.4.6", "vegas 17.0", "vegas 18.0"}));
}

TEST_F(SampleMachine, HasTheHostsThatBrokenKeysStillDescribe) {
    Is("broken");
    EXPECT_EQ(Hosts(), (Texts{"aftereffects 13.5", "aftereffects 16.0", "aftereffects 16.1", "aftereffects 17.0",
                              "aftereffects 22.0", "aftereffects 23.0", "premiere 14.0", "premiere 8", "hitfilm ",
                              "resolve ", "vegas 14.0"}));
}

TEST_F(SampleMachine, ReadsOddValuesAsTheTextThatTheyAmountTo) {
    Is("broken");
    ASSERT_EQ(check.Hosts().size(), 11U);
    const auto& hosts = check.Hosts();
    EXPECT_EQ(hosts[1].hostAppPath, R"(C:\Program Files\Adobe\Adobe After Effects CC 2019\Support Files\AfterFX.exe)");
    EXPECT_EQ(hosts[2].hostPluginPath, R"(C:\Plug-ins One;C:\Plug-ins Two)");
    EXPECT_EQ(hosts[3].hostPluginPath, "7");
    EXPECT_EQ(hosts[4].hostAppPath, R"(C:\Program Files\Adobe\Adobe After Effects 2022\Support Files\AfterFX.exe)");
    EXPECT_GT(hosts[5].hostAppPath.size(), 1024U);
    EXPECT_EQ(hosts[5].hostDisplayName, "Deeply Nested Folder 45");
    EXPECT_EQ(hosts[6].hostPluginPath, "0aff");
}

}  // namespace
