// A folder that cannot be read, a target that cannot be written and a disk that is full. Tests run with all rights
// under Wine, where nothing refuses them, so these claims are held to the hosted machine alone: it breaks on demand.
#include <sys/stat.h>
#include <unistd.h>

#include "hvdeploy/src/HVDeployCLI.h"
#include "tests/hvdeploy/engine/EngineTest.h"
#include "tests/support/RunProgram.h"

namespace {

constexpr uid_t kNobody = 65534;

/// Takes the right to read everything from the process, if it has it, and gives it back.
class WithoutPrivilege {
public:
    WithoutPrivilege() : original_(geteuid()) {
        if (original_ == 0) {
            EXPECT_EQ(seteuid(kNobody), 0);
        }
    }
    ~WithoutPrivilege() {
        if (original_ == 0) {
            EXPECT_EQ(seteuid(original_), 0);
        }
    }
    WithoutPrivilege(const WithoutPrivilege&) = delete;
    WithoutPrivilege& operator=(const WithoutPrivilege&) = delete;

private:
    uid_t original_;
};

class HostedBadInputTest : public testing::Test {
protected:
    HostedBadInputTest() { machine.Has(R"(C:\Program Files\Halvorn\glow.dll)", "old"); }

    void ShipsGlow() {
        (void)PackageBuilder("com.halvorn.glow")
            .Payload("resource")
            .To("programfiles", "Halvorn")
            .File("glow.dll", std::string(20000, 'n'))
            .WriteTo(kPackages);
    }
    ProgramResult InstallWithFaults(const std::string& faults) {
        before = machine.Files();
        return RunProgram("hvdeploy", {std::string("dir=") + kPackages, "loglevel=ERROR"},
                          {{"HV_MACHINE_FAULTS", faults}});
    }

    Machine machine;
    std::map<std::string, std::string> before;
};

}  // namespace

TEST_F(HostedBadInputTest, AReadOnlyTargetFailsTheRunAndKeepsItsFiles) {
    (void)PackageBuilder("com.halvorn.glow")
        .Payload("resource")
        .To("programfiles", R"(Halvorn\Glow)")
        .File("glow.dll", "new")
        .WriteTo(kPackages);
    const ProgramResult run = InstallWithFaults(R"(lock=C:\Program Files\Halvorn)");
    EXPECT_EQ(run.exitStatus, 1);
    EXPECT_NE(run.output.find(R"(failed to create directory at C:\Program Files\Halvorn\Glow)"), std::string::npos)
        << run.output;
    EXPECT_EQ(machine.Files(), before);
    EXPECT_EQ(machine.TempEntries(), std::vector<std::string>{});
}

TEST_F(HostedBadInputTest, AFullDiskFailsTheRunAndKeepsTheOldFiles) {
    ShipsGlow();
    const ProgramResult run = InstallWithFaults("space=10000");
    EXPECT_EQ(run.exitStatus, 1);
    EXPECT_NE(run.output.find("ERROR: failed to write zip entry file glow.dll"), std::string::npos) << run.output;
    EXPECT_NE(run.output.find("Failed to extract package com.halvorn.glow.hvpkg"), std::string::npos) << run.output;
    EXPECT_EQ(machine.Files(), before);
    EXPECT_EQ(machine.TempEntries(), std::vector<std::string>{});
}

TEST_F(HostedBadInputTest, APackagesFolderThatCannotBeReadFailsTheRunBeforeItChangesAnything) {
    ShipsGlow();
    const auto atFirst = machine.Files();
    const LogRecorder log;
    RecordingListener listener;
    HV::DeployCLI cli(&listener);
    ASSERT_EQ(cli.ParseLine(std::string("dir=") + kPackages), 0);
    const std::string folder = machine.HostName(kPackages);
    const std::string drive = machine.HostName("C:\\");
    ASSERT_EQ(chmod((drive + "/..").c_str(), 0755), 0);
    ASSERT_EQ(chmod(folder.c_str(), 0), 0);
    int result = 0;
    {
        const WithoutPrivilege asAnybody;
        result = cli.Run();
    }
    ASSERT_EQ(chmod(folder.c_str(), 0755), 0);
    EXPECT_EQ(result, -1);
    const auto caught = log.LinesStartingWith(ErrorLine("exception caught in HV::DeployCLI::Run(): \n"));
    ASSERT_EQ(caught.size(), 1U) << log.Text();
    EXPECT_NE(caught.front().find("Permission denied"), std::string::npos) << caught.front();
    EXPECT_EQ(listener.reports.back(), "4294967295 An error occurred during installation. error -1");
    EXPECT_EQ(machine.Files(), atFirst);
}
