// The walk over the payloads of one package: what is passed over, what is placed, and what goes with a placed payload.
#include <iostream>

#include "hvdeploy/src/Deploy.h"
#include "hvdeploy/src/EntryTrace.h"
#include "hvdeploy/src/Placement.h"
#include "hvframework/FileUtils.h"
#include "hvframework/Log.h"
#include "system/RegistryKey.h"

namespace HV {
namespace {

constexpr int kNoDecision = -1;

bool KeyExists(const std::string& target) {
    HKEY hive = nullptr;
    std::string path;
    Win32RegKeyHandle key;
    const bool opened =
        Win32RegKeyHandle::ParseRegistryPath(target, hive, path) && Win32RegKeyHandle::OpenPath(hive, path, key, false);
    key.Close();
    return opened;
}

bool Holds(const Precondition& condition) {
    return condition.type == PreconditionType::RegKey ? KeyExists(condition.target)
                                                      : HVL::FileUtils::FileExists(condition.target);
}

std::size_t CountForThisSystem(const std::vector<Payload>& payloads) {
    std::size_t count = 0;
    for (const Payload& payload : payloads) {
        count += payload.MatchesOS() ? 1 : 0;
    }
    return count;
}

bool IsPassedOver(const Payload& payload) {
    if (!payload.MatchesOS()) {
        HVL_LOG(Debug, "Skipping Payload (reason: non-supported OS): " << payload.id << " ");
        return true;
    }
    if (!payload.preconditions.empty() && Deploy::CheckPayloadPreconditions(payload) == 0) {
        HVL_LOG(Debug, "Precondition negative result: skipping payload " << payload.id);
        return true;
    }
    return false;
}

// The code of the first script that fails, else 0.
EngineResult RunScripts(const std::vector<PayloadScript>& scripts, const Package& package) {
    for (const PayloadScript& script : scripts) {
        if (const EngineResult result = Deploy::RunPreOrPostflight(script, package); IsFailure(result)) {
            return result;
        }
    }
    return kNothingDone;
}

// The registry entries of a placed payload and then its postflights; gives `result`, or the code of the first failure.
EngineResult FinishPayload(const Payload& payload, const Package& package, EngineResult result) {
    for (const RegistryEntry& entry : payload.registryEntries) {
        if (const EngineResult written = Deploy::MakeRegistryEntry(entry); IsFailure(written)) {
            return written;
        }
    }
    const EngineResult scripts = RunScripts(payload.postflights, package);
    return IsFailure(scripts) ? scripts : result;
}

// Adds the shortcuts of a placed payload to the files of `all`, and gives its result, or the code of the first one that
// has to succeed and does not. Such a one ends this loop, but not the walk: the next payload that is placed may put its
// own result in the place of the failure.
EngineResult MakeShortcuts(const Payload& payload, const std::vector<std::string>& placedFiles, Placed& all) {
    for (const Shortcut& shortcut : payload.shortcuts) {
        const EngineResult made = Deploy::MakeShortcut(shortcut, placedFiles, all.files);
        if (IsFailure(made) && shortcut.failOnError) {
            return made;
        }
    }
    return all.result;
}

}  // namespace

Placed Deploy::DeployPackagePayloads(const Package& package, float progressPoints, const std::string& message) {
    TraceEntry(kDeployClass, "DeployPackagePayloads");
    PackagePoints points(progress, progressPoints, CountForThisSystem(package.manifest.payloads));
    Placed all;
    for (const Payload& payload : package.manifest.payloads) {
        if (IsPassedOver(payload)) {
            continue;
        }
        // A failing preflight does not keep the payload from being placed, and a placement that succeeds takes the
        // place of the script's code: only a payload that placed nothing shows it.
        if (const EngineResult scripts = RunScripts(payload.preflights, package); IsFailure(scripts)) {
            all.result = scripts;
        }
        const Placed placed = DeployPayload(payload, package);
        all.files.insert(all.files.end(), placed.files.begin(), placed.files.end());
        leftOut |= placed.leftOut;
        points.SpendShare(message);
        if (placed.result != kNothingDone) {
            all.result = placed.result;
        }
        if (IsFailure(placed.result)) {
            break;
        }
        if (IsCancelled()) {
            HVL_LOG(Info, "Installation cancelled");
            all.result = kDeploymentFailed;
            break;
        }
        if (placed.result == kPlaced) {
            all.result = FinishPayload(payload, package, all.result);
        }
        if (IsFailure(all.result)) {
            break;
        }
        if (placed.result == kPlaced) {
            all.result = MakeShortcuts(payload, placed.files, all);
        }
    }
    return all;
}

Placed Deploy::DeployPayload(const Payload& payload, const Package& package) {
    TraceEntry(kDeployClass, "DeployPayload");
    HVL_LOG(Debug, "HV::Deploy::DeployPayload " << payload.id << " fromPackage " << package.GetName());
    if (verbose) {
        std::cout << "[v] Deploying payload " << payload.id << std::endl;
    }
    return Placement(hostCheck, rollback).Place(payload, package);
}

int Deploy::CheckPayloadPreconditions(const Payload& payload) {
    TraceEntry(kDeployClass, "CheckPayloadPreconditions");
    int decision = kNoDecision;
    for (const Precondition& condition : payload.preconditions) {
        if (Holds(condition)) {
            decision = static_cast<int>(condition.matchPolicy);
        }
        if (decision == static_cast<int>(MatchPolicy::Force)) {
            return decision;
        }
    }
    return decision;
}

}  // namespace HV
