// One payload, from its manifest to its last file. The engine's entry lines name the engine here too.
#include "hvdeploy/src/Placement.h"

#include <algorithm>

#include "hvdeploy/src/EntryTrace.h"
#include "hvdeploy/src/HeldTarget.h"
#include "hvdeploy/src/TargetDirectories.h"
#include "hvframework/FileUtils.h"
#include "hvframework/Log.h"
#include "system/SystemDirectories.h"

namespace HV {
namespace {

using namespace HVL;

Placed Failed() {
    return {kDeploymentFailed, {}};
}

// These two references say that the payload belongs where After Effects and Premiere of one generation both read.
bool MeansSharedFolder(const std::string& hostRef) {
    return hostRef == "aftereffects+premiere" || hostRef == "aftereffectsMC";
}

std::string TargetFolder(const HostRecord& host, const std::string& hostRef, DeploymentType deployment) {
    switch (deployment) {
        case DeploymentType::HostPresets:
            return host.hostPresetsPath;
        case DeploymentType::HostScripts:
            return host.hostScriptsPath;
        default:
            return host.hostPluginPath.empty() || MeansSharedFolder(hostRef) ? host.hostSharedPath
                                                                             : host.hostPluginPath;
    }
}

// Makes `parent` unless it is there. False, with a line in the log, when it is not there afterwards.
bool EnsureParent(const fs::path& path) {
    const std::string parent = path.string();
    HVL_LOG(Debug, "Checking dest path, creating if needed: " << path);
    if (FileUtils::DirectoryExists(parent)) {
        HVL_LOG(Debug, "Directory found at " << parent);
        return true;
    }
    HVL_LOG(Debug, "- Creating destination directory at " << parent);
    // What counts is whether the folder is there now.
    (void)FileUtils::CreateDirectories(parent);
    if (!FileUtils::DirectoryExists(parent)) {
        HVL_LOG(Error, "failed to create directory at " << parent);
        return false;
    }
    HVL_LOG(Debug, "Directory created.");
    return true;
}

bool Holds(const std::vector<std::string>& list, const std::string& text) {
    return std::find(list.begin(), list.end(), text) != list.end();
}

void Append(std::vector<std::string>& list, const std::vector<std::string>& more) {
    list.insert(list.end(), more.begin(), more.end());
}

}  // namespace

Placed Placement::Place(const Payload& payload, const Package& package) {
    if (payload.type == PayloadType::App || payload.deployment == DeploymentType::App) {
        return DeployAppPayload(payload, package);
    }
    if (payload.GoesIntoHosts()) {
        return DeployHostPayload(payload, package);
    }
    if (payload.deployment == DeploymentType::SysDir && !payload.sysdir.empty()) {
        return DeploySysDirPayload(payload, package);
    }
    // "run" among them: such a payload is there for its scripts.
    return {};
}

Placed Placement::DeployAppPayload(const Payload& payload, const Package& package) {
    TraceEntry(kDeployClass, "DeployAppPayload");
    if (!RequiredHostIsPresent(payload)) {
        return {};
    }
    HVL_LOG(Info, "Deploying application " << payload.id);
    fs::path destination;
    if (payload.sysdir.empty()) {
        destination = GetDefaultInstallDirectory();
    } else {
        const SysDir directory = SysDirFromKeyword(payload.sysdir);
        if (directory == SysDir::Unknown) {
            HVL_LOG(Error, "UNSUPPORTED payload sysdir value: " << payload.sysdir);
            return Failed();
        }
        destination = GetSystemDirectory(directory);
    }
    if (destination.empty()) {
        HVL_LOG(Error, "no install path found for app payload: " << payload.id);
        return Failed();
    }
    return DeployPayloadToDirectory(payload, package, destination);
}

Placed Placement::DeploySysDirPayload(const Payload& payload, const Package& package) {
    TraceEntry(kDeployClass, "DeploySysDirPayload");
    if (!RequiredHostIsPresent(payload)) {
        return {};
    }
    const SysDir directory = SysDirFromKeyword(payload.sysdir);
    if (!IsTargetDirectory(directory)) {
        HVL_LOG(Error, "UNSUPPORTED payload sysdir value: " << payload.sysdir);
        return Failed();
    }
    const fs::path destination = GetSystemDirectory(directory);
    if (destination.empty() && directory != SysDir::AbsolutePath) {
        HVL_LOG(Error, "no path found for target sysdir value: " << payload.sysdir);
        return Failed();
    }
    return DeployPayloadToDirectory(payload, package, destination);
}

// For these payloads hosts are a requirement and not targets: one of them has to be on the machine.
bool Placement::RequiredHostIsPresent(const Payload& payload) {
    if (payload.hosts.empty()) {
        return true;
    }
    const bool present =
        hosts_.DetectHosts() && std::any_of(payload.hosts.begin(), payload.hosts.end(),
                                            [&](const std::string& ref) { return hosts_.HasHost(ref); });
    if (!present) {
        HVL_LOG(Warn, "Required host application(s) not found for payload " << payload.id << ", skipping...");
    }
    return present;
}

Placed Placement::DeployHostPayload(const Payload& payload, const Package& package) {
    TraceEntry(kDeployClass, "DeployHostPayload");
    if (!hosts_.DetectHosts()) {
        HVL_LOG(Debug, "No hosts detected on machine, skipping payload " << payload.id);
        return {};
    }
    Placed all;
    std::vector<std::string> doneDirs;
    for (const std::string& hostRef : payload.hosts) {
        std::vector<HostRecord> matches;
        if (!hosts_.FindHosts(hostRef, matches)) {
            HVL_LOG(Debug, "No matching hosts found for payload " << payload.id << ", skipping...");
            continue;
        }
        for (const HostRecord& host : matches) {
            const std::string target = TargetFolder(host, hostRef, payload.deployment);
            // Several versions, and both hosts of a pair, point to one shared folder: it gets the files once.
            if (Holds(doneDirs, target)) {
                continue;
            }
            const Placed here = DeployPayloadToDirectory(payload, package, fs::path(target));
            all.result = here.result;
            all.leftOut |= here.leftOut;
            if (here.result != kPlaced) {
                break;
            }
            Append(all.files, here.files);
            doneDirs.push_back(target);
        }
    }
    // Fixed (contracts, placement): a failure does not stick. The result is that of the last attempt, and where a later
    // reference succeeds the payload has reached a host.
    if (!IsFailure(all.result) && !doneDirs.empty()) {
        all.result = kPlaced;
    }
    return all;
}

// Fixed (contracts, placement): an exception leaves the result as it stood, unlike a copy that reports its failure.
Placed Placement::DeployPayloadToDirectory(const Payload& payload, const Package& package, const fs::path& destDir) {
    TraceEntry(kDeployClass, "DeployPayloadToDirectory");
    Placed placed;
    try {
        CopyItems(payload, package, destDir, placed);
    } catch (const std::exception& error) {
        HVL_LOG(Error, "exception deploying payload " << payload.id << ": " << error.what());
        placed.leftOut = true;
    } catch (...) {
        HVL_LOG(Error, "unknown exception deploying payload " << payload.id);
        placed.leftOut = true;
    }
    return placed;
}

void Placement::CopyItems(const Payload& payload, const Package& package, const fs::path& destDir, Placed& placed) {
    std::vector<PayloadPathPair> items;
    package.GetPayloadPaths(destDir, payload, items);
    HVL_LOG(Debug, "Found " << items.size() << " items to copy.");
    HeldTarget target;
    for (const PayloadPathPair& item : items) {
        const fs::path parent = item.destination.parent_path();
        if (parent.empty()) {
            HVL_LOG(Warn, "Destination parent path is an empty string, cannot process this payload.");
            continue;
        }
        // What is missing is made below a folder that is held, and is then itself held.
        if (!target.HoldNearest(parent) || !EnsureParent(parent) || !target.HoldNearest(parent) || !CopyItem(item)) {
            placed.result = kDeploymentFailed;
            return;
        }
        placed.files.push_back(item.destination.string());
        rollback_.AddInstalledFile(package.manifest.packageIdentifier, payload.id, item.destination);
        placed.result = kPlaced;
    }
}

bool Placement::CopyItem(const PayloadPathPair& item) {
    const std::string source = item.source.string();
    const std::string destination = item.destination.string();
    if (fs::exists(item.destination) || fs::is_symlink(item.destination)) {
        rollback_.StashExistingFile(item.destination);
    }
    HVL_LOG(Debug, "Copying from: " << source << "\n to: " << destination);
    if (const int error = FileUtils::CopyFileOrDirectory(source, destination); error != 0) {
        HVL_LOG(Error, "File copy failed with error code " << error);
        return false;
    }
    if (!fs::exists(item.destination)) {
        // Fixed (contracts, placement): the item counts as copied all the same.
        HVL_LOG(Error, "Despite apparent success, no destination file exists at " << destination);
    }
    return true;
}

}  // namespace HV
