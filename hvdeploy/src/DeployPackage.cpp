// One package, from its path to "installed".
#include <algorithm>
#include <iostream>
#include <memory>
#include <unordered_set>

#include "hvdeploy/src/Deploy.h"
#include "hvdeploy/src/EntryTrace.h"
#include "hvframework/FileUtils.h"
#include "hvframework/Log.h"
#include "hvframework/TempFolder.h"

namespace HV {
namespace {

using namespace HVL;

// The products that bring their own way of removal.
constexpr const char* kServiceProduct = "com.halvorn.service";
constexpr const char* kManagerProduct = "com.halvorn.app";

bool Holds(const std::vector<std::string>& list, const std::string& text) {
    return std::find(list.begin(), list.end(), text) != list.end();
}

std::string InstallMessage(const Package& package) {
    // The manifest has not been read when this text is built, so it names the file.
    std::string name = package.manifest.GetProductData("display_name");
    if (name.empty()) {
        name = package.GetName();
    }
    std::string message = "Installing " + name;
    if (package.manifest.policy.timeWarning) {
        message += ", this may take a while";
    }
    return message;
}

/// A package unpacked into a temporary folder, whose files go with the object: also when what a detector or the
/// filesystem library throws ends the run. A package that is unpacked already is taken as it is.
class UnpackedPackage {
public:
    /// On failure, which the log tells, nothing is left on the disk.
    explicit UnpackedPackage(Package& package) : package_(package), isThere_(package.IsExtracted() || Unpack()) {}
    ~UnpackedPackage() {
        if (isThere_ && package_.IsExtracted()) {
            RemoveFiles();
        }
    }
    UnpackedPackage(const UnpackedPackage&) = delete;
    UnpackedPackage& operator=(const UnpackedPackage&) = delete;

    [[nodiscard]] bool IsThere() const { return isThere_; }

private:
    bool Unpack() {
        folder_ = TempFolder("tmp");
        const std::string path = folder_.Path();
        if (folder_.IsThere() && package_.ExtractTo(path)) {
            return true;
        }
        HVL_LOG(Error, "Failed to extract package " << package_.GetName());
        folder_.LetGo();
        FileUtils::DeleteFileOrDirectory(path);
        return false;
    }

    void RemoveFiles() {
        HVL_LOG(Debug, "Cleaning up temp files at " << package_.extractedPath);
        folder_.LetGo();
        if (const int error = FileUtils::DeleteFileOrDirectory(package_.extractedPath.string()); error != 0) {
            HVL_LOG(Error, "attempt to remove temp files returned " << error);
        }
    }

    Package& package_;
    TempFolder folder_;
    bool isThere_;
};

bool HasUninstallScript(const Manifest& manifest) {
    if (manifest.productId == kServiceProduct || manifest.productId == kManagerProduct) {
        return false;
    }
    return manifest.policy.uninstall ||
           std::any_of(manifest.payloads.begin(), manifest.payloads.end(), [](const Payload& payload) {
               return payload.type == PayloadType::Plugin || payload.type == PayloadType::App;
           });
}

// The first missing product speaks for its payload; the others are not looked at.
bool DependenciesAreMet(const Package& package, const Payload& payload, const std::unordered_set<std::string>& known) {
    for (const PayloadDependency& dependency : payload.dependencies) {
        if (known.count(dependency.product) == 0) {
            HVL_LOG(Error, "product " << package.manifest.GetProductData("display_name") << " requires package "
                                      << dependency.product << ", not found or installed.");
            return false;
        }
    }
    return true;
}

}  // namespace

EngineResult Deploy::DeployPackage(const fs::path& path) {
    TraceEntry(kDeployClass, "DeployPackage");
    HVL_LOG(Debug, "packagePath: " << path);
    deployedPackages.emplace_back(path);
    const float points = PackageProgressPoints(path);
    const EngineResult result = DeployPackage(deployedPackages.back(), points);
    // Only packages that placed something stay for the check of the dependencies.
    if (result != kPlaced && !deployedPackages.empty()) {
        deployedPackages.pop_back();
    }
    return result;
}

EngineResult Deploy::DeployPackage(Package& package, float progressPoints) {
    TraceEntry(kDeployClass, "DeployPackage");
    HVL_LOG(Debug, "package " << package.GetName() << ", progress points " << progressPoints);
    if (IsCancelled()) {
        HVL_LOG(Warn, "Installation cancelled, rolling back...");
        rollback.Rollback();
        return kDeploymentFailed;
    }
    const std::string message = InstallMessage(package);
    HVL_LOG(Debug, message);
    const EngineResult validation = ValidatePackage(package);
    if (progressPoints > 1.0F) {
        AddProgress(0.25F);
        progressPoints -= 0.25F;
        ReportProgress(message.c_str(), 0);
    }
    if (validation != 0) {
        HVL_LOG(Error, "Package validation of " << package.GetName() << " failed with error " << validation);
        return RollBack(validation);
    }
    return InstallValidated(package, progressPoints, message);
}

EngineResult Deploy::InstallValidated(Package& package, float progressPoints, std::string message) {
    const Manifest& manifest = package.manifest;
    if (fatalErrorTest) {
        HVL_LOG(Emerg, "creating a fatal error for testing purposes.");
        return kDeploymentFailed;
    }
    if (!ShouldInstallPacakge(package)) {
        HVL_LOG(Debug, "Skipping package " << manifest.productId << " (v. " << manifest.productVersion << ")");
        if (progressPoints > 0.0F) {
            AddProgress(progressPoints);
            ReportProgress("Installing packages...", 0);
        }
        return kNothingDone;
    }
    message += "...";
    if (verbose) {
        std::cout << message << std::endl;
    }
    ReportProgress(message.c_str(), 0);
    auto unpacked = std::make_unique<UnpackedPackage>(package);
    if (!unpacked->IsThere()) {
        // No way back: nothing of this package has reached the machine, and what earlier packages placed stays.
        return kFailed;
    }
    const EngineResult result = PlacePackage(package, progressPoints, message);
    unpacked.reset();
    if (IsFailure(result)) {
        return RollBack(result);
    }
    installedIdentifiers.push_back(manifest.productId);
    return result;
}

EngineResult Deploy::PlacePackage(const Package& package, float progressPoints, const std::string& message) {
    const Placed placed = DeployPackagePayloads(package, progressPoints, message);
    if (placed.result == kPlaced) {
        HVL_LOG(Debug, " - DeployPackagePayloads success for " << package.manifest.productId);
        HandOverToUninstall(package, placed.files);
    }
    return placed.result;
}

EngineResult Deploy::RollBack(EngineResult result) {
    HVL_LOG(Error, "Installation cannot complete, rolling back; error value is " << result);
    rollback.Rollback();
    return result;
}

void Deploy::HandOverToUninstall(const Package& package, const std::vector<std::string>& installedFiles) {
    if (legacyUninstall) {
        RegisterLegacyUninstall();
    }
    const std::string& identifier = package.manifest.productId;
    if (!HasUninstallScript(package.manifest)) {
        HVL_LOG(Debug, " - skipping uninstall script creation for " << identifier);
    } else if (!WriteUninstallScript(package, installedFiles)) {
        HVL_LOG(Warn, "failed to create uninstall script segment for " << identifier);
    }
}

bool Deploy::WriteUninstallScript(const Package& package, const std::vector<std::string>& installedFiles) {
    const std::string& identifier = package.manifest.productId;
    if (serviceUninstall) {
        HVL_LOG(Debug, "Writing service-based uninstall script for " << identifier);
        return uninstallScripts.WriteServiceUninstallScript(uninstallPath, package, suiteInfo);
    }
    HVL_LOG(Debug, "Writing standalone uninstall script for " << identifier);
    return uninstallScripts.WriteStandaloneUninstallScript(uninstallPath, installedFiles, package, suiteInfo, "");
}

// Fixed (contracts, removal script): the switch asks for this one line in the log.
int Deploy::RegisterLegacyUninstall() {
    TraceEntry(kDeployClass, "RegisterLegacyUninstall");
    return 0;
}

EngineResult Deploy::ValidatePackage(Package& package) {
    TraceEntry(kDeployClass, "ValidatePackage");
    if (!package.Validate(false)) {
        HVL_LOG(Error, "package.Validate() failed for " << package.GetName());
        return kFailed;
    }
    return 0;
}

// Only a strictly newer installed version blocks a package: the same version is installed again.
bool Deploy::ShouldInstallPacakge(const Package& package) {
    TraceEntry(kDeployClass, "ShouldInstallPacakge");
    const Manifest& manifest = package.manifest;
    if (Holds(skipList, package.GetName()) || Holds(skipList, manifest.productId)) {
        return false;
    }
    const Version wanted(manifest.productVersion);
    const std::vector<Version>& installed = history.Versions(manifest.productId);
    return std::none_of(installed.begin(), installed.end(),
                        [&](const Version& version) { return version.IsGreater(wanted); });
}

EngineResult Deploy::EnsureDependencies() {
    TraceEntry(kDeployClass, "EnsureDependencies");
    ReportProgress("Checking product dependencies...", 0);
    std::unordered_set<std::string> known(installedIdentifiers.begin(), installedIdentifiers.end());
    known.insert(history.Identifiers().begin(), history.Identifiers().end());
    EngineResult result = kNothingDone;
    for (const Package& package : deployedPackages) {
        for (const Payload& payload : package.manifest.payloads) {
            if (payload.MatchesOS() && !DependenciesAreMet(package, payload, known)) {
                result = kDeploymentFailed;
            }
        }
    }
    return result;
}

}  // namespace HV
