#pragma once

#include <filesystem>
#include <map>
#include <set>
#include <string>
#include <vector>

#include "platform/hosted/ignoring_case.h"
#include "platform/hosted/registry_text.h"

/// What Machine needs of the target that it runs on. The parts that differ stand in TargetHosted.cpp and
/// TargetWindows.cpp, one of which is built.

struct RegistryData {
    std::uint32_t type = 0;
    std::string data;
    bool operator==(const RegistryData&) const = default;
};
using RegistryValues = std::map<std::string, RegistryData, hosted::LessIgnoringCase>;
/// Full key paths to their values.
using RegistryContent = std::map<std::string, RegistryValues, hosted::LessIgnoringCase>;

RegistryContent ContentOf(const std::vector<hosted::RegistryChange>& changes);

/// Items of drive C: full Windows path, in Windows 10's spelling, to whether it is a folder.
using Items = std::map<std::string, bool>;

class MachineTarget {
public:
    /// A fresh machine becomes the current one; it is cleared away in the end, and the environment put back.
    MachineTarget();
    ~MachineTarget();
    MachineTarget(const MachineTarget&) = delete;
    MachineTarget& operator=(const MachineTarget&) = delete;

    [[nodiscard]] std::filesystem::path HostPath(const std::string& path) const;
    [[nodiscard]] std::string Variable(const std::string& name) const;
    void LoadRegistry(const std::vector<hosted::RegistryChange>& changes, const std::string& text);
    /// Keys and values that a fresh machine does not have.
    [[nodiscard]] RegistryContent AddedRegistry() const;
    /// The items that a fresh machine does not have, the Temp folder's left out.
    [[nodiscard]] Items AddedItems() const;
    /// The names in the folder for temporary files that a fresh machine does not have.
    [[nodiscard]] std::set<std::string> AddedTempEntries() const;

private:
    static std::map<std::string, std::string> Environment();
    [[nodiscard]] std::filesystem::path DriveC() const;
    /// Everything on drive C, without what is in those folders of `base` that hold nothing of interest.
    [[nodiscard]] Items ListItems(const Items& base) const;
    [[nodiscard]] std::set<std::string> ListTemp() const;

    std::string folder_;
    std::map<std::string, std::string> environment_;
    Items baseItems_;
    std::set<std::string> baseTemp_;
};
