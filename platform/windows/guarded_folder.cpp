#include "platform/guarded_folder.h"

#include "platform/windows/handle.h"

#include <accctrl.h>
#include <aclapi.h>

#include <array>
#include <cstddef>

#include "platform/filesystem.h"
#include "platform/windows/open_folder.h"
#include "platform/windows/trust.h"

namespace platform {
namespace {

constexpr const wchar_t* kGuardedRights = L"O:BAD:P(A;OICI;FA;;;BA)(A;OICI;FA;;;SY)(A;OICI;0x1200a9;;;BU)";

/// Rights that an administrator has and that rest until they are asked for: to open a folder whatever its list says,
/// and to make it the administrators'. They rest again when the object ends.
class WithRestingRights {
public:
    WithRestingRights() {
        HANDLE opened = nullptr;
        if (!OpenProcessToken(GetCurrentProcess(), TOKEN_ADJUST_PRIVILEGES | TOKEN_QUERY, &opened)) {
            return;
        }
        token_ = Handle(opened);
        Rights wanted{};
        for (const wchar_t* name : {L"SeBackupPrivilege", L"SeRestorePrivilege", L"SeTakeOwnershipPrivilege"}) {
            LUID_AND_ATTRIBUTES& right = wanted.rights[wanted.count];
            right.Attributes = SE_PRIVILEGE_ENABLED;
            wanted.count += LookupPrivilegeValueW(nullptr, name, &right.Luid) ? 1 : 0;
        }
        DWORD size = 0;
        AdjustTokenPrivileges(token_.Get(), FALSE, reinterpret_cast<TOKEN_PRIVILEGES*>(&wanted), sizeof before_,
                              reinterpret_cast<TOKEN_PRIVILEGES*>(&before_), &size);
    }
    ~WithRestingRights() {
        if (token_.IsOpen()) {
            AdjustTokenPrivileges(token_.Get(), FALSE, reinterpret_cast<TOKEN_PRIVILEGES*>(&before_), 0, nullptr,
                                  nullptr);
        }
    }
    WithRestingRights(const WithRestingRights&) = delete;
    WithRestingRights& operator=(const WithRestingRights&) = delete;

private:
    /// TOKEN_PRIVILEGES with room for these.
    struct Rights {
        DWORD count = 0;
        std::array<LUID_AND_ATTRIBUTES, 3> rights;
    };

    Handle token_;
    Rights before_{};
};

/// This call leaves alone what is in the folder, unlike SetSecurityInfo(), which would hand the list on.
bool TakeOver(HANDLE folder) {
    const Descriptor rights(kGuardedRights);
    return rights.Get() != nullptr &&
           SetKernelObjectSecurity(
               folder, OWNER_SECURITY_INFORMATION | DACL_SECURITY_INFORMATION | PROTECTED_DACL_SECURITY_INFORMATION,
               rights.Get()) &&
           IsOwn(folder);
}

bool IsFolder(HANDLE item) {
    FILE_BASIC_INFO found{};
    return GetFileInformationByHandleEx(item, FileBasicInfo, &found, sizeof found) &&
           (found.FileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
}

/// Whether this entry lets somebody write who may be anybody: the users, everyone, whoever is signed in or at the
/// screen.
bool LetsEverybodyWrite(const ACE_HEADER& entry) {
    constexpr DWORD kWriting =
        FILE_WRITE_DATA | FILE_APPEND_DATA | WRITE_DAC | WRITE_OWNER | GENERIC_WRITE | GENERIC_ALL;
    if (entry.AceType != ACCESS_ALLOWED_ACE_TYPE) {
        return false;
    }
    const auto& allowed = reinterpret_cast<const ACCESS_ALLOWED_ACE&>(entry);
    auto* const account = const_cast<DWORD*>(&allowed.SidStart);
    if ((allowed.Mask & kWriting) == 0) {
        return false;
    }
    constexpr std::array kEverybody{WinBuiltinUsersSid, WinWorldSid, WinAuthenticatedUserSid, WinInteractiveSid};
    for (const WELL_KNOWN_SID_TYPE group : kEverybody) {
        if (IsWellKnownSid(account, group)) {
            return true;
        }
    }
    return false;
}

/// An item without a list lets everybody do everything, and so one may whose list cannot be read.
bool EverybodyMayWrite(HANDLE item) {
    PACL list = nullptr;
    PSECURITY_DESCRIPTOR read = nullptr;
    if (GetSecurityInfo(item, SE_FILE_OBJECT, DACL_SECURITY_INFORMATION, nullptr, nullptr, &list, nullptr, &read) !=
            ERROR_SUCCESS ||
        list == nullptr) {
        LocalFree(read);
        return true;
    }
    bool everybody = false;
    for (DWORD at = 0; at < list->AceCount; ++at) {
        void* entry = nullptr;
        everybody |= GetAce(list, at, &entry) && LetsEverybodyWrite(*static_cast<ACE_HEADER*>(entry));
    }
    LocalFree(read);
    return everybody;
}

}  // namespace

bool CanGuardFolders() {
    return IsAdministrator();
}

std::unique_ptr<HeldFolder> GuardFolder(const std::string& path, Guarding& outcome) {
    const std::wstring name = fs::path(path).native();
    const WithRestingRights rights;
    Handle folder = OpenToHold(name, FILE_LIST_DIRECTORY | READ_CONTROL | WRITE_DAC | WRITE_OWNER);
    if (!folder.IsOpen()) {
        const bool missing = GetFileAttributesW(name.c_str()) == INVALID_FILE_ATTRIBUTES;
        outcome = missing ? Guarding::Missing : Guarding::Failed;
        return nullptr;
    }
    if (IsLinkAt(name, folder.Get())) {
        outcome = HasTrustedOwner(folder.Get()) ? Guarding::Linked : Guarding::Planted;
        return nullptr;
    }
    outcome = IsFolder(folder.Get()) && TakeOver(folder.Get()) ? Guarding::Done : Guarding::Failed;
    return outcome == Guarding::Done ? std::make_unique<OpenFolder>(path, std::move(folder)) : nullptr;
}

std::unique_ptr<HeldFolder> MakeGuardedFolder(const std::string& path, NoFolder& reason) {
    return MakeFolder(fs::path(path).native(), kGuardedRights, reason);
}

bool IsPlanted(const std::string& path) {
    const Handle item = OpenItself(fs::path(path).native(), READ_CONTROL, kEverySharing);
    if (!item.IsOpen()) {
        return GetLastError() != ERROR_FILE_NOT_FOUND && GetLastError() != ERROR_PATH_NOT_FOUND;
    }
    BY_HANDLE_FILE_INFORMATION found{};
    return !IsOwn(item.Get()) || !GetFileInformationByHandle(item.Get(), &found) || found.nNumberOfLinks > 1 ||
           EverybodyMayWrite(item.Get());
}

}  // namespace platform
