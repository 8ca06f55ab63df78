#pragma once

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "hvdeploy/src/Deploy.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"

/// An engine on a fresh machine, with its log.
class SideActionsTest : public testing::Test {
protected:
    SideActionsTest() { log.Clear(); }

    static std::string DebugLine(const std::string& message) { return "DEBUG hvdeploy-detail: " + message; }
    static std::string ErrorLine(const std::string& message) { return "ERROR hvdeploy-detail: " + message; }
    static std::string WarnLine(const std::string& message) { return "WARN hvdeploy-detail: " + message; }

    /// Installs one package as the only one of its phase.
    HV::EngineResult Deploy(const PackageBuilder& package) {
        return engine.DeployPackages({package.WriteTo(R"(C:\Packages)")});
    }

    /// The place of a line in the log, counted from 0. A line that is not there fails the test.
    std::size_t PlaceOf(const std::string& line) const {
        const std::vector<std::string> lines = log.Lines();
        for (std::size_t i = 0; i < lines.size(); ++i) {
            if (lines[i] == line) {
                return i;
            }
        }
        ADD_FAILURE() << line << " is not in the log:\n" << log.Text();
        return lines.size();
    }

    Machine machine;
    LogRecorder log;
    HV::Deploy engine{nullptr};
};
