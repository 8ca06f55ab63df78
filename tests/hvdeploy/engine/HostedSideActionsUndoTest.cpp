// Every operation of a run with scripts, registry entries and shortcuts breaks once, registry entries among them. Only
// the hosted machine can be broken, so these exist for it alone.
#include <array>

#include "tests/hvdeploy/engine/SideActionsScenario.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/Faults.h"

namespace {

using hosted::Operation;

struct Kind {
    Operation operation;
    const char* name;
};
constexpr std::array<Kind, 5> kKinds{{{Operation::Write, "write"},
                                      {Operation::Create, "create"},
                                      {Operation::Rename, "rename"},
                                      {Operation::Delete, "delete"},
                                      {Operation::RegistrySet, "registry set"}}};

const std::string kGuard = ErrorLine("exception deploying payload");
const std::string kNotStashed = WarnLine("Failed to move/copy existing item to rollback stash");
const std::string kNotExtracted = ErrorLine("Failed to extract package");

class HostedSideActionsUndoTest : public SideActionsUndoTest {
protected:
    HostedSideActionsUndoTest() {
        Machine machine;
        HasOlderSuite(machine);
        oldFiles = Placed(FilesOf(machine));
        oldEffects = Left(machine);
        ShipsSuite(machine, false);
        newFiles = Placed(Run(machine).files);
    }

    static std::uint64_t Count(Operation operation) {
        Machine machine;
        HasOlderSuite(machine);
        ShipsSuite(machine, false);
        MachineFaults faults(machine);
        faults.StartCounting();
        (void)Run(machine);
        return faults.Count(operation);
    }

    /// One run whose `n`-th operation of this kind breaks. Whatever its end is, the machine holds those words, entries
    /// and links that the log speaks of, and the files that the rules for this end leave. Gives a name for the end.
    std::string Break(Operation operation, std::uint64_t n) {
        Machine machine;
        HasOlderSuite(machine);
        ShipsSuite(machine, false);
        MachineFaults faults(machine);
        faults.FailNth(operation, n);
        Outcome outcome;
        try {
            const CapturedStreams streams;  // a link that cannot be saved says so on standard error
            outcome = Run(machine);
        } catch (const std::runtime_error& error) {
            EXPECT_STREQ(error.what(), "Failed to create stash directory for rollback.");
            EXPECT_EQ(Placed(FilesOf(machine)), oldFiles);
            EXPECT_EQ(Left(machine), oldEffects);
            return "no stash";
        }
        Effects left = Left(machine);
        program = left.program.size();
        left.program.clear();
        EXPECT_EQ(left, Said(outcome, oldEffects)) << Text(outcome);
        const Files files = Placed(outcome.files);
        if (HV::IsFailure(outcome.result)) {
            EXPECT_EQ(program, 0U);
        }
        if (Has(outcome, kWayBack)) {
            EXPECT_TRUE(HV::IsFailure(outcome.result));
            EXPECT_EQ(files, oldFiles) << Text(outcome);
            return "undone";
        }
        if (Has(outcome, kNotExtracted)) {
            EXPECT_EQ(outcome.result, -1);
            for (const auto& [path, content] : files) {
                EXPECT_TRUE(Is(oldFiles, path, content) || Is(newFiles, path, content)) << path << ": " << content;
            }
            return "not extracted";
        }
        EXPECT_FALSE(HV::IsFailure(outcome.result)) << Text(outcome);
        if (Has(outcome, kNotStashed)) {
            for (const auto& [path, content] : oldFiles) {
                EXPECT_TRUE(files.count(path) != 0) << path << " is lost";
            }
            return "not stashed";
        }
        if (Has(outcome, kGuard)) {
            // What the payload places after the item that broke is as before.
            for (const auto& [path, content] : files) {
                EXPECT_TRUE(Is(oldFiles, path, content) || Is(newFiles, path, content)) << path << ": " << content;
            }
            return "swallowed";
        }
        EXPECT_EQ(files, newFiles) << Text(outcome);
        return "harmless";
    }

    static bool Is(const Files& files, const std::string& path, const std::string& content) {
        const auto found = files.find(path);
        return found != files.end() && found->second == content;
    }

    Files oldFiles;
    Files newFiles;
    Effects oldEffects;
    std::size_t program = 0;  // how many values the last run has left in the list of installed programs
};

}  // namespace

TEST_F(HostedSideActionsUndoTest, EveryBrokenOperationLeavesWhatTheLogSays) {
    std::uint64_t rounds = 0;
    std::uint64_t counted = 0;
    std::map<std::string, int> ends;
    for (const Kind& kind : kKinds) {
        const std::uint64_t count = Count(kind.operation);
        ASSERT_GT(count, 0U) << kind.name;
        counted += count;
        for (std::uint64_t n = 1; n <= count; ++n) {
            SCOPED_TRACE(std::string(kind.name) + " " + std::to_string(n));
            ++ends[Break(kind.operation, n)];
            ++rounds;
        }
    }
    EXPECT_EQ(rounds, counted);
    EXPECT_GT(rounds, 80U);
    for (const char* end : {"no stash", "undone", "not extracted", "not stashed", "swallowed", "harmless"}) {
        EXPECT_GT(ends[end], 0) << end;
    }
}

// The suite's own entries fail the run, which goes back. The entry in the list of installed programs comes when the run
// has succeeded: its key or one of its values is missing then, and nothing else.
TEST_F(HostedSideActionsUndoTest, ABrokenRegistryCostsTheRunOrOneValueInTheListOfPrograms) {
    const std::uint64_t count = Count(Operation::RegistrySet);
    std::map<std::string, std::uint64_t> ends;
    for (std::uint64_t n = 1; n <= count; ++n) {
        SCOPED_TRACE("registry set " + std::to_string(n));
        const std::string end = Break(Operation::RegistrySet, n);
        ++ends[end == "harmless" ? "harmless with " + std::to_string(program) + " values" : end];
    }
    // Five values of the suite, and the two keys that one of them has made for itself.
    const std::map<std::string, std::uint64_t> expected{
        {"undone", 7}, {"harmless with 0 values", 1}, {"harmless with 7 values", kProgramValues}};
    EXPECT_EQ(ends, expected);
    EXPECT_EQ(count, 7 + 1 + kProgramValues);
}
