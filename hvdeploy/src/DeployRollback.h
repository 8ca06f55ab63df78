#pragma once

#include <map>
#include <string>
#include <unordered_set>
#include <utility>
#include <vector>

#include "hvframework/TempFolder.h"
#include "platform/filesystem.h"

namespace HV {

/// The stash: where the machine's own files wait until the run has proved itself.
///
/// One stash serves the whole run, all of its packages and phases. Nothing here decides whether to go back; the engine
/// does, and calls Rollback(). The records live in memory only. Not thread-safe: the deployment's thread owns it.
class DeployRollback {
public:
    /// Makes the stash folder in the user's temporary folder, for this run alone (TempFolder). Throws
    /// std::runtime_error when it cannot: without a way back there is no way forward.
    DeployRollback();

    /// Deletes the stash with all that is left in it.
    virtual ~DeployRollback();

    DeployRollback(const DeployRollback&) = delete;
    DeployRollback& operator=(const DeployRollback&) = delete;

    /// Moves the file or folder at `path` aside. On failure it stays where it is, the log says so, and it cannot be put
    /// back later.
    void StashExistingFile(const fs::path& path);

    /// Remembers that the payload `payloadId` of the package `packageId` placed `path`. A path that this payload has
    /// reported already is kept once.
    void AddInstalledFile(const std::string& packageId, const std::string& payloadId, const fs::path& path);

    /// Removes all that was installed, then puts back all that was stashed. Goes on past every failure.
    void Rollback();

    /// Whether anything was reported as placed.
    bool HasInstalledFiles() const { return !installedFiles.empty(); }
    /// Whether Rollback() has run.
    bool HasRolledBack() const { return rolledBack; }

    /// Whether the run was asked to talk on standard output. The front end sets it on the engine and on the stash
    /// alike; the stash has nothing to say there so far.
    void SetVerbose(bool on) { verbose = on; }

private:
    /// What one payload placed, in order, with the keys by which a repeated path is recognised.
    struct InstalledFiles {
        std::vector<fs::path> paths;
        std::unordered_set<std::wstring> keys;
    };

    void RemoveInstalledFiles();
    void RestoreStashedFiles();
    void DeleteStash();

    HVL::TempFolder stashFolder;
    std::vector<std::pair<fs::path, fs::path>> stashedFiles;  // original place, place in the stash
    fs::path stashDir;
    std::map<std::string, std::map<std::string, InstalledFiles>> installedFiles;
    bool rolledBack = false;
    bool verbose = false;
};

}  // namespace HV
