// Every operation of a run breaks once. Only the hosted machine can be broken, so these exist for it alone.
#include "tests/hvdeploy/engine/UndoScenario.h"
#include "tests/support/Faults.h"

namespace {

using hosted::Operation;

constexpr std::array kKinds{Operation::Write, Operation::Create, Operation::Rename, Operation::Delete};
constexpr std::array<const char*, 4> kNames{"write", "create", "rename", "delete"};

class HostedUndoTest : public UndoTest {
protected:
    struct Counts {
        std::array<std::uint64_t, kKinds.size()> ofKind{};
        [[nodiscard]] std::uint64_t All() const { return ofKind[0] + ofKind[1] + ofKind[2] + ofKind[3]; }
    };

    /// How many operations of each kind the run makes, and how many of them before the way back begins.
    static Counts Count(bool fails) {
        Machine machine;
        HasOlderSuite(machine);
        ShipsSuite(fails);
        MachineFaults faults(machine);
        faults.StartCounting();
        (void)Run(machine);
        Counts counts;
        for (std::size_t i = 0; i < kKinds.size(); ++i) {
            counts.ofKind[i] = faults.Count(kKinds[i]);
        }
        return counts;
    }
};

/// A copy that the filesystem library breaks off by an exception: the guard keeps the result as it stood.
const std::string kGuard = ErrorLine("exception deploying payload");
const std::string kNotStashed = WarnLine("Failed to move/copy existing item to rollback stash");
const std::string kWayBack = DebugLine("HV::DeployRollback::HV::DeployRollback::Rollback");
const std::string kNotExtracted = ErrorLine("Failed to extract package");

}  // namespace

// The suite itself would succeed; one operation of it breaks. The rules leave these outcomes:
//  - the run goes back: the machine is as before;
//  - a package does not extract: the run ends without a way back, so each file is the old one or the new one;
//  - the guard around the copy swallows the exception and the run succeeds: what could not be copied is missing, and
//    where the old file had been moved aside it goes with the stash; what the payload places after it is as before;
//  - an item that could not be moved aside stays, and the copy meets it: again the guard, and the old file stays;
//  - a temporary file cannot be removed, or a script for removal written: the suite is there.
TEST_F(HostedUndoTest, EveryBrokenOperationLeavesWhatTheRulesSay) {
    const Files oldFiles = [] {
        Machine machine;
        HasOlderSuite(machine);
        return FilesOf(machine);
    }();
    const Files newFiles = [] {
        Machine machine;
        HasOlderSuite(machine);
        ShipsSuite(false);
        return Run(machine).files;
    }();
    const Counts counts = Count(false);
    std::uint64_t rounds = 0;
    std::map<std::string, int> outcomes;
    for (std::size_t kind = 0; kind < kKinds.size(); ++kind) {
        ASSERT_GT(counts.ofKind[kind], 0U) << kNames[kind];
        for (std::uint64_t n = 1; n <= counts.ofKind[kind]; ++n) {
            SCOPED_TRACE(std::string(kNames[kind]) + " " + std::to_string(n));
            Machine machine;
            HasOlderSuite(machine);
            ShipsSuite(false);
            MachineFaults faults(machine);
            faults.FailNth(kKinds[kind], n);
            Outcome outcome;
            ++rounds;
            try {
                outcome = Run(machine);
            } catch (const std::runtime_error& error) {
                EXPECT_STREQ(error.what(), "Failed to create stash directory for rollback.");
                EXPECT_EQ(FilesOf(machine), oldFiles);
                ++outcomes["no stash"];
                continue;
            }
            if (Has(outcome, kWayBack)) {
                EXPECT_TRUE(HV::IsFailure(outcome.result));
                EXPECT_EQ(outcome.files, oldFiles) << Text(outcome);
                ++outcomes["undone"];
            } else if (Has(outcome, kNotExtracted)) {
                EXPECT_EQ(outcome.result, -1);
                for (const auto& [path, content] : outcome.files) {
                    const bool isOld = oldFiles.count(path) != 0 && oldFiles.at(path) == content;
                    const bool isNew = newFiles.count(path) != 0 && newFiles.at(path) == content;
                    EXPECT_TRUE(isOld || isNew) << path << ": " << content;
                }
                EXPECT_FALSE(Has(outcome, kGuard));
                ++outcomes["not extracted"];
            } else if (Has(outcome, kNotStashed)) {
                EXPECT_FALSE(HV::IsFailure(outcome.result)) << Text(outcome);
                EXPECT_EQ(outcome.files.count(R"(C:\Users\Public\Documents\Halvorn\mine.ffx)"), 1U);
                for (const auto& [path, content] : oldFiles) {
                    EXPECT_TRUE(outcome.files.count(path) != 0 || newFiles.count(path) == 0) << path << " is lost";
                }
                ++outcomes["not stashed"];
            } else if (Has(outcome, kGuard)) {
                EXPECT_FALSE(HV::IsFailure(outcome.result)) << Text(outcome);
                for (const auto& [path, content] : outcome.files) {
                    const bool isOld = oldFiles.count(path) != 0 && oldFiles.at(path) == content;
                    const bool isNew = newFiles.count(path) != 0 && newFiles.at(path) == content;
                    EXPECT_TRUE(isOld || isNew) << path << ": " << content;
                }
                ++outcomes["swallowed"];
            } else {
                EXPECT_FALSE(HV::IsFailure(outcome.result)) << Text(outcome);
                EXPECT_EQ(outcome.files, newFiles) << Text(outcome);
                ++outcomes["harmless"];
            }
        }
    }
    EXPECT_EQ(rounds, counts.All());
    EXPECT_GT(rounds, 60U);
    for (const char* outcome : {"no stash", "undone", "not extracted", "not stashed", "swallowed", "harmless"}) {
        EXPECT_GT(outcomes[outcome], 0) << outcome;
    }
}

// The way back goes on past what breaks in it: at most the one item is not as before.
TEST_F(HostedUndoTest, ABreakOnTheWayBackCostsNoMoreThanItsOwnItem) {
    const Counts forward = Count(false);
    const Counts both = Count(true);
    std::uint64_t rounds = 0;
    for (std::size_t kind = 0; kind < kKinds.size(); ++kind) {
        if (kKinds[kind] != Operation::Rename && kKinds[kind] != Operation::Delete) {
            continue;  // a way back moves and deletes, and neither writes nor makes anything
        }
        // Both runs do the same up to the way back; moves are then those of the stash alone.
        const std::uint64_t first = kKinds[kind] == Operation::Rename ? forward.ofKind[kind] + 1 : 1;
        for (std::uint64_t n = first; n <= both.ofKind[kind]; ++n) {
            SCOPED_TRACE(std::string(kNames[kind]) + " " + std::to_string(n));
            Machine machine;
            HasOlderSuite(machine);
            const Files before = FilesOf(machine);
            ShipsSuite(true);
            MachineFaults faults(machine);
            faults.FailNth(kKinds[kind], n);
            const Outcome outcome = Run(machine);
            ++rounds;
            EXPECT_EQ(outcome.result, -2);
            std::size_t different = 0;
            for (const auto& [path, content] : before) {
                different += outcome.files.count(path) != 0 && outcome.files.at(path) == content ? 0U : 1U;
            }
            for (const auto& [path, content] : outcome.files) {
                different += before.count(path) == 0 ? 1U : 0U;
            }
            // An item of the machine and the new one in its place, where the new one could not be removed.
            EXPECT_LE(different, 2U) << Text(outcome);
            if (different != 0 && kKinds[kind] == Operation::Delete) {
                EXPECT_TRUE(Has(outcome, WarnLine("DeleteFileOrDirectory returned "))) << Text(outcome);
            }
        }
    }
    EXPECT_GT(rounds, 20U);
}

TEST_F(HostedUndoTest, AFullDiskLeavesTheMachineAsItWas) {
    Machine machine;
    HasOlderSuite(machine);
    const Files before = FilesOf(machine);
    ShipsSuite(false);
    MachineFaults faults(machine);
    faults.LimitSpace(0);
    const Outcome outcome = Run(machine);
    EXPECT_EQ(outcome.result, -1);
    EXPECT_TRUE(Has(outcome, kNotExtracted)) << Text(outcome);
    EXPECT_EQ(outcome.files, before);
    EXPECT_EQ(outcome.temp, std::vector<std::string>{});
}

TEST_F(HostedUndoTest, AFolderThatMeetsAFileItCannotMoveFailsWithTheCopysCode) {
    Machine machine;
    const std::string inTheWay = R"(C:\ProgramData\Halvorn\Glow.bundle)";
    machine.Has(inTheWay, "a file that somebody holds");
    (void)PackageBuilder("com.halvorn.glow")
        .Payload("resource")
        .To("programdata", "Halvorn")
        .Folder("Glow.bundle")
        .File("Glow.bundle/Glow.dll", "x")
        .Source("Glow.bundle")
        .WriteTo(kPackages);
    MachineFaults faults(machine);
    faults.Lock(inTheWay);
    const Outcome outcome = Run(machine);
    EXPECT_EQ(outcome.result, -2);
    EXPECT_TRUE(Has(outcome, kNotStashed)) << Text(outcome);
    EXPECT_TRUE(Has(outcome, ErrorLine("File copy failed with error code -1"))) << Text(outcome);
    EXPECT_EQ(machine.Content(inTheWay), "a file that somebody holds");
}

TEST_F(HostedUndoTest, AStashThatCannotBeMadeKeepsTheEngineFromStarting) {
    const Machine machine;
    MachineFaults faults(machine);
    faults.FailNth(Operation::Create, 1);
    try {
        const HV::Deploy engine(nullptr);
        FAIL() << "nothing was thrown";
    } catch (const std::runtime_error& error) {
        EXPECT_STREQ(error.what(), "Failed to create stash directory for rollback.");
    }
}
