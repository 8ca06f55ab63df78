#include "platform/hosted/access_control.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <string>
#include <string_view>
#include <vector>

#include "platform/hosted/handle.h"
#include "platform/hosted/machine.h"

namespace {

using hosted::HandleKind;
using hosted::Machine;
using hosted::Operation;
using Stat = struct stat;

constexpr mode_t everything = 0777;

/// A group of the platform: its authority and up to eight numbers, the unused ones 0.
struct Group {
    std::array<BYTE, 6> authority;
    std::array<DWORD, 8> numbers;
    bool operator==(const Group&) const = default;
};
constexpr Group users{SECURITY_NT_AUTHORITY, {SECURITY_BUILTIN_DOMAIN_RID, DOMAIN_ALIAS_RID_USERS}};

/// The rights that the host gives to whatever is made in a folder, in the form in which its file systems take them:
/// a version, and an entry each for the owner, the group and the others.
constexpr const char* defaultRights = "system.posix_acl_default";
struct RightsEntry {
    std::uint16_t tag;
    std::uint16_t rights;
    std::uint32_t id;
};
struct Rights {
    std::uint32_t version;
    RightsEntry entries[3];
};
constexpr std::uint32_t nobodyInParticular = 0xFFFFFFFF;
constexpr Rights everythingToEverybody{
    2, {{0x01, 7, nobodyInParticular}, {0x04, 7, nobodyInParticular}, {0x20, 7, nobodyInParticular}}};

BOOL Fail(int error) {
    switch (error) {
        case EEXIST:
            SetLastError(static_cast<DWORD>(ERROR_ALREADY_EXISTS));
            break;
        case ENOENT:
        case ENOTDIR:
            SetLastError(static_cast<DWORD>(ERROR_PATH_NOT_FOUND));
            break;
        case ENOSPC:
            SetLastError(static_cast<DWORD>(ERROR_DISK_FULL));
            break;
        default:
            SetLastError(static_cast<DWORD>(ERROR_ACCESS_DENIED));
            break;
    }
    return FALSE;
}

/// Blocks of this source are all the C library's, since LocalFree() cannot tell them apart.
ACL* NewList(ACL content) {
    auto* list = static_cast<ACL*>(std::malloc(sizeof(ACL)));
    if (list != nullptr) {
        *list = content;
    }
    return list;
}

ACL ListOf(int folder, mode_t mode) {
    Rights found{};
    const bool inherited = fgetxattr(folder, defaultRights, &found, sizeof found) == sizeof found &&
                           std::all_of(std::begin(found.entries), std::end(found.entries),
                                       [](const RightsEntry& entry) { return entry.rights == 7; });
    return {(mode & everything) == everything, inherited};
}

bool GrantsEverythingToUsers(const EXPLICIT_ACCESS_W& entry) {
    return entry.grfAccessMode == GRANT_ACCESS && entry.grfAccessPermissions == GENERIC_ALL &&
           entry.Trustee.TrusteeForm == TRUSTEE_IS_SID &&
           *reinterpret_cast<const Group*>(entry.Trustee.ptstrName) == users;
}

}  // namespace

BOOL CreateDirectoryW(const wchar_t* path, LPSECURITY_ATTRIBUTES /*security*/) {
    const std::string hostPath = Machine::Current().HostPath(std::wstring_view(path));
    if (const int error = Machine::Current().GetFaults().Check(Operation::Create, hostPath)) {
        return Fail(error);
    }
    return mkdir(hostPath.c_str(), everything) == 0 ? TRUE : Fail(errno);
}

HANDLE CreateFileW(const wchar_t* path, DWORD /*access*/, DWORD /*share*/, LPSECURITY_ATTRIBUTES /*security*/,
                   DWORD disposition, DWORD flags, HANDLE /*templateFile*/) {
    if (disposition != OPEN_EXISTING || flags != FILE_FLAG_BACKUP_SEMANTICS) {
        SetLastError(static_cast<DWORD>(ERROR_INVALID_PARAMETER));
        return INVALID_HANDLE_VALUE;
    }
    const std::string hostPath = Machine::Current().HostPath(std::wstring_view(path));
    const int descriptor = open(hostPath.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (descriptor < 0) {
        Fail(errno);
        return INVALID_HANDLE_VALUE;
    }
    return hosted::HandleOf(HandleKind::Folder, descriptor);
}

DWORD GetSecurityInfo(HANDLE folder, SE_OBJECT_TYPE /*type*/, SECURITY_INFORMATION /*wanted*/, PSID* /*owner*/,
                      PSID* /*group*/, PACL* list, PACL* /*watched*/, PSECURITY_DESCRIPTOR* descriptor) {
    const int number = hosted::NumberOf(folder, HandleKind::Folder);
    Stat status{};
    if (number < 0 || fstat(number, &status) != 0) {
        return static_cast<DWORD>(ERROR_INVALID_HANDLE);
    }
    *list = NewList(ListOf(number, status.st_mode));
    *descriptor = *list;
    return *list != nullptr ? static_cast<DWORD>(ERROR_SUCCESS) : static_cast<DWORD>(ERROR_ACCESS_DENIED);
}

DWORD SetSecurityInfo(HANDLE folder, SE_OBJECT_TYPE /*type*/, SECURITY_INFORMATION /*given*/, PSID /*owner*/,
                      PSID /*group*/, PACL list, PACL /*watched*/) {
    const int number = hosted::NumberOf(folder, HandleKind::Folder);
    if (number < 0) {
        return static_cast<DWORD>(ERROR_INVALID_HANDLE);
    }
    if (list->everybody != FALSE && fchmod(number, everything) != 0) {
        return static_cast<DWORD>(ERROR_ACCESS_DENIED);
    }
    if (list->inherited != FALSE) {
        // A file system without default rights refuses; the folder itself is open all the same.
        fsetxattr(number, defaultRights, &everythingToEverybody, sizeof everythingToEverybody, 0);
    }
    return static_cast<DWORD>(ERROR_SUCCESS);
}

DWORD SetEntriesInAclW(DWORD count, PEXPLICIT_ACCESS_W entries, PACL list, PACL* result) {
    ACL content = list != nullptr ? *list : ACL{FALSE, FALSE};
    for (DWORD at = 0; at < count; ++at) {
        if (!GrantsEverythingToUsers(entries[at])) {
            return static_cast<DWORD>(ERROR_INVALID_PARAMETER);
        }
        content.everybody = TRUE;
        content.inherited |= (entries[at].grfInheritance & SUB_CONTAINERS_AND_OBJECTS_INHERIT) != 0;
    }
    *result = NewList(content);
    return *result != nullptr ? static_cast<DWORD>(ERROR_SUCCESS) : static_cast<DWORD>(ERROR_ACCESS_DENIED);
}

HLOCAL LocalFree(HLOCAL block) {
    std::free(block);
    return nullptr;
}

BOOL AllocateAndInitializeSid(PSID_IDENTIFIER_AUTHORITY authority, BYTE count, DWORD first, DWORD second, DWORD third,
                              DWORD fourth, DWORD fifth, DWORD sixth, DWORD seventh, DWORD eighth, PSID* sid) {
    auto* group = new Group{{}, {first, second, third, fourth, fifth, sixth, seventh, eighth}};
    std::copy(std::begin(authority->Value), std::end(authority->Value), group->authority.begin());
    std::fill(group->numbers.begin() + std::min<std::ptrdiff_t>(count, 8), group->numbers.end(), 0);
    *sid = group;
    return TRUE;
}

PVOID FreeSid(PSID sid) {
    delete static_cast<Group*>(sid);
    return nullptr;
}
