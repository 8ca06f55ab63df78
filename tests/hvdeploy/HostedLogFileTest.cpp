// The rights with which a log file is made: Windows knows none of them but that it may be written.
#include <gtest/gtest.h>
#include <sys/stat.h>

#include "tests/support/Machine.h"
#include "tests/support/RunProgram.h"

namespace {

TEST(HostedLogFile, MayBeReadByAllAndWrittenByItsOwner) {
    const Machine machine;
    const mode_t mask = umask(0);
    (void)RunProgram("hvdeploy", {"list=packages", R"(log=C:\Logs\run.log)"});
    umask(mask);
    struct stat status = {};
    ASSERT_EQ(stat(machine.HostName(R"(C:\Logs\run.log)").c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 07777U, 0644U);
}

}  // namespace
