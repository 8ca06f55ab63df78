#pragma once

#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <vector>

#include "tools/hvpack/Commands.h"

/// A test that runs hvpack in this process, and has what the last run printed.
class HvpackRun : public testing::Test {
protected:
    /// Runs hvpack with these arguments and gives its exit status.
    int Run(const std::vector<std::string>& arguments) {
        std::ostringstream outStream;
        std::ostringstream errStream;
        const int status = HVPack::RunCommand(arguments, outStream, errStream);
        out = outStream.str();
        err = errStream.str();
        return status;
    }

    std::string out;
    std::string err;
};
