#include "hosts/AdobeDetectors.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "tests/hosts/DetectorTest.h"

namespace {

using Texts = std::vector<std::string>;

constexpr const char* kAfterEffectsRuns = "DEBUG hvdeploy-detail: HV::AdobeAEDector_Win HV::AdobeAEDetector_Win::Run";
constexpr const char* kMediaCore = R"(C:\Program Files\Adobe\Common\Plug-ins\7.0\MediaCore\)";

class AdobeAEDetector : public DetectorTest<HV::AdobeAEDetector_Win> {
protected:
    static std::string KeyOf(const std::string& version) { return "Adobe\\After Effects\\" + version; }

    /// After Effects 2022 as its installer registers it, under any version.
    void HasAfterEffects(const std::string& version) {
        HasKey(KeyOf(version),
               {{"InstallPath", R"(C:\Program Files\Adobe\Adobe After Effects 2022\Support Files\)"},
                {"PluginInstallPath", R"(C:\Program Files\Adobe\Adobe After Effects 2022\Support Files\Plug-ins\)"},
                {"CommonPluginInstallPath", kMediaCore},
                {"FFXInstallPath", R"(C:\Program Files\Adobe\Adobe After Effects 2022\Support Files\Presets\)"}});
    }

    /// The same without the application's folder.
    void HasAfterEffectsWithoutFolder(const std::string& version) {
        HasKey(KeyOf(version), {{"PluginInstallPath", R"(C:\Plug-ins\)"}, {"CommonPluginInstallPath", kMediaCore}});
    }

    static std::string NoAppPath(const std::string& version) {
        return "WARN hvdeploy-detail: could not read app path for host AE version " + version + ", skipping it.";
    }
    static std::string NoPluginPath(const std::string& version) {
        return "WARN hvdeploy-detail: could not read plugin or mediacore path for AE version " + version +
               ", skipping it.";
    }
};

TEST_F(AdobeAEDetector, FindsNothingOnACleanMachine) {
    EXPECT_FALSE(Run());
    EXPECT_TRUE(hosts.empty());
    EXPECT_EQ(log.Lines(), Texts{kAfterEffectsRuns});
}

TEST_F(AdobeAEDetector, FindsNothingInAKeyWithoutVersions) {
    HasKey("Adobe\\After Effects", {{"InstallPath", R"(C:\AE\)"}});
    EXPECT_FALSE(Run());
    EXPECT_TRUE(hosts.empty());
}

TEST_F(AdobeAEDetector, FillsTheRecordFromTheVersionsKey) {
    HasAfterEffects("22.0");
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    const HV::HostRecord& host = hosts.front();
    EXPECT_EQ(host.hostType, HV::HostType::AfterEffects);
    EXPECT_EQ(host.hostAbbreviation, "aftereffects");
    EXPECT_EQ(host.hostDisplayName, "Adobe After Effects 2022");
    EXPECT_EQ(host.hostVersion, "22.0");
    EXPECT_EQ(host.hostAppPath, R"(C:\Program Files\Adobe\Adobe After Effects 2022\Support Files\AfterFX.exe)");
    EXPECT_EQ(host.hostPluginPath, R"(C:\Program Files\Adobe\Adobe After Effects 2022\Support Files\Plug-ins\)");
    EXPECT_EQ(host.hostSharedPath, kMediaCore);
    EXPECT_EQ(host.hostPresetsPath, R"(C:\Program Files\Adobe\Adobe After Effects 2022\Support Files\Presets\)");
    EXPECT_EQ(host.hostScriptsPath, R"(C:\Program Files\Adobe\Adobe After Effects 2022\Support Files\Scripts)");
    EXPECT_EQ(host.hostDocsPath, "");
    EXPECT_EQ(host.hostData, "");
    EXPECT_EQ(log.Lines(), Texts{kAfterEffectsRuns});
}

TEST_F(AdobeAEDetector, BeginsAtThirteenAndPassesOlderVersionsOverInSilence) {
    int added = 0;
    for (const char* version : {"11.0", "12", "12.0", "12.9.9.9", "13", "13.0", "13.0.0.1"}) {
        HasAfterEffects(version);
        ++added;
    }
    EXPECT_EQ(added, 7);
    EXPECT_TRUE(Run());
    EXPECT_EQ(Versions(), (Texts{"13", "13.0", "13.0.0.1"}));
    EXPECT_EQ(log.Lines(), Texts{kAfterEffectsRuns});
}

TEST_F(AdobeAEDetector, PassesOverASubkeyThatIsNoVersionInSilence) {
    HasAfterEffects("Shared");
    EXPECT_FALSE(Run());
    EXPECT_EQ(log.Lines(), Texts{kAfterEffectsRuns});
}

TEST_F(AdobeAEDetector, KeepsTheRegistrysOrderAndDoesNotSortByVersion) {
    HasAfterEffects("23.0");
    HasAfterEffects("100.0");
    HasAfterEffects("22.0");
    EXPECT_TRUE(Run());
    EXPECT_EQ(Versions(), (Texts{"100.0", "22.0", "23.0"}));
}

TEST_F(AdobeAEDetector, KnowsWhereOlderVersionsAreThatDoNotSay) {
    const std::vector<std::pair<std::string, std::string>> folders{
        {"13", "Adobe After Effects CC 2014"},     {"13.5", "Adobe After Effects CC 2015"},
        {"13.8", "Adobe After Effects CC 2015.3"}, {"14", "Adobe After Effects CC 2017"},
        {"15", "Adobe After Effects CC 2018"},     {"16", "Adobe After Effects CC 2019"},
        {"17", "Adobe After Effects 2020"},
    };
    for (const auto& [version, name] : folders) {
        HasAfterEffectsWithoutFolder(version);
    }
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), folders.size());
    std::size_t checked = 0;
    for (const auto& [version, name] : folders) {
        const HV::HostRecord& host = hosts[checked++];
        EXPECT_EQ(host.hostVersion, version);
        EXPECT_EQ(host.hostDisplayName, name);
        EXPECT_EQ(host.hostAppPath, "C:\\Program Files\\Adobe\\" + name + "\\Support Files\\AfterFX.exe");
        EXPECT_EQ(host.hostScriptsPath, "C:\\Program Files\\Adobe\\" + name + "\\Support Files\\Scripts");
    }
    EXPECT_EQ(checked, 7U);
}

TEST_F(AdobeAEDetector, HasNoUseForTheKnownPlacesOfVersionsThatAreTooOld) {
    HasAfterEffectsWithoutFolder("11.0");
    HasAfterEffectsWithoutFolder("12");
    EXPECT_FALSE(Run());
    EXPECT_EQ(log.Lines(), Texts{kAfterEffectsRuns});
}

TEST_F(AdobeAEDetector, ComparesKnownVersionsAsWholeTexts) {
    int checked = 0;
    for (const char* version : {"13.0", "13.50", "14.0", "17.0", "18"}) {
        HasAfterEffectsWithoutFolder(version);
        log.Clear();
        EXPECT_FALSE(Run());
        EXPECT_TRUE(log.Has(NoAppPath(version))) << version << "\n" << log.Text();
        ++checked;
    }
    EXPECT_EQ(checked, 5);
}

TEST_F(AdobeAEDetector, SkipsAVersionWithoutAKnownFolderAndGoesOn) {
    HasAfterEffectsWithoutFolder("18");
    HasAfterEffects("22.0");
    EXPECT_TRUE(Run());
    EXPECT_EQ(Versions(), Texts{"22.0"});
    EXPECT_EQ(log.Lines(), (Texts{kAfterEffectsRuns, NoAppPath("18")}));
}

TEST_F(AdobeAEDetector, TakesAnEmptyFolderForTheAnswer) {
    HasAfterEffectsWithoutFolder("13.5");
    HasKey(KeyOf("13.5"), {{"InstallPath", ""}});
    EXPECT_FALSE(Run());
    EXPECT_EQ(log.Lines(), (Texts{kAfterEffectsRuns, NoAppPath("13.5")}));
}

TEST_F(AdobeAEDetector, TakesAFolderOfATypeThatIsNoTextForAnEmptyAnswer) {
    HasAfterEffectsWithoutFolder("13.5");
    HasValue(KeyOf("13.5"), "InstallPath", "hex(b):01,02,03,04,05,06,07,08");
    EXPECT_FALSE(Run());
    EXPECT_EQ(log.Lines(), (Texts{kAfterEffectsRuns, NoAppPath("13.5")}));
}

TEST_F(AdobeAEDetector, TakesAFolderThatIsTooLongToReadForNoAnswer) {
    HasAfterEffectsWithoutFolder("13.5");
    HasKey(KeyOf("13.5"), {{"InstallPath", std::string(70000, 'x')}});
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    EXPECT_EQ(hosts.front().hostDisplayName, "Adobe After Effects CC 2015");
}

TEST_F(AdobeAEDetector, SkipsAVersionWithoutEitherPluginFolder) {
    HasAfterEffects("22.0");
    HasKey(KeyOf("22.1"), {{"InstallPath", R"(C:\AE\)"}, {"CommonPluginInstallPath", kMediaCore}});
    HasKey(KeyOf("22.2"), {{"InstallPath", R"(C:\AE\)"}, {"PluginInstallPath", R"(C:\Plug-ins\)"}});
    HasKey(KeyOf("22.3"), {{"InstallPath", R"(C:\AE\)"}});
    EXPECT_TRUE(Run());
    EXPECT_EQ(Versions(), Texts{"22.0"});
    EXPECT_EQ(log.Lines(),
              (Texts{kAfterEffectsRuns, NoPluginPath("22.1"), NoPluginPath("22.2"), NoPluginPath("22.3")}));
}

TEST_F(AdobeAEDetector, SkipsAVersionWhosePluginFolderIsEmpty) {
    HasAfterEffects("22.0");
    HasKey(KeyOf("22.0"), {{"PluginInstallPath", ""}});
    HasAfterEffects("23.0");
    HasKey(KeyOf("23.0"), {{"CommonPluginInstallPath", ""}});
    EXPECT_FALSE(Run());
    EXPECT_EQ(log.Lines(), (Texts{kAfterEffectsRuns, NoPluginPath("22.0"), NoPluginPath("23.0")}));
}

TEST_F(AdobeAEDetector, TellsOfTheMissingApplicationBeforeTheMissingPluginFolders) {
    HasKey(KeyOf("22.0"));
    EXPECT_FALSE(Run());
    EXPECT_EQ(log.Lines(), (Texts{kAfterEffectsRuns, NoAppPath("22.0")}));
}

TEST_F(AdobeAEDetector, CountsAVersionWithoutPresets) {
    HasKey(KeyOf("22.0"), {{"InstallPath", R"(C:\Adobe After Effects\Support Files\)"},
                           {"PluginInstallPath", R"(C:\Plug-ins\)"},
                           {"CommonPluginInstallPath", kMediaCore}});
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    EXPECT_EQ(hosts.front().hostPresetsPath, "");
}

TEST_F(AdobeAEDetector, PutsNoSeparatorAfterAFolderThatComesWithoutOne) {
    HasKey(KeyOf("22.0"), {{"InstallPath", R"(C:\Adobe\After Effects)"},
                           {"PluginInstallPath", R"(C:\Plug-ins\)"},
                           {"CommonPluginInstallPath", kMediaCore}});
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    EXPECT_EQ(hosts.front().hostAppPath, R"(C:\Adobe\After EffectsAfterFX.exe)");
    EXPECT_EQ(hosts.front().hostScriptsPath, R"(C:\Adobe\After EffectsScripts)");
    EXPECT_EQ(hosts.front().hostDisplayName, "Adobe");
}

class AdobePremiereDetector : public DetectorTest<HV::AdobePremiereDetector_Win> {
protected:
    static std::string KeyOf(const std::string& version) { return "Adobe\\Premiere Pro\\" + version; }

    void HasPremiere(const std::string& version) {
        HasKey(KeyOf(version),
               {{"InstallPath", R"(C:\not\asked\for\)"},
                {"PluginInstallPath", R"(C:\Program Files\Adobe\Adobe Premiere Pro 2022\Plug-ins\Common\)"},
                {"CommonPluginInstallPath", kMediaCore},
                {"FFXInstallPath", R"(C:\not\asked\for\)"}});
    }

    static std::string NoPluginPath(const std::string& version) {
        return "WARN hvdeploy-detail: could not read plugin or mediacore path for Premiere version " + version +
               ", skipping it.";
    }
};

TEST_F(AdobePremiereDetector, FindsNothingOnACleanMachine) {
    EXPECT_FALSE(Run());
    EXPECT_TRUE(hosts.empty());
    EXPECT_EQ(log.Lines(), Texts{});
}

TEST_F(AdobePremiereDetector, FillsTheRecordFromThePluginFolders) {
    HasPremiere("22.0");
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    const HV::HostRecord& host = hosts.front();
    EXPECT_EQ(host.hostType, HV::HostType::Premiere);
    EXPECT_EQ(host.hostAbbreviation, "premiere");
    EXPECT_EQ(host.hostDisplayName, "Adobe Premiere Pro 2022");
    EXPECT_EQ(host.hostVersion, "22.0");
    EXPECT_EQ(host.hostAppPath, R"(C:\Program Files\Adobe\Adobe Premiere Pro 2022\Adobe Premiere Pro.exe)");
    EXPECT_EQ(host.hostPluginPath, R"(C:\Program Files\Adobe\Adobe Premiere Pro 2022\Plug-ins\Common\)");
    EXPECT_EQ(host.hostSharedPath, kMediaCore);
    EXPECT_EQ(host.hostPresetsPath, "");
    EXPECT_EQ(host.hostScriptsPath, "");
    EXPECT_EQ(host.hostDocsPath, "");
    EXPECT_EQ(host.hostData, "");
    EXPECT_EQ(log.Lines(), Texts{});
}

TEST_F(AdobePremiereDetector, BeginsAtEightAndPassesOlderVersionsOverInSilence) {
    int added = 0;
    for (const char* version : {"7.0", "7.9.9", "8", "8.0", "8.2", "CurrentVersion"}) {
        HasPremiere(version);
        ++added;
    }
    EXPECT_EQ(added, 6);
    EXPECT_TRUE(Run());
    EXPECT_EQ(Versions(), (Texts{"8", "8.0", "8.2"}));
    EXPECT_EQ(log.Lines(), Texts{});
}

TEST_F(AdobePremiereDetector, KeepsTheRegistrysOrderAndDoesNotSortByVersion) {
    HasPremiere("9.0");
    HasPremiere("22.0");
    EXPECT_TRUE(Run());
    EXPECT_EQ(Versions(), (Texts{"22.0", "9.0"}));
}

TEST_F(AdobePremiereDetector, SkipsAVersionWithoutEitherPluginFolder) {
    HasPremiere("22.0");
    HasKey(KeyOf("22.1"), {{"CommonPluginInstallPath", kMediaCore}});
    HasKey(KeyOf("22.2"), {{"PluginInstallPath", R"(C:\Premiere\Plug-ins\Common\)"}});
    EXPECT_TRUE(Run());
    EXPECT_EQ(Versions(), Texts{"22.0"});
    EXPECT_EQ(log.Lines(), (Texts{NoPluginPath("22.1"), NoPluginPath("22.2")}));
}

TEST_F(AdobePremiereDetector, SkipsAVersionWhoseSharedFolderIsEmpty) {
    HasPremiere("22.0");
    HasKey(KeyOf("22.0"), {{"CommonPluginInstallPath", ""}});
    EXPECT_FALSE(Run());
    EXPECT_TRUE(hosts.empty());
    EXPECT_EQ(log.Lines(), Texts{NoPluginPath("22.0")});
}

TEST_F(AdobePremiereDetector, LooksTwoLevelsUpFromAPluginFolderThatEndsWithoutASeparator) {
    HasKey(KeyOf("22.0"),
           {{"PluginInstallPath", R"(C:\Premiere\Plug-ins\Common)"}, {"CommonPluginInstallPath", kMediaCore}});
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    EXPECT_EQ(hosts.front().hostDisplayName, "Premiere");
    EXPECT_EQ(hosts.front().hostAppPath, R"(C:\Premiere\Adobe Premiere Pro.exe)");
}

}  // namespace
