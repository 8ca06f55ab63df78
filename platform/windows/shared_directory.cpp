#include "platform/shared_directory.h"

#include <memory>

#include "platform/windows/filesystem.h"
#include "platform/windows/win32.h"

namespace platform {
namespace {

struct ClosesHandle {
    void operator()(HANDLE handle) const { CloseHandle(handle); }
};
struct FreesLocal {
    void operator()(void* block) const { LocalFree(block); }
};
struct FreesSid {
    void operator()(PSID sid) const { FreeSid(sid); }
};
using OwnedHandle = std::unique_ptr<void, ClosesHandle>;
using OwnedSid = std::unique_ptr<void, FreesSid>;
template <class Block>
using OwnedBlock = std::unique_ptr<Block, FreesLocal>;

/// The folder, open for reading and changing its access list; null when it cannot be opened.
OwnedHandle OpenFolder(const fs::path& folder) {
    const HANDLE handle = CreateFileW(folder.c_str(), READ_CONTROL | WRITE_DAC, 0, nullptr, OPEN_EXISTING,
                                      FILE_FLAG_BACKUP_SEMANTICS, nullptr);
    return OwnedHandle(handle != INVALID_HANDLE_VALUE ? handle : nullptr);
}

/// The well-known group that every user of the machine is in.
OwnedSid GroupOfUsers() {
    SID_IDENTIFIER_AUTHORITY authority = {SECURITY_NT_AUTHORITY};
    PSID sid = nullptr;
    const BOOL made = AllocateAndInitializeSid(&authority, 2, SECURITY_BUILTIN_DOMAIN_RID, DOMAIN_ALIAS_RID_USERS, 0, 0,
                                               0, 0, 0, 0, &sid);
    return OwnedSid(made ? sid : nullptr);
}

/// `list` with one entry more: the group may do everything, here and in what is later made here.
OwnedBlock<ACL> WithEverythingFor(PSID group, PACL list) {
    EXPLICIT_ACCESS_W entry = {};
    entry.grfAccessPermissions = GENERIC_ALL;
    entry.grfAccessMode = GRANT_ACCESS;
    entry.grfInheritance = SUB_CONTAINERS_AND_OBJECTS_INHERIT;
    entry.Trustee.TrusteeForm = TRUSTEE_IS_SID;
    entry.Trustee.TrusteeType = TRUSTEE_IS_GROUP;
    entry.Trustee.ptstrName = static_cast<wchar_t*>(group);
    PACL longer = nullptr;
    return OwnedBlock<ACL>(SetEntriesInAclW(1, &entry, list, &longer) == ERROR_SUCCESS ? longer : nullptr);
}

void LetUsersInto(HANDLE folder) {
    PACL list = nullptr;
    PSECURITY_DESCRIPTOR descriptor = nullptr;
    if (GetSecurityInfo(folder, SE_FILE_OBJECT, DACL_SECURITY_INFORMATION, nullptr, nullptr, &list, nullptr,
                        &descriptor) != ERROR_SUCCESS) {
        return;
    }
    // The list lies within it.
    const OwnedBlock<void> descriptorOwner(descriptor);
    const OwnedSid users = GroupOfUsers();
    const OwnedBlock<ACL> longer = users ? WithEverythingFor(users.get(), list) : nullptr;
    if (longer) {
        SetSecurityInfo(folder, SE_FILE_OBJECT, DACL_SECURITY_INFORMATION, nullptr, nullptr, longer.get(), nullptr);
    }
}

}  // namespace

// A folder that was there before belongs to the user who made it, and so does the decision which users may write into
// it.
void CreateSharedDirectory(const std::string& path) {
    const fs::path folder(path);
    if (!CreateDirectoryW(folder.c_str(), nullptr)) {
        return;
    }
    if (const OwnedHandle handle = OpenFolder(folder)) {
        LetUsersInto(handle.get());
    }
}

}  // namespace platform
