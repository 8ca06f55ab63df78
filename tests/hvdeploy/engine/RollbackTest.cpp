// The way back: what was installed goes, what was there comes back.
#include "tests/hvdeploy/engine/EngineTest.h"
#include "tests/support/UnreadableFile.h"

namespace {

class RollbackTest : public testing::Test {
protected:
    RollbackTest() { log.Clear(); }
    Machine machine;
    LogRecorder log;
};

class EngineRollbackTest : public EngineTest {};

constexpr const char* kFile = R"(C:\Data\Glow.dll)";

}  // namespace

TEST_F(RollbackTest, MakesItsStashInTheTemporaryFolderAndRemovesIt) {
    {
        const HV::DeployRollback rollback;
        const std::vector<std::string> entries = machine.TempEntries();
        ASSERT_EQ(entries.size(), 1U);
        EXPECT_EQ(entries[0].rfind("hvdeploystash", 0), 0U) << entries[0];
    }
    EXPECT_EQ(machine.TempEntries(), std::vector<std::string>{});
    EXPECT_TRUE(log.Has(DebugLine("Deleting rollback stash directory.")));
}

TEST_F(RollbackTest, MovesAnItemAsideAndDeletesItInTheEnd) {
    machine.Has(kFile, "old");
    {
        HV::DeployRollback rollback;
        rollback.StashExistingFile(fs::path(kFile));
        EXPECT_FALSE(machine.Exists(kFile));
        EXPECT_TRUE(log.Has(DebugLine(R"(stashing existing file in case of rollback, from "C:\Data\Glow.dll")")));
    }
    EXPECT_FALSE(machine.Exists(kFile));
    EXPECT_EQ(machine.TempEntries(), std::vector<std::string>{});
}

TEST_F(RollbackTest, WarnsOfAnItemThatCannotBeMovedAside) {
    HV::DeployRollback rollback;
    rollback.StashExistingFile(fs::path(kFile));
    EXPECT_TRUE(log.Has(WarnLine(R"(Failed to move/copy existing item to rollback stash, from "C:\Data\Glow.dll")")))
        << log.Text();
    log.Clear();
    rollback.Rollback();
    EXPECT_EQ(log.Lines(), std::vector<std::string>{DebugLine("HV::DeployRollback::HV::DeployRollback::Rollback")});
}

// Volumes are told apart by their texts, so the drive in lower case is another one: the move is a copy there, and a
// copy that fails throws.
TEST_F(RollbackTest, WarnsOfAnItemThatCannotBeCopiedToTheStashOnAnotherVolume) {
    machine.Has(kFile, "old");
    HV::DeployRollback rollback;
    {
        const UnreadableFile unreadable(machine, kFile);
        EXPECT_NO_THROW(rollback.StashExistingFile(fs::path(R"(c:\Data\Glow.dll)")));
    }
    EXPECT_TRUE(log.Has(WarnLine(R"(Failed to move/copy existing item to rollback stash, from "c:\Data\Glow.dll")")))
        << log.Text();
    EXPECT_EQ(machine.Content(kFile), "old");
    log.Clear();
    rollback.Rollback();
    EXPECT_EQ(log.Lines(), std::vector<std::string>{DebugLine("HV::DeployRollback::HV::DeployRollback::Rollback")});
}

TEST_F(RollbackTest, WritesOnlyItsEntryLineWhenNothingWasInstalled) {
    HV::DeployRollback rollback;
    log.Clear();
    rollback.Rollback();
    EXPECT_EQ(log.Lines(), std::vector<std::string>{DebugLine("HV::DeployRollback::HV::DeployRollback::Rollback")});
}

TEST_F(RollbackTest, RemovesFirstAndRestoresThen) {
    machine.Has(kFile, "old");
    HV::DeployRollback rollback;
    rollback.StashExistingFile(fs::path(kFile));
    machine.Has(kFile, "new");
    rollback.AddInstalledFile("com.halvorn.glow_v1.0", "plugin", fs::path(kFile));
    log.Clear();
    rollback.Rollback();
    EXPECT_EQ(machine.Content(kFile), "old");
    EXPECT_EQ(log.Lines(), (std::vector<std::string>{DebugLine("HV::DeployRollback::HV::DeployRollback::Rollback"),
                                                     DebugLine(R"(Removing file at "C:\Data\Glow.dll")"),
                                                     DebugLine(R"(Restoring original file at "C:\Data\Glow.dll")")}));
}

TEST_F(RollbackTest, RemovesByPackageThenPayloadThenOrder) {
    HV::DeployRollback rollback;
    const auto place = [&](const std::string& package, const std::string& payload, const std::string& name) {
        machine.Has(R"(C:\Data\)" + name, "x");
        rollback.AddInstalledFile(package, payload, fs::path(R"(C:\Data\)" + name));
    };
    place("b", "z", "1");
    place("b", "a", "4");
    place("b", "a", "3");
    place("B", "z", "2");
    log.Clear();
    rollback.Rollback();
    EXPECT_EQ(log.LinesStartingWith(DebugLine("Removing")),
              (std::vector<std::string>{
                  DebugLine(R"(Removing file at "C:\Data\2")"), DebugLine(R"(Removing file at "C:\Data\4")"),
                  DebugLine(R"(Removing file at "C:\Data\3")"), DebugLine(R"(Removing file at "C:\Data\1")")}));
}

TEST_F(RollbackTest, KeepsAPathThatOnePayloadReportsTwiceOnce) {
    machine.Has(kFile, "new");
    HV::DeployRollback rollback;
    rollback.AddInstalledFile("p", "a", fs::path(kFile));
    rollback.AddInstalledFile("p", "a", fs::path("C:/Data//Glow.dll"));
    rollback.Rollback();
    EXPECT_EQ(log.LinesStartingWith(DebugLine("Removing")).size(), 1U) << log.Text();
}

TEST_F(RollbackTest, PassesOverAnInstalledFileThatIsGone) {
    HV::DeployRollback rollback;
    rollback.AddInstalledFile("p", "a", fs::path(kFile));
    rollback.Rollback();
    EXPECT_EQ(log.LinesStartingWith(DebugLine("Removing")).size(), 0U);
    EXPECT_EQ(log.LinesStartingWith("WARN").size(), 0U);
}

TEST_F(RollbackTest, RunsTwiceQuietly) {
    machine.Has(kFile, "old");
    HV::DeployRollback rollback;
    rollback.StashExistingFile(fs::path(kFile));
    rollback.Rollback();
    rollback.Rollback();
    EXPECT_EQ(machine.Content(kFile), "old");
    EXPECT_EQ(log.LinesStartingWith("WARN").size(), 0U) << log.Text();
}

// On another volume, as above; a copy onto a file that is there throws.
TEST_F(RollbackTest, GoesOnWithoutAWordPastAnItemThatCannotGoBack) {
    machine.Has(R"(C:\Data\first.dll)", "old");
    machine.Has(R"(C:\Data\second.dll)", "old");
    HV::DeployRollback rollback;
    rollback.StashExistingFile(fs::path(R"(c:\Data\first.dll)"));
    rollback.StashExistingFile(fs::path(R"(c:\Data\second.dll)"));
    machine.Has(R"(C:\Data\first.dll)", "in the way");
    log.Clear();
    rollback.Rollback();
    EXPECT_EQ(machine.Content(R"(C:\Data\first.dll)"), "in the way");
    EXPECT_EQ(machine.Content(R"(C:\Data\second.dll)"), "old");
    EXPECT_EQ(log.Lines(), (std::vector<std::string>{DebugLine("HV::DeployRollback::HV::DeployRollback::Rollback"),
                                                     DebugLine(R"(Restoring original file at "c:\Data\first.dll")"),
                                                     DebugLine(R"(Restoring original file at "c:\Data\second.dll")")}));
}

TEST_F(RollbackTest, BringsBackANameThatIsLongerThanItsStashName) {
    const std::string path = R"(C:\Data\a name of a plug-in that is longer than thirty characters.aex)";
    machine.Has(path, "old");
    HV::DeployRollback rollback;
    rollback.StashExistingFile(fs::path(path));
    rollback.Rollback();
    EXPECT_EQ(machine.Content(path), "old");
}

TEST_F(RollbackTest, KeepsTwoFilesOfOneNameApart) {
    machine.Has(R"(C:\A\Glow.dll)", "a");
    machine.Has(R"(C:\B\Glow.dll)", "b");
    HV::DeployRollback rollback;
    rollback.StashExistingFile(fs::path(R"(C:\A\Glow.dll)"));
    rollback.StashExistingFile(fs::path(R"(C:\B\Glow.dll)"));
    rollback.Rollback();
    EXPECT_EQ(machine.Content(R"(C:\A\Glow.dll)"), "a");
    EXPECT_EQ(machine.Content(R"(C:\B\Glow.dll)"), "b");
}

TEST_F(EngineRollbackTest, BringsBackAWholeFolder) {
    machine.Has(R"(C:\ProgramData\Halvorn\Glow\deep\old.txt)", "old");
    const auto before = machine.FilesWithoutFolders();
    const PackageBuilder bundle = PackageBuilder("com.halvorn.glow")
                                      .Payload("resource")
                                      .To("programdata", "Halvorn")
                                      .Source("Glow")
                                      .File("Glow/new.txt", "new");
    EXPECT_EQ(Install({bundle, Failing("grain")}), -2);
    auto after = machine.FilesWithoutFolders();
    std::erase_if(after, [](const auto& item) { return item.first.rfind(kPackages, 0) == 0; });
    EXPECT_EQ(after, before);
}

TEST_F(EngineRollbackTest, RemovesAFolderThatAPatternPlacedWithAllItHolds) {
    const PackageBuilder presets = PackageBuilder("com.halvorn.glow")
                                       .Payload("presets")
                                       .To("programdata", "Halvorn")
                                       .Source("p/*")
                                       .File("p/deep/deeper/a.ffx", "a");
    EXPECT_EQ(Install({presets, Failing("grain")}), -2);
    EXPECT_FALSE(machine.Exists(R"(C:\ProgramData\Halvorn\deep)"));
    EXPECT_EQ(log.LinesStartingWith(DebugLine("Removing")),
              std::vector<std::string>{DebugLine(R"(Removing file at "C:\ProgramData\Halvorn\deep")")});
}

// The stash goes back in the order in which it was filled: first the machine's own file, then, over it, what the first
// of the two payloads had placed. So the machine is left with that, and not with its own file.
TEST_F(EngineRollbackTest, LeavesTheFirstPayloadsFileWhereTwoPlacedOnePath) {
    machine.Has(Placed("glow"), "the machine's own");
    const PackageBuilder twice = Placing("glow", "the first")
                                     .Payload("resource")
                                     .To("programdata", "Halvorn")
                                     .File("other/glow.dll", "the second");
    EXPECT_EQ(Install({twice, Failing("grain")}), -2);
    EXPECT_EQ(machine.Content(Placed("glow")), "the first");
    EXPECT_EQ(log.Count(DebugLine(R"(Restoring original file at "C:\ProgramData\Halvorn\glow.dll")")), 2U);
}

// Longer than Windows takes where long paths are switched off. Wine takes any length by wide names, and no more than
// 259 characters by narrow ones, so it shows whether both halves of the engine go the same way.
TEST_F(EngineRollbackTest, UndoesWhatLiesBeyond260Characters) {
    const std::string deep = "Halvorn\\" + std::string(100, 'a') + "\\" + std::string(60, 'b');
    const std::string inside = std::string(80, 'c') + "/" + std::string(20, 'd');
    const std::string bundle = InProgramData(deep) + R"(\Glow)";
    const std::string placed = bundle + "\\" + inside + R"(\new.txt)";
    ASSERT_GT(placed.size(), 290U);
    machine.Has(bundle + R"(\old.txt)", "old");
    const auto before = machine.FilesWithoutFolders();
    const PackageBuilder package = PackageBuilder("com.halvorn.glow")
                                       .Payload("resource")
                                       .To("programdata", deep)
                                       .Source("Glow")
                                       .File("Glow/" + inside + "/new.txt", "new");
    EXPECT_EQ(Install({package}), HV::kPlaced) << log.Text();
    EXPECT_TRUE(fs::is_regular_file(fs::path(placed)));
    EXPECT_EQ(Install({Failing("grain")}), -2);
    EXPECT_FALSE(fs::exists(fs::path(bundle + "\\" + inside).parent_path()));
    auto after = machine.FilesWithoutFolders();
    std::erase_if(after, [](const auto& item) { return item.first.rfind(kPackages, 0) == 0; });
    EXPECT_EQ(after, before);
    EXPECT_EQ(log.LinesStartingWith("WARN"), std::vector<std::string>{});
}

TEST_F(EngineRollbackTest, UndoesPackagesOfEarlierPhases) {
    machine.Has(Placed("runtime"), "old");
    Ships(Placing("runtime").Named("preflight-runtime.hvpkg"));
    Ships(Failing("glow"));
    EXPECT_EQ(InstallFolder(), -2);
    EXPECT_EQ(machine.Content(Placed("runtime")), "old");
}

TEST_F(EngineRollbackTest, LeavesNothingInTheTemporaryFolder) {
    machine.Has(Placed("glow"), "old");
    {
        HV::Deploy other(nullptr);
        EXPECT_EQ(other.DeployPackages({Placing("glow").WriteTo(kPackages), Failing("grain").WriteTo(kPackages)}), -2);
    }
    EXPECT_EQ(machine.TempEntries().size(), 1U) << "the fixture's own engine has its stash there";
    EXPECT_EQ(machine.Content(Placed("glow")), "old");
}
