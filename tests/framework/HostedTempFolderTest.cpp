// What a private folder is on the host: accounts and modes are the host's own.
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include "hvframework/TempFolder.h"
#include "tests/support/Faults.h"
#include "tests/support/Machine.h"

namespace HVL {

TEST(HostedTempFolder, IsOfThisAccountAndForNobodyElseWhateverTheMask) {
    Machine machine;
    const mode_t mask = umask(0);
    const TempFolder folder("tmp");
    umask(mask);
    struct stat found {};
    ASSERT_EQ(stat(machine.HostName(folder.Path()).c_str(), &found), 0);
    EXPECT_EQ(found.st_mode & 07777U, 0700U);
    EXPECT_EQ(found.st_uid, geteuid());
}

TEST(HostedTempFolder, IsNoneWhenTheMachineRefusesIt) {
    const Machine machine;
    MachineFaults faults(machine);
    faults.FailNth(hosted::Operation::Create, 1);
    EXPECT_FALSE(TempFolder("tmp").IsThere());
}

}  // namespace HVL
