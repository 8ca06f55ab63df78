// The script run by the command processor that it is written for, which is there on Windows alone.
#include "platform/win32.h"
#include "tests/hvdeploy/SideActionsTest.h"
#include "tests/hvdeploy/UninstallTest.h"
#include "tests/support/CapturedStreams.h"

namespace {

constexpr const char* kFolder = R"(C:\Packages)";
constexpr const char* kEntry = R"(\Uninstall\Tessaly Suite v3.1])";

/// A suite of two packages in a folder that others use too, with a shortcut.
class UninstallRunTest : public SideActionsTest {
protected:
    UninstallRunTest() {
        machine.Has(R"(C:\Program Files\Common Files\OFX\Plugins\Other.ofx)", "of another maker");
        machine.Has(R"(C:\ProgramData\Halvorn\settings.txt)", "the user's own");
        before = machine.FilesWithoutFolders();
        registryBefore = machine.Registry();
        machine.Has(R"(C:\Packages\suite.json)", kTessalyFile);
        (void)PackageBuilder("com.halvorn.glow")
            .Policy("uninstall", "true")
            .Payload("resource")
            .To("ofx")
            .File("Glow.ofx", "plug-in")
            .Payload("resource")
            .To("programdata", "Halvorn")
            .File("R&D notes.txt", "text")
            .WriteTo(kFolder);
        (void)PackageBuilder("com.halvorn.tool")
            .Payload("app")
            .Subpath("Halvorn")
            .File("Tool.exe", "program")
            .Shortcut("Tool.exe", "", "startmenu", "Halvorn")
            .WriteTo(kFolder);
        EXPECT_FALSE(HV::IsFailure(engine.DeployPackagesFromDirectory(fs::path(kFolder), {}))) << log.Text();
    }

    /// What the script prints on standard output. The header's SET lines complain on the other stream where the command
    /// processor takes a bare carriage return for the end of a line, as Wine's does, and the script goes on.
    std::string Run() {
        const CapturedStreams streams;
        FILE* const stream = _popen(("\"" + std::string(kScriptPath) + "\"").c_str(), "r");
        std::string output;
        char piece[128];
        while (std::fgets(piece, sizeof piece, stream) != nullptr) {
            output += piece;
        }
        _pclose(stream);
        return output;
    }

    /// What is left, without the packages and without the script, which does not delete itself.
    std::map<std::string, std::string> Left() const {
        std::map<std::string, std::string> files = machine.FilesWithoutFolders();
        std::erase_if(files, [](const auto& file) { return file.first.starts_with(R"(C:\Packages\)"); });
        EXPECT_EQ(files.erase(kScriptPath), 1U);
        return files;
    }

    std::map<std::string, std::string> before;
    std::string registryBefore;
};

}  // namespace

TEST_F(UninstallRunTest, RemovesWhatWasInstalledAndNothingElse) {
    EXPECT_EQ(Left().size(), before.size() + 4);
    const std::string output = Run();
    EXPECT_EQ(Left(), before) << output;
}

TEST_F(UninstallRunTest, RemovesTheEntryFromTheListOfInstalledPrograms) {
    EXPECT_NE(machine.Registry().find(kEntry), std::string::npos);
    (void)Run();
    EXPECT_EQ(machine.Registry(), registryBefore);
}

TEST_F(UninstallRunTest, TellsWhatItRemoves) {
    const std::string output = Run();
    for (const std::string name :
         {"Tessaly Suite v3.1", "com.halvorn.glow.hvpkg v1.0", "com.halvorn.tool.hvpkg v1.0"}) {
        EXPECT_NE(output.find("Uninstalling " + name), std::string::npos) << output;
    }
}

TEST_F(UninstallRunTest, DoesNoHarmASecondTime) {
    (void)Run();
    (void)Run();
    EXPECT_EQ(Left(), before);
}
