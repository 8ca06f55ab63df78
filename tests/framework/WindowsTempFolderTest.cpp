// What a private folder is on Windows. Wine turns access lists into the host's mode bits and reads those back as other
// entries, so what is asked is what the list does, and not how it is written: it lets nobody in but this account, the
// administrators and the system.
#include <gtest/gtest.h>

#include <array>
#include <string>

#include "hvframework/TempFolder.h"
#include "platform/utf8.h"
#include "platform/win32.h"
#include "tests/support/Machine.h"

namespace HVL {
namespace {

using Account = std::array<BYTE, SECURITY_MAX_SID_SIZE>;

Account WellKnown(WELL_KNOWN_SID_TYPE type) {
    Account account;
    DWORD size = account.size();
    EXPECT_TRUE(CreateWellKnownSid(type, nullptr, account.data(), &size));
    return account;
}

/// What the list of the folder lets `account` do.
DWORD Allowed(PACL list, Account account) {
    DWORD allowed = 0;
    for (DWORD i = 0; i < list->AceCount; ++i) {
        void* found = nullptr;
        EXPECT_TRUE(GetAce(list, i, &found));
        const auto* entry = static_cast<ACCESS_ALLOWED_ACE*>(found);
        if (entry->Header.AceType == ACCESS_ALLOWED_ACE_TYPE &&
            EqualSid(const_cast<DWORD*>(&entry->SidStart), account.data())) {
            allowed |= entry->Mask;
        }
    }
    return allowed;
}

class ListOf {
public:
    explicit ListOf(const std::string& folder) {
        EXPECT_EQ(GetNamedSecurityInfoW(platform::WideFromUtf8(folder).c_str(), SE_FILE_OBJECT,
                                        DACL_SECURITY_INFORMATION, nullptr, nullptr, &list_, nullptr, &descriptor_),
                  static_cast<DWORD>(ERROR_SUCCESS));
    }
    ~ListOf() { LocalFree(descriptor_); }
    ListOf(const ListOf&) = delete;
    ListOf& operator=(const ListOf&) = delete;
    [[nodiscard]] PACL Get() const { return list_; }

private:
    PACL list_ = nullptr;
    PSECURITY_DESCRIPTOR descriptor_ = nullptr;
};

}  // namespace

TEST(WindowsTempFolder, LetsNobodyElseIn) {
    Machine machine;
    const TempFolder folder("tmp");
    ASSERT_TRUE(folder.IsThere());
    const ListOf list(folder.Path());
    ASSERT_NE(list.Get(), nullptr) << "no list lets everybody in";
    for (const auto others : {WinWorldSid, WinAuthenticatedUserSid, WinBuiltinUsersSid, WinInteractiveSid}) {
        EXPECT_EQ(Allowed(list.Get(), WellKnown(others)), 0U) << others;
    }
    // A folder like any other is open here, so the question can be answered otherwise.
    machine.HasFolder(R"(C:\Open)");
    EXPECT_NE(Allowed(ListOf(R"(C:\Open)").Get(), WellKnown(WinWorldSid)), 0U);
}

TEST(WindowsTempFolder, CanBeRenamedAndDeletedByNobodyWhileItIsHeld) {
    const Machine machine;
    const TempFolder folder("tmp");
    const std::wstring path = platform::WideFromUtf8(folder.Path());
    EXPECT_FALSE(MoveFileW(path.c_str(), (path + L".away").c_str()));
    EXPECT_EQ(GetLastError(), static_cast<DWORD>(ERROR_SHARING_VIOLATION));
    EXPECT_FALSE(RemoveDirectoryW(path.c_str()));
    EXPECT_TRUE(machine.Exists(folder.Path()));
}

}  // namespace HVL
