// A run that is cancelled at any of its reports leaves the machine as it was, or has done everything.
#include "tests/hvdeploy/engine/UndoScenario.h"

TEST_F(UndoTest, InstallsTheWholeSuiteWhenNothingIsInTheWay) {
    const Machine machine;
    ShipsSuite(false);
    const Outcome outcome = Run(machine);
    EXPECT_EQ(outcome.result, 1) << Text(outcome);
    EXPECT_EQ(outcome.files.size(), 7U);
    EXPECT_EQ(outcome.temp, std::vector<std::string>{});
}

TEST_F(UndoTest, ComesBackWholeWhenTheLastPackageFails) {
    Machine machine;
    HasOlderSuite(machine);
    const Files before = FilesOf(machine);
    ShipsSuite(true);
    const Outcome outcome = Run(machine);
    EXPECT_EQ(outcome.result, -2);
    EXPECT_EQ(outcome.files, before) << Text(outcome);
    EXPECT_EQ(outcome.temp, std::vector<std::string>{});
}

TEST_F(UndoTest, ComesBackWholeFromACancelAtEveryReport) {
    std::size_t rounds = 0;
    std::size_t undone = 0;
    std::size_t reports = 2;
    for (std::size_t at = 2; at <= reports; ++at) {  // the first report comes before there is an engine to cancel
        SCOPED_TRACE("cancelled at report " + std::to_string(at));
        Machine machine;
        HasOlderSuite(machine);
        const Files before = FilesOf(machine);
        ShipsSuite(false);
        const Outcome outcome = Run(machine, [at](std::size_t report, HV::Deploy* engine) {
            if (report == at) {
                engine->Cancel();
            }
        });
        reports = std::max(reports, outcome.reports);
        ++rounds;
        EXPECT_EQ(outcome.temp, std::vector<std::string>{});
        if (HV::IsFailure(outcome.result)) {
            ++undone;
            EXPECT_EQ(outcome.files, before) << Text(outcome);
            EXPECT_TRUE(Has(outcome, DebugLine("HV::DeployRollback::HV::DeployRollback::Rollback")));
        } else {
            // No package looked at the switch any more: the suite is there.
            EXPECT_EQ(outcome.files.at(R"(C:\ProgramData\Halvorn\support.dll)"), "support");
            EXPECT_FALSE(Has(outcome, DebugLine("HV::DeployRollback::HV::DeployRollback::Rollback")));
        }
    }
    EXPECT_EQ(rounds, 25U);
    EXPECT_EQ(undone, 21U) << "all but those at the last package's checks and at the end";
}
