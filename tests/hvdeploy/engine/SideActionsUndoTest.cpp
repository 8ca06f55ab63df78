// A run with scripts, registry entries and shortcuts goes back: the files are as before, and what else was done stays.
//
// That is the rule and no gap: nothing records what a script did, an entry's older value is not kept, and a shortcut is
// known to the removal script alone, which stays as well.
#include "tests/hvdeploy/engine/SideActionsScenario.h"

TEST_F(SideActionsUndoTest, DoesEverythingWhenNothingIsInTheWay) {
    Machine machine;
    HasOlderSuite(machine);
    const Effects before = Left(machine);
    ShipsSuite(machine, false);
    const Outcome outcome = Run(machine);
    EXPECT_EQ(outcome.result, 1) << Text(outcome);
    const Effects left = Left(machine);
    EXPECT_EQ(left.scripts.size(), 6U);
    EXPECT_EQ(left.entries.size(), 6U) << "five of the suite, one of the user's own";
    EXPECT_EQ(left.links.size(), 3U);
    EXPECT_EQ(left.program.size(), kProgramValues);
    Effects said = Said(outcome, before);
    said.program = left.program;
    EXPECT_EQ(left, said) << Text(outcome);
    EXPECT_EQ(machine.Content(kKeptLink), "an older link");
    EXPECT_EQ(SectionsLeftAndSaid(machine, outcome), (std::pair<std::size_t, std::size_t>{3, 3}));
}

TEST_F(SideActionsUndoTest, PutsFilesBackAndLeavesAllElseWhenTheLastPackageFails) {
    Machine machine;
    HasOlderSuite(machine);
    const Effects before = Left(machine);
    const Files files = Placed(FilesOf(machine));
    ShipsSuite(machine, true);
    const Outcome outcome = Run(machine);
    EXPECT_EQ(outcome.result, -2);
    EXPECT_EQ(Placed(outcome.files), files) << Text(outcome);
    EXPECT_EQ(outcome.temp, std::vector<std::string>{});
    const Effects left = Left(machine);
    EXPECT_EQ(left, Said(outcome, before)) << Text(outcome);
    EXPECT_EQ(left.scripts.size(), 6U);
    EXPECT_EQ(left.entries.at(R"(HKEY_LOCAL_MACHINE\SOFTWARE\Halvorn\Undo\Runtime)"), "Runtime");
    EXPECT_EQ(left.links.size(), 3U) << "two of them point to what is gone or older";
    EXPECT_EQ(left.program, std::set<std::string>{}) << "a failed run enters nothing in the list of programs";
    EXPECT_EQ(SectionsLeftAndSaid(machine, outcome), (std::pair<std::size_t, std::size_t>{2, 2}));
}

// Every place where the engine looks at the switch comes after a report of its own: the first report of a phase comes
// before its first package, and each payload's before the question that follows it.
TEST_F(SideActionsUndoTest, PutsFilesBackAndLeavesAllElseAfterACancelAtEveryReport) {
    const auto [before, files] = [] {
        Machine machine;
        HasOlderSuite(machine);
        return std::pair{Left(machine), Placed(FilesOf(machine))};
    }();
    std::size_t rounds = 0;
    std::size_t undone = 0;
    std::set<std::size_t> scripts;
    std::size_t reports = 2;
    for (std::size_t at = 2; at <= reports; ++at) {  // the first report comes before there is an engine to cancel
        SCOPED_TRACE("cancelled at report " + std::to_string(at));
        Machine machine;
        HasOlderSuite(machine);
        ShipsSuite(machine, false);
        const Outcome outcome = Run(machine, [at](std::size_t report, HV::Deploy* engine) {
            if (report == at) {
                engine->Cancel();
            }
        });
        reports = std::max(reports, outcome.reports);
        ++rounds;
        EXPECT_EQ(outcome.temp, std::vector<std::string>{});
        const Effects left = Left(machine);
        Effects said = Said(outcome, before);
        scripts.insert(left.scripts.size());
        const auto [sections, sectionsSaid] = SectionsLeftAndSaid(machine, outcome);
        EXPECT_EQ(sections, sectionsSaid);
        if (HV::IsFailure(outcome.result)) {
            ++undone;
            EXPECT_TRUE(Has(outcome, kWayBack));
            EXPECT_EQ(Placed(outcome.files), files) << Text(outcome);
        } else {
            EXPECT_FALSE(Has(outcome, kWayBack));
            EXPECT_EQ(outcome.files.at(R"(C:\ProgramData\Halvorn\support.dll)"), "support");
            EXPECT_EQ(left.program.size(), kProgramValues);
            said.program = left.program;
        }
        EXPECT_EQ(left, said) << Text(outcome);
    }
    EXPECT_EQ(rounds, 26U);
    EXPECT_EQ(undone, 22U) << "all but those at the last package's checks and at the end";
    EXPECT_GE(scripts.size(), 5U) << "runs are cancelled between any two scripts that lie in different payloads";
}
