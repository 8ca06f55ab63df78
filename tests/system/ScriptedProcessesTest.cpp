// What Processes makes of what runs, processes included that no test can bring about.
#include "tests/support/ScriptedProcesses.h"

#include <gtest/gtest.h>

#include "system/Processes.h"

namespace {

using HV::Processes;
using HV::ProcessRecord;

std::vector<ProcessRecord> AllOf(const Processes& processes) {
    std::vector<ProcessRecord> all;
    processes.FindByPath("", all);
    return all;
}

std::vector<ProcessRecord> Snapshot() {
    return AllOf(Processes());
}

TEST(ScriptedProcesses, AreReadOnceWhenTheObjectIsMade) {
    ProcessScript::Renew();
    const Processes processes;
    EXPECT_EQ(ProcessScript::Current().snapshots, 1);
}

TEST(ScriptedProcesses, HaveNumberNamePathAndOwner) {
    ProcessScript::Renew().processes = {
        {.number = 77, .program = R"(C:\Program Files\Blackmagic\Resolve.exe)", .ownerTag = 5}};
    const auto all = Snapshot();
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].processId, 77U);
    EXPECT_EQ(all[0].name, "Resolve.exe");
    EXPECT_EQ(all[0].fullPath, R"(C:\Program Files\Blackmagic\Resolve.exe)");
    EXPECT_EQ(all[0].ownerTag, 5U);
}

TEST(ScriptedProcesses, AreNoneWhenTheListCannotBeHad) {
    ProcessScript::Renew().Runs(R"(C:\a.exe)");
    Processes processes;
    ASSERT_EQ(AllOf(processes).size(), 1U);
    ProcessScript::Current().listFails = true;
    EXPECT_EQ(processes.Refresh(), -1);
    EXPECT_TRUE(AllOf(processes).empty());
}

TEST(ScriptedProcesses, MayBeNoneAtAll) {
    ProcessScript::Renew();
    Processes processes;
    EXPECT_EQ(processes.Refresh(), 0);
    EXPECT_TRUE(AllOf(processes).empty());
}

TEST(ScriptedProcesses, KeepTheOrderOfTheSystem) {
    ProcessScript::Renew().processes = {{.number = 9, .program = R"(C:\b.exe)"},
                                        {.number = 4, .program = R"(C:\a.exe)"}};
    const auto all = Snapshot();
    ASSERT_EQ(all.size(), 2U);
    EXPECT_EQ(all[0].processId, 9U);
    EXPECT_EQ(all[1].processId, 4U);
}

TEST(ScriptedProcesses, BeyondTheFirst1024AreNotSeen) {
    ProcessScript::Renew();
    for (int i = 0; i < 1024; ++i) {
        ProcessScript::Current().Runs(R"(C:\other.exe)");
    }
    ProcessScript::Current().Runs(R"(C:\last.exe)");
    const Processes processes;
    EXPECT_EQ(AllOf(processes).size(), 1024U);
    std::vector<ProcessRecord> found;
    EXPECT_FALSE(processes.FindByName("last.exe", found));
}

TEST(ScriptedProcesses, WithAnEmptyPathHaveNoName) {
    ProcessScript::Renew().Runs("");
    const auto all = Snapshot();
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].name, "");
    EXPECT_EQ(all[0].fullPath, "");
}

TEST(ScriptedProcesses, WithAPathWithoutBackslashHaveNoName) {
    ProcessScript::Renew().Runs("Resolve.exe");
    const auto all = Snapshot();
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].name, "");
    EXPECT_EQ(all[0].fullPath, "Resolve.exe");
}

TEST(ScriptedProcesses, AreForgottenByTheNextSnapshot) {
    ProcessScript::Renew().Runs(R"(C:\old.exe)");
    Processes processes;
    ProcessScript::Renew().Runs(R"(C:\new.exe)");
    EXPECT_EQ(processes.Refresh(), 0);
    const auto all = AllOf(processes);
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].name, "new.exe");
}

TEST(ScriptedProcesses, AreFoundByNameInExactlyThisCase) {
    ProcessScript::Renew().Runs(R"(C:\afterfx.exe)").Runs(R"(C:\AFTERFX.EXE)").Runs(R"(C:\AfterFX.exe)");
    std::vector<ProcessRecord> found;
    EXPECT_TRUE(Processes().FindByName("AfterFX.exe", found));
    ASSERT_EQ(found.size(), 1U);
    EXPECT_EQ(found[0].fullPath, R"(C:\AfterFX.exe)");
}

TEST(ScriptedProcesses, AreFoundByTheWholeNameAlone) {
    ProcessScript::Renew().Runs(R"(C:\EDIUS.exe)").Runs(R"(C:\EDIUS\Other.exe)");
    std::vector<ProcessRecord> found;
    EXPECT_FALSE(Processes().FindByName("EDIUS", found));
    EXPECT_TRUE(found.empty());
}

TEST(ScriptedProcesses, WithoutANameAreFoundByTheEmptyName) {
    ProcessScript::Renew().Runs("").Runs(R"(C:\a.exe)");
    std::vector<ProcessRecord> found;
    EXPECT_TRUE(Processes().FindByName("", found));
    ASSERT_EQ(found.size(), 1U);
    EXPECT_EQ(found[0].fullPath, "");
}

TEST(ScriptedProcesses, AreFoundByAPartOfTheirPathInExactlyThisCase) {
    ProcessScript::Renew()
        .Runs(R"(C:\Adobe Premiere Pro.exe)")
        .Runs(R"(C:\Adobe Premiere Pro.exe.old\helper.exe)")
        .Runs(R"(C:\adobe premiere pro.exe)");
    std::vector<ProcessRecord> found;
    EXPECT_TRUE(Processes().FindByPath("Adobe Premiere Pro.exe", found));
    ASSERT_EQ(found.size(), 2U);
    EXPECT_EQ(found[0].name, "Adobe Premiere Pro.exe");
    EXPECT_EQ(found[1].name, "helper.exe");
}

TEST(ScriptedProcesses, AllHaveTheEmptyFragmentInTheirPath) {
    ProcessScript::Renew().Runs("").Runs(R"(C:\a.exe)");
    EXPECT_EQ(Snapshot().size(), 2U);
}

TEST(ScriptedProcesses, ThatAreNotFoundLeaveNothingOfAnEarlierAnswer) {
    ProcessScript::Renew().Runs(R"(C:\a.exe)");
    const Processes processes;
    std::vector<ProcessRecord> found(3);
    EXPECT_FALSE(processes.FindByName("b.exe", found));
    EXPECT_TRUE(found.empty());
    found.resize(3);
    EXPECT_FALSE(processes.FindByPath("b.exe", found));
    EXPECT_TRUE(found.empty());
}

}  // namespace
