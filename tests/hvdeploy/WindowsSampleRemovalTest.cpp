// The sample release removed again, by its own script in the command processor that it is written for. That one is
// there on Windows alone; what can be asked without it stands in SampleReleaseTest.cpp, for both targets.
//
// What Wine's interpreter makes of the header, whose lines end in bare carriage returns: `@echo off` is obeyed. Each
// bare return ends a command and takes the next character with it, so every SET loses its S and is no command. Three
// lines come on standard error, and no others:
//   Can't recognize 'ET SCRIPT_NAMEC:\ProgramData\Halvorn\uninstall\uninstall-com.halvorn.tessaly-suite_v4.2.0.bat'
//   Can't recognize 'ET SCRIPT_DIR=C:\ProgramData\Halvorn\uninstall\'
//   Can't recognize 'ET SCRIPT_PATH='
// each with "as an internal or external command, or batch script." after it: %0 and %~dp0 are expanded, and the two
// variables of the last line are not set. The last return takes the one of the line end after it. The rest is run as
// it stands, since nothing in it asks for those variables. `reg` says on standard output that it cannot find the key
// for every package but the first, and the last of those is the exit status, 1. These are facts about that interpreter
// and not asked of any other; the tests ask what is left in the end.
#include <memory>

#include "platform/win32.h"
#include "tests/hvdeploy/SampleRelease.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/Target.h"

namespace {

struct Said {
    std::string output;
    std::string errors;
};

/// The sample release installed and removed once, with what stood there before, between and after.
class SampleRemovalTest : public testing::Test {
protected:
    using Files = SampleInstallation::Files;

    static void SetUpTestSuite() {
        release = std::make_unique<SampleInstallation>();
        installedRegistry = Registry();
        said = RunScripts();
    }
    static void TearDownTestSuite() { release.reset(); }

    /// Runs every script that the installation has left.
    static Said RunScripts() {
        Said all;
        CapturedStreams streams;
        for (const auto& script : release->scripts) {
            FILE* const stream = _popen(("cmd /c \"" + script.first + "\"").c_str(), "r");
            char piece[128];
            while (std::fgets(piece, sizeof piece, stream) != nullptr) {
                all.output += piece;
            }
            _pclose(stream);
        }
        all.errors = streams.Errors();
        return all;
    }

    /// What was added to the registry, key by key.
    static RegistryContent Registry() { return ContentOf(hosted::ParseRegistryText(release->machine.Registry())); }

    static void ExpectOnlyTheFilesOfOthersAndTheScript() {
        Files expected = release->before;
        expected.merge(Files(release->scripts));
        EXPECT_EQ(release->FilesBesideTheRelease(), expected) << said.output << said.errors;
    }

    inline static std::unique_ptr<SampleInstallation> release;
    inline static RegistryContent installedRegistry;
    inline static Said said;
};

}  // namespace

TEST_F(SampleRemovalTest, LeavesTheFilesOfOthersAndTheScript) {
    ASSERT_EQ(release->scripts.size(), 1U);
    ASSERT_GT(release->installed.size(), 150U);
    ExpectOnlyTheFilesOfOthersAndTheScript();
}

TEST_F(SampleRemovalTest, TakesTheEntryFromTheListOfProgramsAndNothingElseFromTheRegistry) {
    RegistryContent expected = installedRegistry;
    EXPECT_EQ(expected.erase(SampleInstallation::kEntry), 1U);
    EXPECT_EQ(Registry(), expected) << "the packages' own entries stay";
    EXPECT_EQ(expected.count(R"(HKEY_LOCAL_MACHINE\SOFTWARE\Halvorn\Tessaly)"), 1U);
}

TEST_F(SampleRemovalTest, ReachesItsLastPackage) {
    EXPECT_NE(said.output.find("Uninstalling Tessaly Suite v4.2.0"), std::string::npos) << said.output;
    std::size_t packages = 0;
    for (auto at = said.output.find(".hvpkg v"); at != std::string::npos; at = said.output.find(".hvpkg v", at + 1)) {
        ++packages;
    }
    EXPECT_EQ(packages, 14U) << said.output;
}

TEST_F(SampleRemovalTest, DoesNoHarmASecondTime) {
    const RegistryContent once = Registry();
    (void)RunScripts();
    ExpectOnlyTheFilesOfOthersAndTheScript();
    EXPECT_EQ(Registry(), once);
}
