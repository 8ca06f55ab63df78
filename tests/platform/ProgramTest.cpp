#include "platform/program.h"

#include <gtest/gtest.h>

#include "tests/support/Machine.h"

namespace {

TEST(Program, HasItsFullPath) {
    const Machine machine;
    const std::string path = platform::ProgramPath();
    EXPECT_EQ(path.substr(1, 2), ":\\");
    EXPECT_NE(path.rfind("\\platform_process_tests"), std::string::npos) << path;
}

TEST(Program, HasNoResourceThatItsBuildHasNotGivenIt) {
    EXPECT_EQ(platform::CompiledResource(136, "HVSTRINGS_XML"), "");
}

}  // namespace
