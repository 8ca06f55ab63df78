#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace HV {

/// One running process.
struct ProcessRecord {
    std::uint32_t processId = 0;
    std::uint32_t ownerTag = 0;  // the start of the token's user, or 0; carried along and read by nobody
    std::string name;            // file name of the program, or empty
    std::string fullPath;        // its full path, or empty
};

/// A snapshot of the running processes that this program may inspect, and two questions about it.
///
/// Only as fresh as the last Refresh(), and of the system's list the first 1024 are looked at. Not thread-safe: the
/// main thread owns it.
class Processes {
public:
    /// Takes a first snapshot.
    Processes();
    virtual ~Processes() = default;

    /// Takes a new snapshot. Returns 0, or -1 with no records when the list of processes cannot be had.
    int Refresh();

    /// Replaces `out` with the records whose name equals `name`, case included; returns whether there are any.
    bool FindByName(const std::string& name, std::vector<ProcessRecord>& out) const;

    /// Replaces `out` with the records whose path contains `fragment`, case included; returns whether there are any. An
    /// empty fragment is contained in every path.
    bool FindByPath(const std::string& fragment, std::vector<ProcessRecord>& out) const;

private:
    std::vector<ProcessRecord> records;
};

/// A process as a message names it: "After Effects" for AfterFX.exe, else the file name without ".exe". Throws
/// std::out_of_range for a name of fewer than four characters.
[[nodiscard]] std::string HostDisplayName(const ProcessRecord& record);

}  // namespace HV
