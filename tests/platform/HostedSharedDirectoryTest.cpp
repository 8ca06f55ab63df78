// What a shared folder means on the host's disk, which is ours to look at on this target alone.
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/xattr.h>

#include <fstream>

#include "platform/filesystem.h"
#include "platform/shared_directory.h"
#include "tests/support/Faults.h"
#include "tests/support/Machine.h"

namespace {

constexpr const char* kFolder = R"(C:\ProgramData\Halvorn)";

mode_t RightsOf(const Machine& machine, const std::string& path) {
    struct stat status {};
    EXPECT_EQ(stat(machine.HostName(path).c_str(), &status), 0) << path;
    return status.st_mode & 0777;
}

/// What this process makes is, unless its folder says otherwise, its user's alone.
class PrivateMaker {
public:
    PrivateMaker() : before_(umask(077)) {}
    ~PrivateMaker() { umask(before_); }
    PrivateMaker(const PrivateMaker&) = delete;
    PrivateMaker& operator=(const PrivateMaker&) = delete;

private:
    mode_t before_;
};

TEST(HostedSharedDirectory, IsOpenToEverybodyWhoeverMakesIt) {
    Machine machine;
    const PrivateMaker maker;
    platform::CreateSharedDirectory(kFolder);
    EXPECT_EQ(RightsOf(machine, kFolder), 0777U);
}

/// Whether a folder of this disk can have rights that it hands on, tried on one of the test's own.
bool DiskHandsRightsOn(Machine& machine) {
    machine.HasFolder(R"(C:\tried)");
    // A version, then for the owner, the group and the others: what it is about, every right, nobody in particular.
    const unsigned char rights[] = {2,    0, 0, 0,                          //
                                    0x01, 0, 7, 0, 0xFF, 0xFF, 0xFF, 0xFF,  //
                                    0x04, 0, 7, 0, 0xFF, 0xFF, 0xFF, 0xFF,  //
                                    0x20, 0, 7, 0, 0xFF, 0xFF, 0xFF, 0xFF};
    const std::string folder = machine.HostName(R"(C:\tried)");
    return setxattr(folder.c_str(), "system.posix_acl_default", rights, sizeof rights, 0) == 0;
}

TEST(HostedSharedDirectory, HandsItsAccessOnWhereTheDiskKnowsHow) {
    Machine machine;
    const PrivateMaker maker;
    platform::CreateSharedDirectory(kFolder);
    const bool handsOn = DiskHandsRightsOn(machine);
    std::ofstream(machine.HostName(R"(C:\ProgramData\Halvorn\a.log)")) << "line";
    fs::create_directory(fs::path(R"(C:\ProgramData\Halvorn\more)"));
    EXPECT_EQ(RightsOf(machine, R"(C:\ProgramData\Halvorn\a.log)"), handsOn ? 0666U : 0600U);
    EXPECT_EQ(RightsOf(machine, R"(C:\ProgramData\Halvorn\more)"), handsOn ? 0777U : 0700U);
}

TEST(HostedSharedDirectory, StaysAsItWasWhenItWasThere) {
    Machine machine;
    const PrivateMaker maker;
    machine.HasFolder(kFolder);
    platform::CreateSharedDirectory(kFolder);
    EXPECT_EQ(RightsOf(machine, kFolder), 0700U);
}

TEST(HostedSharedDirectory, IsNotMadeOnABrokenDisk) {
    Machine machine;
    MachineFaults faults(machine);
    faults.FailNth(hosted::Operation::Create, 1);
    platform::CreateSharedDirectory(kFolder);
    EXPECT_FALSE(machine.Exists(kFolder));
}

}  // namespace
