// What the system is asked for when a shared folder is made, and what happens when it refuses a step.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "platform/shared_directory.h"
#include "platform/windows/filesystem.h"
#include "platform/windows/win32.h"

namespace scripted {
namespace {

/// The system's answers, and what it was asked.
struct AccessScript {
    std::string refuses;  // the call that fails
    std::vector<std::string> calls;

    std::wstring made;
    std::wstring opened;
    std::vector<DWORD> openArguments;
    std::vector<DWORD> readArguments;
    std::vector<int> authority;
    std::vector<DWORD> group;
    std::vector<DWORD> entry;
    std::vector<DWORD> writeArguments;
};
AccessScript script;

ACL oldList{};
ACL newList{};
int folderHandle = 0;
int descriptorBlock = 0;
int groupBlock = 0;

bool Answers(const std::string& call) {
    script.calls.push_back(call);
    return script.refuses != call;
}

BOOL MakeFolder(const wchar_t* path, LPSECURITY_ATTRIBUTES security) {
    EXPECT_EQ(security, nullptr);
    script.made = path;
    return Answers("CreateDirectoryW");
}

HANDLE OpenFolder(const wchar_t* path, DWORD access, DWORD share, LPSECURITY_ATTRIBUTES security, DWORD disposition,
                  DWORD flags, HANDLE templateFile) {
    EXPECT_EQ(security, nullptr);
    EXPECT_EQ(templateFile, nullptr);
    script.opened = path;
    script.openArguments = {access, share, disposition, flags};
    return Answers("CreateFileW") ? &folderHandle : INVALID_HANDLE_VALUE;
}

DWORD ReadAccess(HANDLE folder, SE_OBJECT_TYPE type, SECURITY_INFORMATION wanted, PSID*, PSID*, PACL* list, PACL*,
                 PSECURITY_DESCRIPTOR* descriptor) {
    EXPECT_EQ(folder, &folderHandle);
    script.readArguments = {static_cast<DWORD>(type), wanted};
    if (!Answers("GetSecurityInfo")) {
        return ERROR_ACCESS_DENIED;
    }
    *list = &oldList;
    *descriptor = &descriptorBlock;
    return ERROR_SUCCESS;
}

BOOL MakeGroup(PSID_IDENTIFIER_AUTHORITY authority, BYTE count, DWORD first, DWORD second, DWORD, DWORD, DWORD, DWORD,
               DWORD, DWORD, PSID* sid) {
    script.authority.assign(std::begin(authority->Value), std::end(authority->Value));
    script.group = {count, first, second};
    *sid = &groupBlock;
    return Answers("AllocateAndInitializeSid");
}

DWORD AddEntries(DWORD count, EXPLICIT_ACCESS_W* entries, PACL list, PACL* result) {
    EXPECT_EQ(list, &oldList);
    EXPECT_EQ(static_cast<void*>(entries[0].Trustee.ptstrName), &groupBlock);
    EXPECT_EQ(entries[0].Trustee.TrusteeForm, TRUSTEE_IS_SID);
    script.entry = {count, entries[0].grfAccessPermissions, static_cast<DWORD>(entries[0].grfAccessMode),
                    entries[0].grfInheritance};
    if (!Answers("SetEntriesInAclW")) {
        return ERROR_INVALID_PARAMETER;
    }
    *result = &newList;
    return ERROR_SUCCESS;
}

DWORD WriteAccess(HANDLE folder, SE_OBJECT_TYPE type, SECURITY_INFORMATION given, PSID owner, PSID group, PACL list,
                  PACL watched) {
    EXPECT_EQ(folder, &folderHandle);
    EXPECT_EQ(list, &newList);
    EXPECT_TRUE(owner == nullptr && group == nullptr && watched == nullptr);
    script.writeArguments = {static_cast<DWORD>(type), given};
    return Answers("SetSecurityInfo") ? DWORD{ERROR_SUCCESS} : DWORD{ERROR_ACCESS_DENIED};
}

BOOL CloseFolder(HANDLE handle) {
    EXPECT_EQ(handle, &folderHandle);
    return Answers("CloseHandle");
}

HLOCAL FreeBlock(HLOCAL block) {
    Answers(block == &newList ? "LocalFree list" : block == &descriptorBlock ? "LocalFree descriptor" : "LocalFree?");
    return nullptr;
}

PVOID FreeGroup(PSID sid) {
    EXPECT_EQ(sid, &groupBlock);
    Answers("FreeSid");
    return nullptr;
}

}  // namespace
}  // namespace scripted

#define CreateDirectoryW scripted::MakeFolder
#define CreateFileW scripted::OpenFolder
#define GetSecurityInfo scripted::ReadAccess
#define AllocateAndInitializeSid scripted::MakeGroup
#define SetEntriesInAclW scripted::AddEntries
#define SetSecurityInfo scripted::WriteAccess
#define CloseHandle scripted::CloseFolder
#define LocalFree scripted::FreeBlock
#define FreeSid scripted::FreeGroup

// The operation under test, with the system's answers replaced.
#define CreateSharedDirectory CreateScriptedDirectory
#include "platform/windows/shared_directory.cpp"  // NOLINT(bugprone-suspicious-include): its calls are to be replaced.

namespace {

using scripted::AccessScript;
using scripted::script;
using Calls = std::vector<std::string>;
using Numbers = std::vector<DWORD>;

/// What is called when a call refuses.
Calls CallsWhen(const std::string& refuses) {
    script = AccessScript();
    script.refuses = refuses;
    platform::CreateScriptedDirectory(R"(C:\shared)");
    return script.calls;
}

TEST(SharedDirectoryCalls, AsksForOneEntryThatGrantsUsersEverything) {
    CallsWhen("");
    EXPECT_EQ(script.made, LR"(C:\shared)");
    EXPECT_EQ(script.opened, LR"(C:\shared)");
    EXPECT_EQ(script.openArguments, (Numbers{0x60000, 0, 3, 0x2000000}));
    EXPECT_EQ(script.readArguments, (Numbers{1, 4}));
    EXPECT_EQ(script.authority, (std::vector<int>{0, 0, 0, 0, 0, 5}));
    EXPECT_EQ(script.group, (Numbers{2, 32, 545}));
    EXPECT_EQ(script.entry, (Numbers{1, 0x10000000, 1, 3}));
    EXPECT_EQ(script.writeArguments, (Numbers{1, 4}));
}

TEST(SharedDirectoryCalls, ReleasesWhatItWasGiven) {
    EXPECT_EQ(CallsWhen(""), (Calls{"CreateDirectoryW", "CreateFileW", "GetSecurityInfo", "AllocateAndInitializeSid",
                                    "SetEntriesInAclW", "SetSecurityInfo", "LocalFree list", "FreeSid",
                                    "LocalFree descriptor", "CloseHandle"}));
}

TEST(SharedDirectoryCalls, DoesNothingToAFolderThatItHasNotMade) {
    EXPECT_EQ(CallsWhen("CreateDirectoryW"), Calls{"CreateDirectoryW"});
}

TEST(SharedDirectoryCalls, EndsInSilenceAtTheStepThatIsRefused) {
    EXPECT_EQ(CallsWhen("CreateFileW"), (Calls{"CreateDirectoryW", "CreateFileW"}));
    EXPECT_EQ(CallsWhen("GetSecurityInfo"),
              (Calls{"CreateDirectoryW", "CreateFileW", "GetSecurityInfo", "CloseHandle"}));
    EXPECT_EQ(CallsWhen("AllocateAndInitializeSid"),
              (Calls{"CreateDirectoryW", "CreateFileW", "GetSecurityInfo", "AllocateAndInitializeSid",
                     "LocalFree descriptor", "CloseHandle"}));
    EXPECT_EQ(CallsWhen("SetEntriesInAclW"),
              (Calls{"CreateDirectoryW", "CreateFileW", "GetSecurityInfo", "AllocateAndInitializeSid",
                     "SetEntriesInAclW", "FreeSid", "LocalFree descriptor", "CloseHandle"}));
    EXPECT_EQ(CallsWhen("SetSecurityInfo").size(), 10U);
}

}  // namespace
