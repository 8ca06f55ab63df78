// A link in the place of a folder. To a program of Wine each link of the host is the user's, whom an elevated program
// does not trust. Wine renames what a link names, and not the link: that it is moved aside,
// HostedGuardedFoldersTest.cpp tests.
#include <gtest/gtest.h>

#include "platform/guarded_folder.h"
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
