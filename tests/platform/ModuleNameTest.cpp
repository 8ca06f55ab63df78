#include <gtest/gtest.h>

#include <string>

#include "platform/win32.h"
#include "tests/support/Machine.h"

namespace {

TEST(ModuleName, IsThisProgramsFullPath) {
    const Machine machine;
    char path[1024] = "";
    const DWORD length = GetModuleFileNameA(nullptr, path, sizeof path);
    ASSERT_EQ(length, std::string(path).size());
    EXPECT_EQ(std::string(path).substr(1, 2), ":\\");
    EXPECT_NE(std::string(path).rfind("\\platform_process_tests"), std::string::npos) << path;
}

TEST(ModuleName, IsCutWhereTheBufferEnds) {
    const Machine machine;
    char path[] = "xxxxxxxxx";
    EXPECT_EQ(GetModuleFileNameA(nullptr, path, 6), 6U);
    EXPECT_EQ(GetLastError(), static_cast<DWORD>(ERROR_INSUFFICIENT_BUFFER));
    EXPECT_EQ(std::string(path, 3).substr(1), ":\\");
    EXPECT_EQ(std::string(path + 6), "xxx");
}

TEST(Resources, AreNotFoundInAProgramWithoutAny) {
    EXPECT_EQ(FindResourceA(nullptr, MAKEINTRESOURCEA(136), "HVSTRINGS_XML"), nullptr);
}

}  // namespace
