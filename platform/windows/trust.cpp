#include "platform/windows/trust.h"

#include <sddl.h>

#include <array>
#include <vector>

#include "platform/windows/handle.h"

namespace platform {
namespace {

// The accounts that may do everything anyway: the administrators, the system, and the owner of Windows' own files.
constexpr std::array<const wchar_t*, 3> kMasters = {L"S-1-5-32-544", L"S-1-5-18",
                                                    L"S-1-5-80-956008885-3418522649-1831038044-1853292631-2271478464"};

std::wstring TextOf(PSID account) {
    wchar_t* text = nullptr;
    if (account == nullptr || !ConvertSidToStringSidW(account, &text)) {
        return {};
    }
    const std::wstring result(text);
    LocalFree(text);
    return result;
}

}  // namespace

bool IsAdministrator() {
    std::array<BYTE, SECURITY_MAX_SID_SIZE> administrators;
    DWORD size = administrators.size();
    BOOL member = FALSE;
    return CreateWellKnownSid(WinBuiltinAdministratorsSid, nullptr, administrators.data(), &size) &&
           CheckTokenMembership(nullptr, administrators.data(), &member) && member != FALSE;
}

std::wstring OwnAccount() {
    HANDLE opened = nullptr;
    if (!OpenProcessToken(GetCurrentProcess(), TOKEN_QUERY, &opened)) {
        return {};
    }
    const Handle token(opened);
    std::array<BYTE, sizeof(TOKEN_USER) + SECURITY_MAX_SID_SIZE> user;
    DWORD size = 0;
    if (!GetTokenInformation(token.Get(), TokenUser, user.data(), user.size(), &size)) {
        return {};
    }
    return TextOf(reinterpret_cast<const TOKEN_USER*>(user.data())->User.Sid);
}

std::wstring OwnerOf(HANDLE item) {
    PSID owner = nullptr;
    PSECURITY_DESCRIPTOR descriptor = nullptr;
    if (GetSecurityInfo(item, SE_FILE_OBJECT, OWNER_SECURITY_INFORMATION, &owner, nullptr, nullptr, nullptr,
                        &descriptor) != ERROR_SUCCESS) {
        return {};
    }
    std::wstring account = TextOf(owner);
    LocalFree(descriptor);
    return account;
}

bool HasTrustedOwner(HANDLE item) {
    const std::wstring account = OwnerOf(item);
    for (const wchar_t* master : kMasters) {
        if (account == master) {
            return true;
        }
    }
    return !account.empty() && !IsAdministrator() && account == OwnAccount();
}

}  // namespace platform
