// Packages that are broken, cut or hostile, and folders and targets that are not what they should be. The shipped
// program meets them, as a user starts it.
#include "tests/hvdeploy/engine/EngineTest.h"
#include "tests/support/RunProgram.h"

namespace {

constexpr const char* kLog = R"(C:\ProgramData\Halvorn\Logs\run.log)";

class BadInputTest : public testing::Test {
protected:
    using Files = std::map<std::string, std::string>;

    BadInputTest() { machine.Has(R"(C:\ProgramData\Halvorn\glow.dll)", "old"); }

    static PackageBuilder Glow() {
        return PackageBuilder("com.halvorn.glow")
            .Payload("resource")
            .To("programdata", "Halvorn")
            .File("glow.dll", "new");
    }
    /// Installs the folder with the shipped program; gives its exit status.
    int Install() {
        before = machine.FilesWithoutFolders();
        const ProgramResult run =
            RunProgram("hvdeploy", {std::string("dir=") + kPackages, std::string("log=") + kLog, "loglevel=DEBUG"});
        EXPECT_EQ(machine.TempEntries(), std::vector<std::string>{});
        return run.exitStatus;
    }
    bool LogHas(const std::string& text) const { return machine.Content(kLog).find(text) != std::string::npos; }
    /// The run fails with this line and leaves the machine as it was.
    void FailsWith(const std::string& line) {
        EXPECT_EQ(Install(), 1);
        EXPECT_TRUE(LogHas(line)) << machine.Content(kLog);
        EXPECT_EQ(machine.FilesWithoutFolders(), before);
    }
    void FailsToExtract(const std::string& entry, ArchiveEntry lying) {
        lying.name = entry;
        (void)Glow().RawEntry(std::move(lying)).WriteTo(kPackages);
        FailsWith("Failed to extract package com.halvorn.glow.hvpkg");
        EXPECT_TRUE(LogHas(entry)) << machine.Content(kLog);
    }

    Machine machine;
    Files before;
};

}  // namespace

TEST_F(BadInputTest, InstallsWhatIsSound) {
    (void)Glow().WriteTo(kPackages);
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(machine.Content(R"(C:\ProgramData\Halvorn\glow.dll)"), "new");
}

TEST_F(BadInputTest, GarbageIsNoPackage) {
    machine.Has(R"(C:\Packages\glow.hvpkg)", std::string(5000, '\x17'));
    FailsWith("ReadZipEntries failed for glow.hvpkg");
}

TEST_F(BadInputTest, AnEmptyFileIsNoPackage) {
    machine.Has(R"(C:\Packages\glow.hvpkg)", "");
    FailsWith("ReadZipEntries failed for glow.hvpkg");
}

TEST_F(BadInputTest, NamesThatCannotBeWrittenLeaveNoTemporaryFiles) {
    std::size_t rounds = 0;
    for (const std::string name : {"Gl\xFC.dll", "a\x01.dll", "a?.dll", "\xED\xA0\x80/"}) {
        SCOPED_TRACE(name);
        FailsToExtract(name, {.bytes = ""});
        EXPECT_TRUE(LogHas("zip entry " + name + ": its name ")) << machine.Content(kLog);
        ++rounds;
    }
    EXPECT_EQ(rounds, 4U);
}

TEST_F(BadInputTest, ATruncatedArchiveFailsWhereverItIsCut) {
    const std::string whole = Glow().Bytes();
    std::size_t rounds = 0;
    for (const std::size_t kept : {whole.size() - 22, whole.size() - 60, whole.size() / 2, whole.size() / 10}) {
        SCOPED_TRACE(kept);
        machine.Has(R"(C:\Packages\glow.hvpkg)", whole.substr(0, kept));
        EXPECT_EQ(Install(), 1);
        EXPECT_EQ(machine.FilesWithoutFolders(), before);
        ++rounds;
    }
    EXPECT_EQ(rounds, 4U);
}

TEST_F(BadInputTest, AnEntryThatLiesAboutItsSizeDoesNotExtract) {
    FailsToExtract("lying.dat", {.bytes = "some bytes", .claimedSize = 9U});
}

TEST_F(BadInputTest, AnEntryThatClaimsAHugeSizeDoesNotExtract) {
    FailsToExtract("huge.dat", {.bytes = "some bytes", .claimedSize = 0xF0000000U});
}

TEST_F(BadInputTest, AnEntryWithAWrongChecksumDoesNotExtract) {
    FailsToExtract("spoilt.dat", {.bytes = "some bytes", .claimedChecksum = 1U});
}

TEST_F(BadInputTest, AnEntryOfAnUnknownMethodDoesNotExtract) {
    FailsToExtract("packed.dat", {.bytes = "some bytes", .method = 99});
}

TEST_F(BadInputTest, AnEntryThatLeavesTheDestinationDoesNotExtract) {
    std::size_t rounds = 0;
    for (const char* name : {"../escaped.dll", "a/../../escaped.dll", "..\\escaped.dll", "C:/escaped.dll",
                             "C:escaped.dll", "/escaped.dll", "\\escaped.dll"}) {
        SCOPED_TRACE(name);
        FailsToExtract(name, {.bytes = "hostile"});
        for (const auto& [path, content] : machine.FilesWithoutFolders()) {
            EXPECT_EQ(path.find("escaped"), std::string::npos) << path;
        }
        ++rounds;
    }
    EXPECT_EQ(rounds, 7U);
}

TEST_F(BadInputTest, AFolderEntryThatLeavesTheDestinationMakesNothing) {
    (void)Glow().RawEntry("../escaped/", "").WriteTo(kPackages);
    FailsWith("Failed to extract package com.halvorn.glow.hvpkg");
    EXPECT_FALSE(machine.Exists(machine.TempFolder() + "\\escaped"));
}

TEST_F(BadInputTest, AFolderThatIsMissingIsNamed) {
    EXPECT_EQ(Install(), 1);
    EXPECT_TRUE(LogHas(R"(not a directory: "C:\Packages")")) << machine.Content(kLog);
}

// The exit status is 0: the code of a run that an exception ended is searched for in its text, and the text of this one
// has what looks like a code, which reads as 0.
TEST_F(BadInputTest, ASuiteFileThatIsNoObjectEndsTheRunBeforeItBegins) {
    machine.Has(R"(C:\Packages\suite.json)", "[1, 2]");
    (void)Glow().WriteTo(kPackages);
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(machine.FilesWithoutFolders(), before);
    EXPECT_FALSE(LogHas("Deploying Preflight Packages")) << machine.Content(kLog);
    EXPECT_TRUE(LogHas("ERROR hvdeploy-detail : exception caught in HV::DeployCLI::Run()")) << machine.Content(kLog);
}

TEST_F(BadInputTest, ATargetThatCannotBeAFolderIsNamed) {
    machine.Has(R"(C:\ProgramData\Blocked)", "a file");
    (void)Glow().Payload("resource").To("programdata", R"(Blocked\Deep)").File("x.dll", "x").WriteTo(kPackages);
    FailsWith(R"(failed to create directory at C:\ProgramData\Blocked\Deep)");
}
