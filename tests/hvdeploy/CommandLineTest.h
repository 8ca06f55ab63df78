#pragma once

#include <gtest/gtest.h>

#include <cstdint>
#include <functional>
#include <string>
#include <vector>

#include "hvdeploy/src/HVDeployCLI.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"

/// One report, and how a failed test shows it.
struct Report {
    std::uint32_t percent;
    std::string message;
    std::int32_t error;
    bool operator==(const Report&) const = default;
};

inline std::ostream& operator<<(std::ostream& stream, const Report& report) {
    return stream << "{" << report.percent << ", \"" << report.message << "\", " << report.error << "}";
}

inline constexpr const char* kFailureMessage = "An error occurred during installation.";
inline constexpr std::uint32_t kFailureMark = 0xFFFFFFFF;

/// Keeps every report in order. `onReport`, when set, sees each message first and may throw.
class RecordingListener : public HV::ProgressListenerInterface {
public:
    void update(std::uint32_t percent, const char* message, std::int32_t error) override {
        reports.push_back({percent, message != nullptr ? message : "(null)", error});
        if (onReport) {
            onReport(reports.back().message);
        }
    }
    std::vector<Report> reports;
    std::function<void(const std::string&)> onReport;
};

/// A front end on a fresh machine whose log exists already, as it does in the wizard.
class CommandLineTest : public testing::Test {
protected:
    static std::string DebugLine(const std::string& message) { return "DEBUG hvdeploy-detail: " + message; }
    static std::string InfoLine(const std::string& message) { return "INFO hvdeploy-detail: " + message; }
    static std::string ErrorLine(const std::string& message) { return "ERROR hvdeploy-detail: " + message; }

    /// Parses and runs a line that has to parse; gives what the run gives.
    int Run(const std::string& line) {
        const int parsed = cli.ParseLine(line);
        EXPECT_EQ(parsed, 0) << log.Text();
        return parsed == 0 ? cli.Run() : parsed;
    }

    /// A package whose one payload places C:\ProgramData\Halvorn\<name>.txt.
    static PackageBuilder Product(const std::string& name) {
        return PackageBuilder("com.halvorn." + name)
            .Version("1.0")
            .Payload("resource")
            .To("programdata", "Halvorn")
            .File(name + ".txt", "text of " + name);
    }
    static std::string PlaceOf(const std::string& name) { return R"(C:\ProgramData\Halvorn\)" + name + ".txt"; }

    Machine machine;
    LogRecorder log;
    RecordingListener listener;
    HV::DeployCLI cli{&listener};
};
