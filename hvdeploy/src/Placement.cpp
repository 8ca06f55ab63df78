// One payload: into which folders its files go, and the copying itself.
#include <algorithm>
#include <iostream>

#include "hvdeploy/src/Deploy.h"
#include "hvdeploy/src/EntryTrace.h"
#include "hvdeploy/src/HeldTarget.h"
#include "hvdeploy/src/TargetDirectories.h"
#include "hvframework/FileUtils.h"
#include "hvframework/Log.h"
#include "system/SystemDirectories.h"

namespace HV {
namespace {

using namespace HVL;

bool IsHostPayload(const Payload& payload) {
    return payload.type == PayloadType::Plugin || payload.deployment == DeploymentType::HostPlugins ||
           payload.deployment == DeploymentType::HostPresets || payload.deployment == DeploymentType::HostScripts;
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

void Append(std::vector<std::string>& list, const std::vector<std::string>& more) {
    list.insert(list.end(), more.begin(), more.end());
}

}  // namespace

EngineResult Deploy::DeployPayload(const Payload& payload, const Package& package,
                                   std::vector<std::string>& installedFiles) {
    TraceEntry(kDeployClass, "DeployPayload");
    HVL_LOG(Debug, "HV::Deploy::DeployPayload " << payload.id << " fromPackage " << package.GetName());
    if (verbose) {
        std::cout << "[v] Deploying payload " << payload.id << std::endl;
    }
    if (payload.type == PayloadType::App || payload.deployment == DeploymentType::App) {
        return DeployAppPayload(payload, package, installedFiles);
    }
    if (IsHostPayload(payload)) {
        return DeployHostPayload(payload, package, installedFiles);
    }
    if (payload.deployment == DeploymentType::SysDir && !payload.sysdir.empty()) {
        return DeploySysDirPayload(payload, package, installedFiles);
    }
    // "run" among them: such a payload is there for its scripts.
    return kNothingDone;
}

// For these payloads hosts are a requirement and not targets: one of them has to be on the machine.
bool Deploy::RequiredHostIsPresent(const Payload& payload) {
    if (payload.hosts.empty()) {
        return true;
    }
    const bool present =
        hostCheck.DetectHosts() && std::any_of(payload.hosts.begin(), payload.hosts.end(),
                                               [&](const std::string& ref) { return hostCheck.HasHost(ref); });
    if (!present) {
        HVL_LOG(Warn, "Required host application(s) not found for payload " << payload.id << ", skipping...");
    }
    return present;
}

EngineResult Deploy::DeployAppPayload(const Payload& payload, const Package& package,
                                      std::vector<std::string>& installedFiles) {
    TraceEntry(kDeployClass, "DeployAppPayload");
    if (!RequiredHostIsPresent(payload)) {
        return kNothingDone;
    }
    HVL_LOG(Info, "Deploying application " << payload.id);
    fs::path destination;
    if (payload.sysdir.empty()) {
        destination = GetDefaultInstallDirectory();
    } else {
        const SysDir directory = SysDirFromKeyword(payload.sysdir);
        if (directory == SysDir::Unknown) {
            HVL_LOG(Error, "UNSUPPORTED payload sysdir value: " << payload.sysdir);
            return kDeploymentFailed;
        }
        destination = GetSystemDirectory(directory);
    }
    if (destination.empty()) {
        HVL_LOG(Error, "no install path found for app payload: " << payload.id);
        return kDeploymentFailed;
    }
    std::vector<std::string> items;
    const EngineResult result = DeployPayloadToDirectory(payload, package, destination, items);
    Append(installedFiles, items);
    return result;
}

EngineResult Deploy::DeploySysDirPayload(const Payload& payload, const Package& package,
                                         std::vector<std::string>& installedFiles) {
    TraceEntry(kDeployClass, "DeploySysDirPayload");
    if (!RequiredHostIsPresent(payload)) {
        return kNothingDone;
    }
    const SysDir directory = SysDirFromKeyword(payload.sysdir);
    if (!IsTargetDirectory(directory)) {
        HVL_LOG(Error, "UNSUPPORTED payload sysdir value: " << payload.sysdir);
        return kDeploymentFailed;
    }
    const fs::path destination = GetSystemDirectory(directory);
    if (destination.empty() && directory != SysDir::AbsolutePath) {
        HVL_LOG(Error, "no path found for target sysdir value: " << payload.sysdir);
        return kDeploymentFailed;
    }
    return DeployPayloadToDirectory(payload, package, destination, installedFiles);
}

EngineResult Deploy::DeployHostPayload(const Payload& payload, const Package& package,
                                       std::vector<std::string>& installedFiles) {
    TraceEntry(kDeployClass, "DeployHostPayload");
    if (!hostCheck.DetectHosts()) {
        HVL_LOG(Debug, "No hosts detected on machine, skipping payload " << payload.id);
        return kNothingDone;
    }
    std::vector<std::string> doneDirs;
    EngineResult result = kNothingDone;
    for (const std::string& hostRef : payload.hosts) {
        std::vector<HostRecord> matches;
        if (!hostCheck.FindHosts(hostRef, matches)) {
            HVL_LOG(Debug, "No matching hosts found for payload " << payload.id << ", skipping...");
            continue;
        }
        for (const HostRecord& host : matches) {
            const std::string target = TargetFolder(host, hostRef, payload.deployment);
            // Several versions, and both hosts of a pair, point to one shared folder: it gets the files once.
            if (std::find(doneDirs.begin(), doneDirs.end(), target) != doneDirs.end()) {
                continue;
            }
            std::vector<std::string> items;
            result = DeployPayloadToDirectory(payload, package, fs::path(target), items);
            if (result != kPlaced) {
                break;
            }
            Append(installedFiles, items);
            doneDirs.push_back(target);
        }
    }
    // Fixed (contracts, placement): a failure does not stick. `result` is that of the last attempt, and where a later
    // reference succeeds the payload has reached a host.
    const bool placed = !IsFailure(result) && !doneDirs.empty();
    return placed ? kPlaced : result;
}

// Fixed (contracts, placement): an exception leaves the result as it stood, unlike a copy that reports its failure.
EngineResult Deploy::DeployPayloadToDirectory(Payload payload, const Package& package, const fs::path& destDir,
                                              std::vector<std::string>& installedFiles) {
    TraceEntry(kDeployClass, "DeployPayloadToDirectory");
    EngineResult result = kNothingDone;
    try {
        CopyPayloadItems(payload, package, destDir, installedFiles, result);
    } catch (const std::exception& error) {
        HVL_LOG(Error, "exception deploying payload " << payload.id << ": " << error.what());
    } catch (...) {
        HVL_LOG(Error, "unknown exception deploying payload " << payload.id);
    }
    return result;
}

void Deploy::CopyPayloadItems(const Payload& payload, const Package& package, const fs::path& destDir,
                              std::vector<std::string>& installedFiles, EngineResult& result) {
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
        if (!target.HoldNearest(parent) || !EnsureParent(parent) || !target.HoldNearest(parent) ||
            !CopyPayloadItem(item)) {
            result = kDeploymentFailed;
            return;
        }
        installedFiles.push_back(item.destination.string());
        rollback.AddInstalledFile(package.manifest.packageIdentifier, payload.id, item.destination);
        result = kPlaced;
    }
}

bool Deploy::CopyPayloadItem(const PayloadPathPair& item) {
    const std::string source = item.source.string();
    const std::string destination = item.destination.string();
    if (fs::exists(item.destination) || fs::is_symlink(item.destination)) {
        rollback.StashExistingFile(item.destination);
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
