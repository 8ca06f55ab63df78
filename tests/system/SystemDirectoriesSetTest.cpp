#include <gtest/gtest.h>

#include "system/SystemDirectories.h"
#include "tests/support/Machine.h"

// Each test is the first in the process to ask for its directory, in an environment that names it.
namespace HV {
namespace {

class OnceReadDirectories : public testing::Test {
protected:
    /// Asks for `directory` while `variable` is set, and again after it has changed and gone.
    static void ExpectTheFirstValueToStay(SysDir directory, const char* variable) {
        SetEnvironmentVariableA(variable, R"(D:\First)");
        EXPECT_EQ(GetSystemDirectory(directory).string(), R"(D:\First)");
        SetEnvironmentVariableA(variable, R"(D:\Second)");
        EXPECT_EQ(GetSystemDirectory(directory).string(), R"(D:\First)");
        SetEnvironmentVariableA(variable, nullptr);
        EXPECT_EQ(GetSystemDirectory(directory).string(), R"(D:\First)");
    }

    Machine machine;
};

TEST_F(OnceReadDirectories, RememberProgramData) {
    ExpectTheFirstValueToStay(SysDir::ProgramData, "ProgramData");
    EXPECT_EQ(GetSystemDirectory(SysDir::Logs).string(), R"(\Halvorn\logs)");
}

TEST_F(OnceReadDirectories, RememberProgramFiles) {
    ExpectTheFirstValueToStay(SysDir::ProgramFiles, "PROGRAMFILES");
    EXPECT_EQ(GetDefaultInstallDirectory().string(), R"(D:\First)");
}

TEST_F(OnceReadDirectories, RememberProgramFiles32) {
    ExpectTheFirstValueToStay(SysDir::ProgramFiles32, "ProgramFiles(x86)");
}

}  // namespace
}  // namespace HV
