// What Processes makes of the system's answers, those included that no real process gives on demand.
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

TEST(ScriptedProcesses, HaveNumberNameAndPath) {
    ProcessScript::Renew().processes = {{.number = 77, .path = R"(C:\Program Files\Blackmagic\Resolve.exe)"}};
    const auto all = Snapshot();
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].processId, 77U);
    EXPECT_EQ(all[0].name, "Resolve.exe");
    EXPECT_EQ(all[0].fullPath, R"(C:\Program Files\Blackmagic\Resolve.exe)");
}

TEST(ScriptedProcesses, AreAskedForWithTheRightsThatSuffice) {
    ProcessScript::Renew().Runs(R"(C:\a.exe)");
    Snapshot();
    const ProcessScript& script = ProcessScript::Current();
    EXPECT_EQ(script.listBytes, 4096U);
    EXPECT_EQ(script.processAccess, 1040U);
    EXPECT_FALSE(script.inherited);
    EXPECT_EQ(script.moduleBytes, sizeof(void*));
    EXPECT_EQ(script.pathCharacters, 1024U);
    EXPECT_EQ(script.tokenAccess, 0x20008U);
    EXPECT_EQ(script.tokenClass, 1);
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
    ProcessScript::Renew().processes = {{.number = 9, .path = R"(C:\b.exe)"}, {.number = 4, .path = R"(C:\a.exe)"}};
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

TEST(ScriptedProcesses, ThatCannotBeOpenedAreLeftOut) {
    ProcessScript::Renew().processes = {{.number = 4, .path = R"(C:\a.exe)", .opens = false},
                                        {.number = 8, .path = R"(C:\b.exe)"}};
    const auto all = Snapshot();
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].processId, 8U);
}

TEST(ScriptedProcesses, WithoutModulesHaveNeitherNameNorPath) {
    ProcessScript::Renew().processes = {{.number = 4, .path = R"(C:\a.exe)", .user = {1, 0, 0, 0}}};
    ProcessScript::Current().processes[0].showsModules = false;
    const auto all = Snapshot();
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].processId, 4U);
    EXPECT_EQ(all[0].name, "");
    EXPECT_EQ(all[0].fullPath, "");
    EXPECT_EQ(all[0].ownerTag, 1U);
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

TEST(ScriptedProcesses, WithAnOverlongPathHaveItsFirst1024Characters) {
    const std::string path = R"(C:\)" + std::string(2000, 'x');
    ProcessScript::Renew().Runs(path);
    const auto all = Snapshot();
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].fullPath, path.substr(0, 1024));
}

TEST(ScriptedProcesses, CarryTheFirstFourBytesOfTheirUser) {
    ProcessScript::Renew().processes = {{.number = 4, .path = R"(C:\a.exe)", .user = {1, 2, 3, 4, 5, 6, 7, 8}}};
    const auto all = Snapshot();
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].ownerTag, 0x04030201U);
}

TEST(ScriptedProcesses, WithoutATokenHaveTheTagZero) {
    ProcessScript::Renew().processes = {{.number = 4, .path = R"(C:\a.exe)", .user = {1, 2, 3, 4}}};
    ProcessScript::Current().processes[0].showsToken = false;
    const auto all = Snapshot();
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].name, "a.exe");
    EXPECT_EQ(all[0].ownerTag, 0U);
}

// What stands in a block counts only as far as the system says that it has filled it.
TEST(ScriptedProcesses, WithAnEmptyUserHaveTheTagZero) {
    ProcessScript::Renew().processes = {
        {.number = 4, .path = R"(C:\a.exe)"},
        {.number = 8, .path = R"(C:\b.exe)", .user = {1, 2, 3, 4}, .takesUserBack = true}};
    const auto all = Snapshot();
    ASSERT_EQ(all.size(), 2U);
    EXPECT_EQ(all[0].ownerTag, 0U);
    EXPECT_EQ(all[1].ownerTag, 0U);
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
