#include <gtest/gtest.h>

#include "system/SystemDirectories.h"
#include "tests/support/Machine.h"

// Each test is the first in the process to ask for its directory, in an environment that names an empty text.
namespace HV {
namespace {

class DirectoriesThatAreSetToNothing : public testing::Test {
protected:
    /// Asks for `directory` while `variable` is empty, and again after it has been set.
    static void ExpectTheFallbackToStay(SysDir directory, const char* variable, const char* fallback) {
        SetEnvironmentVariableA(variable, "");
        EXPECT_EQ(GetSystemDirectory(directory).string(), fallback);
        SetEnvironmentVariableA(variable, R"(D:\Later)");
        EXPECT_EQ(GetSystemDirectory(directory).string(), fallback);
    }

    Machine machine;
};

TEST_F(DirectoriesThatAreSetToNothing, FallBackToTheUsualProgramData) {
    ExpectTheFallbackToStay(SysDir::ProgramData, "ProgramData", R"(C:\ProgramData)");
}

TEST_F(DirectoriesThatAreSetToNothing, FallBackToTheUsualProgramFiles) {
    ExpectTheFallbackToStay(SysDir::ProgramFiles, "PROGRAMFILES", R"(C:\Program Files)");
}

TEST_F(DirectoriesThatAreSetToNothing, FallBackToTheUsualProgramFiles32) {
    ExpectTheFallbackToStay(SysDir::ProgramFiles32, "ProgramFiles(x86)", R"(C:\Program Files (x86))");
}

}  // namespace
}  // namespace HV
