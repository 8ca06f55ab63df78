#include <gtest/gtest.h>

#include <string_view>

#include "system/RegistryKey.h"
#include "tests/support/Machine.h"

// Types that Wine refuses to read even without a type restriction, as Windows does not: only the hosted machine can
// show what becomes of them.
namespace HV {
namespace {

class RareRegistryTypes : public testing::Test {
protected:
    RareRegistryTypes() { EXPECT_TRUE(Win32RegKeyHandle::OpenPath(HKEY_CURRENT_USER, R"(Software\Test)", test, true)); }

    std::int32_t Read(DWORD type, std::string_view data) {
        EXPECT_EQ(RegSetValueExA(test.key, "v", 0, type, reinterpret_cast<const BYTE*>(data.data()),
                                 static_cast<DWORD>(data.size())),
                  ERROR_SUCCESS);
        return test.ReadValue("", "v", text);
    }

    Machine machine;
    Win32RegKeyHandle test;
    std::string text = "before";
};

TEST_F(RareRegistryTypes, GiveALinkAsAString) {
    EXPECT_EQ(Read(REG_LINK, std::string_view("target\0more", 11)), static_cast<std::int32_t>(REG_LINK));
    EXPECT_EQ(text, "target");
}

TEST_F(RareRegistryTypes, GiveOnlyTheTypeOfABigEndianNumber) {
    EXPECT_EQ(Read(REG_DWORD_BIG_ENDIAN, "\x01\x02\x03\x04"), static_cast<std::int32_t>(REG_DWORD_BIG_ENDIAN));
    EXPECT_EQ(text, "");
}

}  // namespace
}  // namespace HV
