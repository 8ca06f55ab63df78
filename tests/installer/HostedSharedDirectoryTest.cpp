// What a shared folder means on the host's disk, which is ours to look at on this target alone.
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/xattr.h>

#include <fstream>

#include "installer/SharedDirectory.h"
#include "platform/filesystem.h"
#include "platform/win32.h"
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

TEST(HostedSharedDirectory, IsOpenToEverybodyWhicheverUserMakesIt) {
    Machine machine;
    const PrivateMaker maker;
    HV::CreateSharedDirectory(kFolder);
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
    HV::CreateSharedDirectory(kFolder);
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
    HV::CreateSharedDirectory(kFolder);
    EXPECT_EQ(RightsOf(machine, kFolder), 0700U);
}

TEST(HostedSharedDirectory, IsNotMadeOnABrokenDisk) {
    Machine machine;
    MachineFaults faults(machine);
    faults.FailNth(hosted::Operation::Create, 1);
    HV::CreateSharedDirectory(kFolder);
    EXPECT_FALSE(machine.Exists(kFolder));
}

TEST(HostedAccess, IsReadBackAsItWasGiven) {
    Machine machine;
    const PrivateMaker maker;
    HV::CreateSharedDirectory(kFolder);
    machine.HasFolder(R"(C:\private)");
    int folders = 0;
    for (const auto& [folder, open] :
         {std::pair(LR"(C:\ProgramData\Halvorn)", TRUE), std::pair(LR"(C:\private)", FALSE)}) {
        const HANDLE handle =
            CreateFileW(folder, READ_CONTROL, 0, nullptr, OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS, nullptr);
        PACL list = nullptr;
        PSECURITY_DESCRIPTOR descriptor = nullptr;
        ASSERT_EQ(GetSecurityInfo(handle, SE_FILE_OBJECT, DACL_SECURITY_INFORMATION, nullptr, nullptr, &list, nullptr,
                                  &descriptor),
                  DWORD{ERROR_SUCCESS});
        EXPECT_EQ(list->everybody, open);
        LocalFree(descriptor);
        EXPECT_TRUE(CloseHandle(handle));
        ++folders;
    }
    EXPECT_EQ(folders, 2);
}

TEST(HostedAccess, KnowsNoGroupButUsersAndNoRightButAll) {
    const Machine machine;
    SID_IDENTIFIER_AUTHORITY authority = {SECURITY_NT_AUTHORITY};
    PSID administrators = nullptr;
    PSID users = nullptr;
    ASSERT_TRUE(AllocateAndInitializeSid(&authority, 2, 32, 544, 0, 0, 0, 0, 0, 0, &administrators));
    // Numbers after the count do not count.
    ASSERT_TRUE(AllocateAndInitializeSid(&authority, 2, 32, 545, 7, 7, 7, 7, 7, 7, &users));
    EXPLICIT_ACCESS_W entry = {};
    entry.grfAccessPermissions = GENERIC_ALL;
    entry.grfAccessMode = GRANT_ACCESS;
    PACL list = nullptr;
    entry.Trustee.ptstrName = static_cast<wchar_t*>(administrators);
    EXPECT_NE(SetEntriesInAclW(1, &entry, nullptr, &list), DWORD{ERROR_SUCCESS});
    entry.Trustee.ptstrName = static_cast<wchar_t*>(users);
    entry.grfAccessPermissions = READ_CONTROL;
    EXPECT_NE(SetEntriesInAclW(1, &entry, nullptr, &list), DWORD{ERROR_SUCCESS});
    entry.grfAccessPermissions = GENERIC_ALL;
    ASSERT_EQ(SetEntriesInAclW(1, &entry, nullptr, &list), DWORD{ERROR_SUCCESS});
    EXPECT_TRUE(list->everybody);
    EXPECT_FALSE(list->inherited);
    LocalFree(list);
    FreeSid(administrators);
    FreeSid(users);
}

TEST(HostedAccess, OpensFoldersAlone) {
    Machine machine;
    machine.Has(R"(C:\file)", "x");
    for (const wchar_t* path : {LR"(C:\file)", LR"(C:\missing)"}) {
        EXPECT_EQ(CreateFileW(path, READ_CONTROL, 0, nullptr, OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS, nullptr),
                  INVALID_HANDLE_VALUE);
    }
    EXPECT_EQ(CreateFileW(LR"(C:\windows)", READ_CONTROL, 0, nullptr, 1, FILE_FLAG_BACKUP_SEMANTICS, nullptr),
              INVALID_HANDLE_VALUE);
    EXPECT_FALSE(CloseHandle(INVALID_HANDLE_VALUE));
    EXPECT_EQ(GetLastError(), DWORD{ERROR_INVALID_HANDLE});
    EXPECT_FALSE(CloseHandle(nullptr));
}

}  // namespace
