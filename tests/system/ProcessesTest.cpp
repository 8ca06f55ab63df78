#include "system/Processes.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <stdexcept>

#include "tests/support/Machine.h"
#include "tests/support/RunningProgram.h"

namespace {

using HV::HostDisplayName;
using HV::Processes;
using HV::ProcessRecord;

/// Leaves those on drive C: what runs outside of the machine may have any name.
std::vector<ProcessRecord> OnTheMachine(std::vector<ProcessRecord> found) {
    std::erase_if(found, [](const ProcessRecord& record) { return !record.fullPath.starts_with("C:\\"); });
    return found;
}

std::vector<ProcessRecord> FoundByName(const Processes& processes, const std::string& name) {
    std::vector<ProcessRecord> found;
    const bool any = processes.FindByName(name, found);
    EXPECT_EQ(any, !found.empty());
    return OnTheMachine(found);
}

std::vector<ProcessRecord> FoundByPath(const Processes& processes, const std::string& fragment) {
    std::vector<ProcessRecord> found;
    const bool any = processes.FindByPath(fragment, found);
    EXPECT_EQ(any, !found.empty());
    return OnTheMachine(found);
}

std::vector<std::string> PathsByName(const Processes& processes, const std::string& name) {
    const auto found = FoundByName(processes, name);
    std::vector<std::string> paths;
    std::ranges::transform(found, std::back_inserter(paths), &ProcessRecord::fullPath);
    return paths;
}

using Paths = std::vector<std::string>;

TEST(Processes, SeeAProgramFromItsStartToItsEnd) {
    Machine machine;
    const std::string path = R"(C:\Program Files\Adobe\Adobe After Effects 2022\Support Files\AfterFX.exe)";
    Processes processes;
    EXPECT_EQ(PathsByName(processes, "AfterFX.exe"), Paths());
    RunningProgram host(machine, path);
    EXPECT_EQ(processes.Refresh(), 0);
    EXPECT_EQ(PathsByName(processes, "AfterFX.exe"), Paths{path});
    host.End();
    EXPECT_EQ(processes.Refresh(), 0);
    EXPECT_EQ(PathsByName(processes, "AfterFX.exe"), Paths());
}

TEST(Processes, AreAsTheLastSnapshotHasThem) {
    Machine machine;
    Processes processes;
    RunningProgram host(machine, R"(C:\Program Files\DaVinci Resolve\Resolve.exe)");
    EXPECT_EQ(PathsByName(processes, "Resolve.exe"), Paths());
    processes.Refresh();
    host.End();
    EXPECT_EQ(PathsByName(processes, "Resolve.exe").size(), 1U);
}

TEST(Processes, SeeEachOfTwoCopies) {
    Machine machine;
    const RunningProgram first(machine, R"(C:\Program Files\Adobe\Adobe After Effects 2021\AfterFX.exe)");
    const RunningProgram second(machine, R"(C:\Program Files\Adobe\Adobe After Effects 2022\AfterFX.exe)");
    const auto found = FoundByName(Processes(), "AfterFX.exe");
    ASSERT_EQ(found.size(), 2U);
    EXPECT_NE(found[0].processId, found[1].processId);
    EXPECT_NE(found[0].fullPath, found[1].fullPath);
}

TEST(Processes, SeeAProgramByItsFolder) {
    Machine machine;
    const std::string path = R"(C:\Program Files\Adobe Premiere Pro.exe\helper.exe)";
    const RunningProgram helper(machine, path);
    const auto found = FoundByPath(Processes(), "Adobe Premiere Pro.exe");
    ASSERT_EQ(found.size(), 1U);
    EXPECT_EQ(found[0].fullPath, path);
    EXPECT_EQ(found[0].name, "helper.exe");
}

TEST(Processes, NameAPathBeyondAsciiInUtf8) {
    Machine machine;
    const std::string path =
        "C:\\Program Files\\\xC3\x9C"
        "berblendung\\Schnitt\xC3\xBC.exe";
    const RunningProgram program(machine, path);
    const auto found = FoundByName(Processes(), "Schnitt\xC3\xBC.exe");
    ASSERT_EQ(found.size(), 1U);
    EXPECT_EQ(found[0].fullPath, path);
}

TEST(Processes, TakesMoreThanOneSnapshotOfManyPrograms) {
    Machine machine;
    Processes processes;
    int rounds = 0;
    for (; rounds < 5; ++rounds) {
        const RunningProgram program(machine, "C:\\Programs\\Round" + std::to_string(rounds) + ".exe");
        processes.Refresh();
        EXPECT_EQ(FoundByPath(processes, "C:\\Programs\\Round").size(), 1U);
    }
    EXPECT_EQ(rounds, 5);
}

std::string DisplayName(const std::string& name) {
    ProcessRecord record;
    record.name = name;
    record.fullPath = R"(C:\Program Files\)" + name;
    return HostDisplayName(record);
}

TEST(HostDisplayName, IsTheProductsNameForAfterEffects) {
    EXPECT_EQ(DisplayName("AfterFX.exe"), "After Effects");
}

TEST(HostDisplayName, TakesAnotherCaseOfAfterEffectsForAnyProgram) {
    EXPECT_EQ(DisplayName("afterfx.exe"), "afterfx");
    EXPECT_EQ(DisplayName("afterFX.exe"), "afterFX");
    EXPECT_EQ(DisplayName("AfterFX.EXE"), "AfterFX");
}

TEST(HostDisplayName, LosesTheExtensionOfAProgram) {
    EXPECT_EQ(DisplayName("Resolve.exe"), "Resolve");
    EXPECT_EQ(DisplayName("Adobe Premiere Pro.exe"), "Adobe Premiere Pro");
    EXPECT_EQ(DisplayName("AvidMediaComposer.ExE"), "AvidMediaComposer");
}

TEST(HostDisplayName, KeepsANameWithoutThatExtension) {
    EXPECT_EQ(DisplayName("EDIUS"), "EDIUS");
    EXPECT_EQ(DisplayName("Resolve.exe.old"), "Resolve.exe.old");
    EXPECT_EQ(DisplayName("Resolveexe"), "Resolveexe");
}

TEST(HostDisplayName, IsEmptyForAnExtensionAlone) {
    EXPECT_EQ(DisplayName(".exe"), "");
    EXPECT_EQ(DisplayName("four"), "four");
}

TEST(HostDisplayName, FailsForANameWithoutRoomForAnExtension) {
    int failures = 0;
    for (const char* name : {"", "a", "ab", "abc"}) {
        try {
            static_cast<void>(DisplayName(name));
        } catch (const std::out_of_range& error) {
            EXPECT_STREQ(error.what(), "invalid string position") << name;
            ++failures;
        }
    }
    EXPECT_EQ(failures, 4);
}

}  // namespace
