#include "hosts/OtherDetectors.h"

#include <gtest/gtest.h>

#include <stdexcept>
#include <string>
#include <vector>

#include "tests/hosts/DetectorTest.h"
#include "tests/hosts/TestExecutables.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/UnreadableFile.h"

namespace {

using Texts = std::vector<std::string>;

constexpr const char* kOfxFolder = R"(C:\Program Files\Common Files\OFX\Plugins)";

class EdiusDetector : public DetectorTest<HV::EdiusDetector_Win> {
protected:
    static std::string KeyOf(const std::string& name) {
        return "Grass Valley\\EDIUS\\" + name + "\\Installation\\EDIUS";
    }

    void HasEdius(const std::string& name, const std::string& version) {
        HasKey(KeyOf(name), {{"DestDir", R"(C:\Program Files\Grass Valley\EDIUS 9\)"},
                             {"ConsistentVersion", version},
                             {"PlugInDir", R"(C:\Program Files\Grass Valley\EDIUS 9\PlugIn\)"}});
    }

    /// Runs the detector and gives its standard output with every hexadecimal number written as "#".
    std::string OutputOfRun(bool expected) {
        CapturedStreams streams;
        EXPECT_EQ(Run(), expected);
        std::string output = streams.Output();
        for (std::size_t at = 0; (at = output.find("0x", at)) != std::string::npos; ++at) {
            const std::size_t end = output.find_first_not_of("0123456789abcdef", at + 2);
            EXPECT_NE(end, at + 2) << "no digits in: " << output;
            output.replace(at, end - at, "#");
        }
        return output;
    }
};

TEST_F(EdiusDetector, FindsAndSaysNothingOnACleanMachine) {
    EXPECT_EQ(OutputOfRun(false), "");
    EXPECT_TRUE(hosts.empty());
}

TEST_F(EdiusDetector, FillsTheRecordFromTheInstallation) {
    HasEdius("9.0", "9.55");
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    const HV::HostRecord& host = hosts.front();
    EXPECT_EQ(host.hostType, HV::HostType::Edius);
    EXPECT_EQ(host.hostAbbreviation, "edius");
    EXPECT_EQ(host.hostDisplayName, "EDIUS 9");
    EXPECT_EQ(host.hostVersion, "9.55");
    EXPECT_EQ(host.hostAppPath, R"(C:\Program Files\Grass Valley\EDIUS 9\EDIUS.exe)");
    EXPECT_EQ(host.hostPluginPath, R"(C:\Program Files\Grass Valley\EDIUS 9\PlugIn\)");
    EXPECT_EQ(host.hostSharedPath, kOfxFolder);
    EXPECT_EQ(host.hostPresetsPath, "");
    EXPECT_EQ(host.hostScriptsPath, "");
    EXPECT_EQ(host.hostDocsPath, "");
    EXPECT_EQ(host.hostData, "");
    EXPECT_EQ(log.Lines(), Texts{});
}

TEST_F(EdiusDetector, SaysWithWhichHandlesItWorks) {
    HasEdius("8.0", "8.5");
    HasEdius("9.0", "9.55");
    EXPECT_EQ(OutputOfRun(true),
              "DEBUG ediusReg hkey: #\n"
              "DEBUG ediusInstance hkey: #\n"
              "DEBUG ediusInstance hkey: #\n");
    EXPECT_EQ(Versions(), (Texts{"8.5", "9.55"}));
}

TEST_F(EdiusDetector, SaysOneLineAndFindsNothingWithoutAnInstallation) {
    HasKey("Grass Valley\\EDIUS");
    EXPECT_EQ(OutputOfRun(false), "DEBUG ediusReg hkey: #\n");
    EXPECT_TRUE(hosts.empty());
}

TEST_F(EdiusDetector, PassesOverASubkeyThatIsNoInstallation) {
    HasKey("Grass Valley\\EDIUS\\Common\\Installation");
    HasEdius("9.0", "9.55");
    EXPECT_EQ(OutputOfRun(true), "DEBUG ediusReg hkey: #\nDEBUG ediusInstance hkey: #\n");
    EXPECT_EQ(Versions(), Texts{"9.55"});
}

TEST_F(EdiusDetector, PassesOverAnInstallationWithoutAFolder) {
    HasKey(KeyOf("8.0"), {{"ConsistentVersion", "8.5"}});
    HasKey(KeyOf("8.1"), {{"ConsistentVersion", "8.6"}, {"DestDir", ""}});
    EXPECT_EQ(OutputOfRun(false), "DEBUG ediusReg hkey: #\nDEBUG ediusInstance hkey: #\nDEBUG ediusInstance hkey: #\n");
    EXPECT_TRUE(hosts.empty());
}

TEST_F(EdiusDetector, CountsAnInstallationThatNamesNothingButItsFolder) {
    HasKey(KeyOf("9.0"), {{"DestDir", R"(C:\EDIUS)"}});
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    EXPECT_EQ(hosts.front().hostVersion, "");
    EXPECT_EQ(hosts.front().hostPluginPath, "");
    EXPECT_EQ(hosts.front().hostAppPath, R"(C:\EDIUSEDIUS.exe)");
}

class HitFilmDetector : public DetectorTest<HV::HitFilmDetector_Win> {
protected:
    void HasHitFilm(const std::string& product) {
        HasKey("FXHOME\\" + product + "\\Paths", {{"Application", R"(C:\Program Files\FXHOME\)" + product + "\\"},
                                                  {"PluginPresets", R"(C:\ProgramData\FXHOME\Presets\)"}});
    }
    void HasExecutable(const std::string& product, const std::string& testExecutable) {
        machine.Has(R"(C:\Program Files\FXHOME\)" + product + R"(\HitFilmPro.exe)",
                    TestExecutableBytes(testExecutable));
    }
};

TEST_F(HitFilmDetector, FindsNothingOnACleanMachine) {
    EXPECT_FALSE(Run());
    EXPECT_TRUE(hosts.empty());
}

TEST_F(HitFilmDetector, FindsNothingInAKeyWithoutProducts) {
    HasKey("FXHOME");
    EXPECT_FALSE(Run());
    EXPECT_TRUE(hosts.empty());
}

TEST_F(HitFilmDetector, FillsTheRecordFromThePathsAndTheExecutable) {
    HasHitFilm("HitFilm Pro");
    HasExecutable("HitFilm Pro", "both-versions");
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    const HV::HostRecord& host = hosts.front();
    EXPECT_EQ(host.hostType, HV::HostType::HitFilm);
    EXPECT_EQ(host.hostAbbreviation, "hitfilm");
    EXPECT_EQ(host.hostDisplayName, "HitFilm Pro");
    EXPECT_EQ(host.hostVersion, "13.0.5");
    EXPECT_EQ(host.hostAppPath, R"(C:\Program Files\FXHOME\HitFilm Pro\HitFilmPro.exe)");
    EXPECT_EQ(host.hostPluginPath, kOfxFolder);
    EXPECT_EQ(host.hostSharedPath, kOfxFolder);
    EXPECT_EQ(host.hostPresetsPath, R"(C:\ProgramData\FXHOME\Presets\)");
    EXPECT_EQ(host.hostScriptsPath, "");
    EXPECT_EQ(host.hostDocsPath, "");
    EXPECT_EQ(host.hostData, "");
    EXPECT_EQ(log.Lines(), Texts{});
}

TEST_F(HitFilmDetector, TakesTheFileVersionOfAnExecutableWithoutAProductVersion) {
    HasHitFilm("HitFilm Pro");
    HasExecutable("HitFilm Pro", "file-version");
    EXPECT_TRUE(Run());
    EXPECT_EQ(Versions(), Texts{"12.1.0"});
}

TEST_F(HitFilmDetector, CountsAnExecutableWithoutAVersion) {
    HasHitFilm("HitFilm Pro");
    HasExecutable("HitFilm Pro", "no-version");
    EXPECT_TRUE(Run());
    EXPECT_EQ(Versions(), Texts{""});
}

TEST_F(HitFilmDetector, CountsAProductWhoseExecutableIsMissing) {
    HasHitFilm("HitFilm Pro");
    EXPECT_TRUE(Run());
    EXPECT_EQ(Versions(), Texts{""});
}

TEST_F(HitFilmDetector, TakesOnlyProductsWhoseNamesBeginWithHitFilm) {
    HasHitFilm("HitFilm Pro");
    HasHitFilm("Imerge Pro");
    HasHitFilm("hitfilm 4");
    HasHitFilm("The HitFilm");
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    EXPECT_EQ(hosts.front().hostDisplayName, "HitFilm Pro");
}

TEST_F(HitFilmDetector, HasNoHostInANameOfLowerCase) {
    HasHitFilm("hitfilm 4");
    EXPECT_FALSE(Run());
    EXPECT_TRUE(hosts.empty());
}

TEST_F(HitFilmDetector, MakesARecordOfEachProductInTheRegistrysOrder) {
    HasHitFilm("HitFilm Pro 2");
    HasHitFilm("HitFilm Express");
    HasHitFilm("HitFilm");
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 3U);
    EXPECT_EQ(hosts[0].hostDisplayName, "HitFilm");
    EXPECT_EQ(hosts[1].hostDisplayName, "HitFilm Express");
    EXPECT_EQ(hosts[2].hostDisplayName, "HitFilm Pro 2");
}

TEST_F(HitFilmDetector, PassesOverAProductWithoutPaths) {
    HasKey("FXHOME\\HitFilm Pro");
    HasHitFilm("HitFilm Express");
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    EXPECT_EQ(hosts.front().hostDisplayName, "HitFilm Express");
}

TEST_F(HitFilmDetector, CountsAProductThatDoesNotSayWhereItIs) {
    HasKey("FXHOME\\HitFilm Pro\\Paths");
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    EXPECT_EQ(hosts.front().hostDisplayName, "");
    EXPECT_EQ(hosts.front().hostAppPath, "HitFilmPro.exe");
    EXPECT_EQ(hosts.front().hostVersion, "");
    EXPECT_EQ(hosts.front().hostPresetsPath, "");
    EXPECT_EQ(hosts.front().hostPluginPath, kOfxFolder);
}

TEST_F(HitFilmDetector, PutsNoSeparatorAfterAFolderThatComesWithoutOne) {
    HasKey("FXHOME\\HitFilm Pro\\Paths", {{"Application", R"(C:\FXHOME\HitFilm Pro)"}});
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    EXPECT_EQ(hosts.front().hostAppPath, R"(C:\FXHOME\HitFilm ProHitFilmPro.exe)");
    EXPECT_EQ(hosts.front().hostDisplayName, "HitFilm Pro");
}

class MediaComposerDetector : public DetectorTest<HV::MediaComposerDetector_Win> {};

TEST_F(MediaComposerDetector, FindsNothingOnACleanMachine) {
    EXPECT_FALSE(Run());
    EXPECT_TRUE(hosts.empty());
}

TEST_F(MediaComposerDetector, FillsTheRecordFromBothKeys) {
    HasKey("Avid Technology\\Avid Media Composer",
           {{"InstallDir", R"(C:\Program Files\Avid\Avid Media Composer)"},
            {"InstallFile", R"(C:\Program Files\Avid\Avid Media Composer\AvidMediaComposer.exe)"},
            {"Version", "22.7.0"}});
    HasKey("Avid Technology\\AVX Plug-ins", {{"AVX2Directory", R"(C:\Program Files\Avid\AVX2_Plug-ins)"}});
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    const HV::HostRecord& host = hosts.front();
    EXPECT_EQ(host.hostType, HV::HostType::MediaComposer);
    EXPECT_EQ(host.hostAbbreviation, "mediacomposer");
    EXPECT_EQ(host.hostDisplayName, "Avid Media Composer");
    EXPECT_EQ(host.hostVersion, "22.7.0");
    EXPECT_EQ(host.hostAppPath, R"(C:\Program Files\Avid\Avid Media Composer\AvidMediaComposer.exe)");
    EXPECT_EQ(host.hostPluginPath, R"(C:\Program Files\Avid\AVX2_Plug-ins)");
    EXPECT_EQ(host.hostSharedPath, "");
    EXPECT_EQ(host.hostPresetsPath, "");
    EXPECT_EQ(host.hostScriptsPath, "");
    EXPECT_EQ(host.hostDocsPath, "");
    EXPECT_EQ(host.hostData, "");
    EXPECT_EQ(log.Lines(), Texts{});
}

TEST_F(MediaComposerDetector, FindsNothingWithoutTheKeyOfThePlugins) {
    HasKey("Avid Technology\\Avid Media Composer", {{"Version", "22.7.0"}});
    EXPECT_FALSE(Run());
    EXPECT_TRUE(hosts.empty());
}

TEST_F(MediaComposerDetector, FindsNothingWithoutTheKeyOfTheApplication) {
    HasKey("Avid Technology\\AVX Plug-ins", {{"AVX2Directory", R"(C:\AVX2_Plug-ins)"}});
    EXPECT_FALSE(Run());
    EXPECT_TRUE(hosts.empty());
}

TEST_F(MediaComposerDetector, CountsKeysThatHoldNothing) {
    HasKey("Avid Technology\\Avid Media Composer");
    HasKey("Avid Technology\\AVX Plug-ins");
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    EXPECT_EQ(hosts.front().ToText(), "{\n  \"hostAbbreviation\": \"mediacomposer\"\n}");
}

class ResolveDetector : public DetectorTest<HV::ResolveDetector_Win> {};

TEST_F(ResolveDetector, FindsNothingOnACleanMachine) {
    EXPECT_FALSE(Run());
    EXPECT_TRUE(hosts.empty());
}

TEST_F(ResolveDetector, TakesThePlaceForGrantedAndReadsTheVersion) {
    HasKey("Blackmagic Design\\DaVinci Resolve", {{"Version", "17.4.6"}, {"InstallPath", R"(D:\elsewhere)"}});
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    const HV::HostRecord& host = hosts.front();
    EXPECT_EQ(host.hostType, HV::HostType::Resolve);
    EXPECT_EQ(host.hostAbbreviation, "resolve");
    EXPECT_EQ(host.hostDisplayName, "DaVinci Resolve");
    EXPECT_EQ(host.hostVersion, "17.4.6");
    EXPECT_EQ(host.hostAppPath, R"(C:\Program Files\Blackmagic Design\DaVinci Resolve\Resolve.exe)");
    EXPECT_EQ(host.hostPluginPath, "");
    EXPECT_EQ(host.hostSharedPath, kOfxFolder);
    EXPECT_EQ(host.hostPresetsPath, "");
    EXPECT_EQ(host.hostScriptsPath, "");
    EXPECT_EQ(host.hostDocsPath, "");
    EXPECT_EQ(host.hostData, "");
    EXPECT_EQ(log.Lines(), Texts{});
}

TEST_F(ResolveDetector, CountsAKeyWithoutAVersion) {
    HasKey("Blackmagic Design\\DaVinci Resolve");
    EXPECT_TRUE(Run());
    EXPECT_EQ(Versions(), Texts{""});
}

class VegasDetector : public DetectorTest<HV::VegasDetector_Win> {
protected:
    static std::string FolderOf(const std::string& version) { return R"(C:\Program Files\VEGAS\VEGAS Pro )" + version; }

    void HasVegas(const std::string& version) {
        HasKey("Sony Creative Software\\Vegas Pro\\" + version, {{"InstallPath", FolderOf(version) + "\\"}});
    }
};

TEST_F(VegasDetector, FindsNothingOnACleanMachine) {
    EXPECT_FALSE(Run());
    EXPECT_TRUE(hosts.empty());
}

TEST_F(VegasDetector, FindsNothingInAKeyWithoutVersions) {
    HasKey("Sony Creative Software\\Vegas Pro");
    EXPECT_FALSE(Run());
    EXPECT_TRUE(hosts.empty());
}

TEST_F(VegasDetector, FillsTheRecordFromTheRegistryAndTheFolder) {
    HasVegas("14.0");
    HasKey("Sony Creative Software\\Shared Information",
           {{"SharedComponentsFolder", R"(C:\not\asked\for)"}, {"HelpFolder", R"(C:\Program Files\VEGAS\Help\)"}});
    machine.Has(FolderOf("14.0") + R"(\vegas140.exe)", "the program");
    machine.Has(FolderOf("14.0") + R"(\readme.txt)", "read me");
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    const HV::HostRecord& host = hosts.front();
    EXPECT_EQ(host.hostType, HV::HostType::Vegas);
    EXPECT_EQ(host.hostAbbreviation, "vegas");
    EXPECT_EQ(host.hostDisplayName, "");
    EXPECT_EQ(host.hostVersion, "14.0");
    EXPECT_EQ(host.hostAppPath, FolderOf("14.0") + R"(\vegas140.exe)");
    EXPECT_EQ(host.hostPluginPath, kOfxFolder);
    EXPECT_EQ(host.hostSharedPath, kOfxFolder);
    EXPECT_EQ(host.hostPresetsPath, "");
    EXPECT_EQ(host.hostScriptsPath, "");
    EXPECT_EQ(host.hostDocsPath, R"(C:\Program Files\VEGAS\Help\)");
    EXPECT_EQ(host.hostData, "");
    EXPECT_EQ(log.Lines(), Texts{});
}

TEST_F(VegasDetector, CountsWithoutTheSharedInformation) {
    HasVegas("14.0");
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    EXPECT_EQ(hosts.front().hostDocsPath, "");
}

TEST_F(VegasDetector, GivesEveryVersionTheSamePluginFolder) {
    HasVegas("13.0");
    HasVegas("14.0");
    EXPECT_TRUE(Run());
    EXPECT_EQ(Versions(), (Texts{"13.0", "14.0"}));
    ASSERT_EQ(hosts.size(), 2U);
    EXPECT_EQ(hosts[0].hostPluginPath, kOfxFolder);
    EXPECT_EQ(hosts[1].hostPluginPath, kOfxFolder);
}

TEST_F(VegasDetector, PassesOverAVersionWithoutAFolder) {
    HasKey("Sony Creative Software\\Vegas Pro\\12.0");
    HasKey("Sony Creative Software\\Vegas Pro\\13.0", {{"InstallPath", ""}});
    HasVegas("14.0");
    EXPECT_TRUE(Run());
    EXPECT_EQ(Versions(), Texts{"14.0"});
}

TEST_F(VegasDetector, CountsAVersionWhoseFolderDoesNotExist) {
    HasVegas("14.0");
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    EXPECT_EQ(hosts.front().hostAppPath, "");
}

// Its plug-ins go to the OFX folder, so it needs no executable to count; the versions after it are found as well.
TEST_F(VegasDetector, CountsAVersionWhoseFolderCannotBeListedAndSaysSo) {
    HasVegas("13.0");
    HasVegas("14.0");
    machine.Has(FolderOf("13.0") + R"(\vegas130.exe)", "the program");
    machine.Has(FolderOf("14.0") + R"(\vegas140.exe)", "the program");
    const UnreadableFile unreadable(machine, FolderOf("13.0"));
    EXPECT_TRUE(Run());
    ASSERT_EQ(Versions(), (Texts{"13.0", "14.0"}));
    EXPECT_EQ(hosts[0].hostAppPath, "");
    EXPECT_EQ(hosts[0].hostPluginPath, kOfxFolder);
    EXPECT_EQ(hosts[1].hostAppPath, FolderOf("14.0") + R"(\vegas140.exe)");
    const Texts warnings = log.LinesStartingWith("WARN hvdeploy-detail: could not list the folder of Vegas 13.0: ");
    ASSERT_EQ(warnings.size(), 1U) << log.Text();
    EXPECT_NE(warnings[0].find("VEGAS Pro 13.0"), std::string::npos) << warnings[0];
    EXPECT_EQ(log.Lines(), warnings);
}

TEST_F(VegasDetector, TakesNoOtherFileForTheExecutable) {
    HasVegas("14.0");
    const std::string folder = FolderOf("14.0");
    machine.Has(folder + R"(\Vegas140.exe)", "in another case");
    machine.Has(folder + R"(\vegas140.exe.config)", "a longer name");
    machine.Has(folder + R"(\my vegas140.exe)", "a name that begins otherwise");
    machine.Has(folder + R"(\inside\vegas140.exe)", "in a folder below");
    machine.HasFolder(folder + R"(\vegas folder.exe)");
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    EXPECT_EQ(hosts.front().hostAppPath, "");
}

TEST_F(VegasDetector, TakesOneOfSeveralExecutables) {
    HasVegas("14.0");
    machine.Has(FolderOf("14.0") + R"(\vegas140.exe)", "the program");
    machine.Has(FolderOf("14.0") + R"(\vegas140k.exe)", "another");
    EXPECT_TRUE(Run());
    ASSERT_EQ(hosts.size(), 1U);
    const std::string found = hosts.front().hostAppPath;
    EXPECT_TRUE(found == FolderOf("14.0") + R"(\vegas140.exe)" || found == FolderOf("14.0") + R"(\vegas140k.exe)")
        << found;
}

TEST(VegasExecutable, IsTheFirstMatch) {
    EXPECT_EQ(HV::VegasDetector_Win::FirstMatch(true, {"b.exe", "a.exe"}), "b.exe");
}

TEST(VegasExecutable, IsEmptyWithoutAMatch) {
    EXPECT_EQ(HV::VegasDetector_Win::FirstMatch(false, {}), "");
}

TEST(VegasExecutable, CannotBeAMatchWithoutAFile) {
    try {
        static_cast<void>(HV::VegasDetector_Win::FirstMatch(true, {}));
        FAIL() << "nothing was thrown";
    } catch (const std::logic_error& error) {
        EXPECT_STREQ(error.what(),
                     "Unexpected error, MatchFilesInDirectory() returned true but result vector is empty.");
    }
}

}  // namespace
