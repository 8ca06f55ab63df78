#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <boost/make_shared.hpp>
#include <functional>
#include <string>
#include <utility>
#include <vector>

#include "hvdeploy/src/Deploy.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"

inline constexpr const char* kPackages = R"(C:\Packages)";
inline constexpr const char* kHistory = R"(C:\ProgramData\Halvorn\.hvdeploy\history\)";

/// Keeps every report as "percent message", and lets a test act at each of them.
class RecordingListener : public HV::ProgressListenerInterface {
public:
    void update(std::uint32_t percent, const char* message, std::int32_t error) override {
        reports.push_back(std::to_string(percent) + " " + (message != nullptr ? message : "") +
                          (error != 0 ? " error " + std::to_string(error) : ""));
        if (onReport) {
            onReport(reports.size());
        }
    }

    std::vector<std::string> reports;
    std::function<void(std::size_t)> onReport;
};

/// Finds the hosts that a test says are there.
class TestHosts : public HV::HostAppDetector {
public:
    explicit TestHosts(std::vector<HV::HostRecord> records) : records_(std::move(records)) {}
    bool Run(std::vector<HV::HostRecord>& hosts) override {
        hosts = records_;
        return !hosts.empty();
    }

private:
    std::vector<HV::HostRecord> records_;
};

/// A host whose folders are named after it: `C:\Hosts\ae22\Plug-ins` and so on, with MediaCore shared by all.
inline HV::HostRecord TestHost(HV::HostType type, const std::string& abbreviation, const std::string& name) {
    HV::HostRecord host;
    host.hostType = type;
    host.hostAbbreviation = abbreviation;
    host.hostPluginPath = R"(C:\Hosts\)" + name + R"(\Plug-ins)";
    host.hostSharedPath = R"(C:\Hosts\MediaCore)";
    host.hostPresetsPath = R"(C:\Hosts\)" + name + R"(\Presets)";
    host.hostScriptsPath = R"(C:\Hosts\)" + name + R"(\Scripts)";
    return host;
}
inline HV::HostRecord AfterEffects(const std::string& name) {
    return TestHost(HV::HostType::AfterEffects, "aftereffects", name);
}
inline HV::HostRecord Premiere(const std::string& name) {
    return TestHost(HV::HostType::Premiere, "premiere", name);
}

inline std::string DebugLine(const std::string& message) {
    return "DEBUG hvdeploy-detail: " + message;
}
inline std::string InfoLine(const std::string& message) {
    return "INFO hvdeploy-detail: " + message;
}
inline std::string WarnLine(const std::string& message) {
    return "WARN hvdeploy-detail: " + message;
}
inline std::string ErrorLine(const std::string& message) {
    return "ERROR hvdeploy-detail: " + message;
}
inline std::string CritLine(const std::string& message) {
    return "CRIT hvdeploy-detail: " + message;
}

/// An engine on a fresh machine, with its log and its reports.
class EngineTest : public testing::Test {
protected:
    EngineTest() { log.Clear(); }

    static std::string InProgramData(const std::string& path) { return R"(C:\ProgramData\)" + path; }

    /// A package that places Halvorn\<name>.dll below ProgramData.
    static PackageBuilder Placing(const std::string& name, const std::string& bytes = "new") {
        return PackageBuilder("com.halvorn." + name)
            .Payload("resource")
            .To("programdata", "Halvorn")
            .File(name + ".dll", bytes);
    }
    /// A package that passes its check and fails as soon as its payload is placed.
    static PackageBuilder Failing(const std::string& name) {
        return PackageBuilder("com.halvorn." + name).Payload("resource").To("nowhere").File("lost.dll", "x");
    }
    static std::string Placed(const std::string& name) { return InProgramData("Halvorn\\" + name + ".dll"); }

    static void Ships(const PackageBuilder& package) { (void)package.WriteTo(kPackages); }

    HV::EngineResult InstallFolder(const std::vector<std::string>& skip = {}) {
        return engine.DeployPackagesFromDirectory(fs::path(kPackages), skip);
    }
    /// Installs the packages in this order, as one phase.
    HV::EngineResult Install(const std::vector<PackageBuilder>& packages) {
        std::vector<fs::path> paths;
        for (const PackageBuilder& package : packages) {
            paths.push_back(package.WriteTo(kPackages));
        }
        return engine.DeployPackages(paths);
    }
    void HasHosts(const std::vector<HV::HostRecord>& hosts) {
        engine.HostCheck().AddDetector(boost::make_shared<TestHosts>(hosts));
    }
    void HasInstalled(const std::string& stem) { machine.Has(kHistory + stem + "_hvmanifest.xml", "<hvmanifest/>"); }

    bool HasRolledBack() const { return log.Has(DebugLine("HV::DeployRollback::HV::DeployRollback::Rollback")); }
    bool HasReported(const std::string& report) const {
        return std::find(listener.reports.begin(), listener.reports.end(), report) != listener.reports.end();
    }

    Machine machine;
    LogRecorder log;
    RecordingListener listener;
    HV::Deploy engine{&listener};
};
