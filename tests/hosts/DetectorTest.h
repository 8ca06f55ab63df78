#pragma once

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "hosts/HostRecord.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"

/// A clean machine, the keys that a test puts into its registry, and one detector to look at it.
template <class Detector>
class DetectorTest : public testing::Test {
protected:
    using Values = std::vector<std::pair<std::string, std::string>>;

    /// A key below HKEY_LOCAL_MACHINE\SOFTWARE with these texts.
    void HasKey(const std::string& path, const Values& texts = {}) {
        std::string registry = Opening(path);
        for (const auto& [name, text] : texts) {
            registry += "\"" + name + "\"=\"" + Escaped(text) + "\"\n";
        }
        machine.Loads(registry);
    }

    /// A value of any type, in the words of registry text (`dword:00000005`).
    void HasValue(const std::string& path, const std::string& name, const std::string& data) {
        machine.Loads(Opening(path) + "\"" + name + "\"=" + data + "\n");
    }

    /// Runs the detector on a list that holds a record of an earlier run.
    bool Run() {
        hosts.assign(1, HV::HostRecord{});
        hosts.front().hostDisplayName = "left over";
        return Detector().Run(hosts);
    }

    [[nodiscard]] std::vector<std::string> Versions() const {
        std::vector<std::string> versions;
        for (const HV::HostRecord& host : hosts) {
            versions.push_back(host.hostVersion);
        }
        return versions;
    }

    Machine machine;
    LogRecorder log;
    std::vector<HV::HostRecord> hosts;

private:
    static std::string Opening(const std::string& path) {
        return "REGEDIT4\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\" + path + "]\n";
    }

    static std::string Escaped(const std::string& text) {
        std::string escaped;
        for (const char c : text) {
            if (c == '\\' || c == '"') {
                escaped += '\\';
            }
            escaped += c;
        }
        return escaped;
    }
};
