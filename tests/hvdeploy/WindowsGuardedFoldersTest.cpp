// A link in the place of a folder. To a program of Wine each link of the host is the user's, whom an elevated program
// does not trust. Wine renames what a link names, and not the link: that it is moved aside,
// HostedGuardedFoldersTest.cpp tests.
#include <gtest/gtest.h>

#include "hvdeploy/src/GuardedFolders.h"
#include "hvdeploy/src/Logging.h"
#include "platform/guarded_folder.h"
#include "platform/win32.h"
#include "tests/support/HostLink.h"
#include "tests/support/Machine.h"

TEST(WindowsGuardedFolder, IsNotTakenOverThroughALink) {
    Machine machine;
    machine.HasFolder(R"(C:\Elsewhere)");
    const HostLink link(machine, R"(C:\ProgramData\Halvorn)", R"(C:\Elsewhere)");
    platform::Guarding outcome = platform::Guarding::Done;
    EXPECT_EQ(platform::GuardFolder(R"(C:\ProgramData\Halvorn)", outcome), nullptr);
    EXPECT_EQ(outcome, platform::Guarding::Planted);
}

TEST(WindowsGuardedFolder, IsTakenOverOrToldToBeMissing) {
    Machine machine;
    platform::Guarding outcome = platform::Guarding::Done;
    EXPECT_EQ(platform::GuardFolder(R"(C:\ProgramData\Halvorn)", outcome), nullptr);
    EXPECT_EQ(outcome, platform::Guarding::Missing);
    machine.Has(R"(C:\ProgramData\Halvorn)", "a file");
    EXPECT_EQ(platform::GuardFolder(R"(C:\ProgramData\Halvorn)", outcome), nullptr);
    EXPECT_EQ(outcome, platform::Guarding::Failed);
    machine.HasFolder(R"(C:\Elsewhere)");
    EXPECT_NE(platform::GuardFolder(R"(C:\Elsewhere)", outcome), nullptr);
    EXPECT_EQ(outcome, platform::Guarding::Done);
}

TEST(WindowsGuardedFolder, IsNotUsedWhileSomebodyKeepsItToHimself) {
    Machine machine;
    const std::string properties = HV::LoggingConfigOfTheMachine();
    machine.Has(properties, "planted");
    machine.HasFolder(R"(C:\ProgramData\Halvorn\uninstall)");
    const HANDLE kept = CreateFileA(R"(C:\ProgramData\Halvorn\Installer)", FILE_LIST_DIRECTORY, 0, nullptr,
                                    OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS, nullptr);
    ASSERT_NE(kept, INVALID_HANDLE_VALUE);
    {
        const HV::GuardedFolders guarded;
        EXPECT_TRUE(HV::IsRefused(properties));
        EXPECT_FALSE(HV::IsRefused(R"(C:\ProgramData\Halvorn\uninstall\uninstall-x.bat)"));
    }
    CloseHandle(kept);
    const HV::GuardedFolders guarded;
    EXPECT_FALSE(HV::IsRefused(properties));
}
