#pragma once

#include <gtest/gtest.h>

#include <string>

#include "hvframework/FileUtils.h"

/// The path of the executable `name` that the build made for the tests. It lies on the host's own file system.
inline std::string TestExecutable(const std::string& name) {
    return "Z:" HV_TEST_EXECUTABLES "/" + name + ".exe";
}

/// Its bytes.
inline std::string TestExecutableBytes(const std::string& name) {
    std::string bytes;
    EXPECT_EQ(HVL::FileUtils::ReadFileToString(TestExecutable(name), bytes), 0) << TestExecutable(name);
    EXPECT_FALSE(bytes.empty());
    return bytes;
}
