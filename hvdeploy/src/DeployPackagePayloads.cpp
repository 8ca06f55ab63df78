// The walk over the payloads of one package: what is passed over, what is placed, and what goes with a placed payload.
#include "hvdeploy/src/Deploy.h"
#include "hvdeploy/src/EntryTrace.h"
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

/// The points of one package while its payloads spend them. Whatever is left goes to the bar in the end, on every way
/// out.
class PackagePoints {
public:
    PackagePoints(Deploy& engine, float points, std::size_t payloads)
        : deploy(engine), remaining(points), share(payloads == 0 ? 0.0F : points / static_cast<float>(payloads)) {}
    ~PackagePoints() {
        if (remaining > 0.0F) {
            deploy.AddProgress(remaining);
        }
    }
    PackagePoints(const PackagePoints&) = delete;
    PackagePoints& operator=(const PackagePoints&) = delete;

    void SpendShare(const std::string& message) {
        if (remaining > 0.0F && share > 0.0F) {
            deploy.AddProgress(share);
            remaining -= share;
            deploy.ReportProgress(message.c_str(), 0);
        }
    }

private:
    Deploy& deploy;
    float remaining;
    float share;
};

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

// A shortcut that has to succeed and does not ends this loop, but not the walk: the next payload that is placed may put
// its own result in the place of the failure.
EngineResult MakeShortcuts(const Payload& payload, const std::vector<std::string>& placedFiles,
                           std::vector<std::string>& installedFiles, EngineResult result) {
    for (const Shortcut& shortcut : payload.shortcuts) {
        const EngineResult made = Deploy::MakeShortcut(shortcut, placedFiles, installedFiles);
        if (IsFailure(made) && shortcut.failOnError) {
            return made;
        }
    }
    return result;
}

}  // namespace

EngineResult Deploy::DeployPackagePayloads(const Package& package, std::vector<std::string>& installedFiles,
                                           float progressPoints, const std::string& message) {
    TraceEntry(kDeployClass, "DeployPackagePayloads");
    PackagePoints points(*this, progressPoints, CountForThisSystem(package.manifest.payloads));
    EngineResult result = kNothingDone;
    for (const Payload& payload : package.manifest.payloads) {
        if (!payload.MatchesOS()) {
            HVL_LOG(Debug, "Skipping Payload (reason: non-supported OS): " << payload.id << " ");
            continue;
        }
        if (!payload.preconditions.empty() && CheckPayloadPreconditions(payload) == 0) {
            HVL_LOG(Debug, "Precondition negative result: skipping payload " << payload.id);
            continue;
        }
        // A failing preflight does not keep the payload from being placed, and a placement that succeeds takes the
        // place of the script's code: only a payload that placed nothing shows it.
        if (const EngineResult scripts = RunScripts(payload.preflights, package); IsFailure(scripts)) {
            result = scripts;
        }
        std::vector<std::string> placedFiles;
        const EngineResult placement = DeployPayload(payload, package, placedFiles);
        installedFiles.insert(installedFiles.end(), placedFiles.begin(), placedFiles.end());
        points.SpendShare(message);
        if (IsFailure(placement)) {
            return placement;
        }
        if (placement == kPlaced) {
            result = kPlaced;
        }
        if (IsCancelled()) {
            HVL_LOG(Info, "Installation cancelled");
            return kDeploymentFailed;
        }
        if (placement == kPlaced) {
            result = FinishPayload(payload, package, result);
        }
        if (IsFailure(result)) {
            break;
        }
        if (placement == kPlaced) {
            result = MakeShortcuts(payload, placedFiles, installedFiles, result);
        }
    }
    return result;
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
