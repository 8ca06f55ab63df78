// The run over a folder: which file is what, and in which order the packages go.
#include "hvdeploy/src/Deploy.h"
#include "hvdeploy/src/EntryTrace.h"
#include "hvframework/Log.h"
#include "hvframework/StringUtils.h"

namespace HV {
namespace {

// Fixed (contracts, packages folder): the name is reserved. The engine treats no package apart from the others by its
// identifier, this one neither.
[[maybe_unused]] constexpr const char* kRuntimePackage = "com.halvorn.vcredist-x64-2012";

// A suite in a test phase says so in its name.
std::string SuiteDisplayName(const std::string& identifier, std::string displayName) {
    if (displayName.empty()) {
        displayName = "Unknown";
    }
    const bool isBeta = identifier.find("-beta") != std::string::npos;
    if (isBeta && HVL::StringUtils::ToLower(displayName).find("beta") == std::string::npos) {
        displayName += " Beta";
    }
    return displayName;
}

// The values go in as they are. A quote in one of them spoils the text, and the suite is then reported as unreadable.
std::string SuiteText(const std::string& identifier, const std::string& version, const std::string& displayName) {
    return "{ \"identifier\": \"" + identifier + "\",\"version\": \"" + version +
           "\",\"product_type\": \"0\",\"display_name\": \"" + displayName + "\"}";
}

}  // namespace

Deploy::Deploy(ProgressListenerInterface* listener) : history(HistoryFolder()), progress(listener) {
    if (listener != nullptr) {
        AddProgress(1.0F);
        ReportProgress("Preparing to install...", 0);
    }
    LoadValidationInfo();
}

void Deploy::SetVerbose(bool on) {
    verbose = on;
    rollback.SetVerbose(on);
}

void Deploy::Cancel() {
    TraceEntry(kDeployClass, "Cancel");
    const boost::mutex::scoped_lock guard(cancelMutex);
    cancelled = true;
}

bool Deploy::IsCancelled() {
    const boost::mutex::scoped_lock guard(cancelMutex);
    return cancelled;
}

bool Deploy::LoadValidationInfo() {
    TraceEntry(kDeployClass, "LoadValidationInfo");
    std::vector<std::string> names;
    GetValidationFileNames(names);
    for (const std::string& name : names) {
        ValidationInfo info;
        GetValidationInfo(name, info);
        validationInfo[name] = info;
    }
    return !validationInfo.empty();
}

EngineResult Deploy::DeployPackagesFromDirectory(const fs::path& dir, const std::vector<std::string>& packagesToSkip) {
    TraceEntry(kDeployClass, "DeployPackagesFromDirectory");
    skipList = packagesToSkip;
    AddProgress(1.0F);
    ReportProgress("Checking packages to install...", 0);
    HVL_LOG(Debug, "---------------------------");
    HVL_LOG(Debug, "Installing from directory '" << dir << "'");
    boost::system::error_code ignored;
    if (!fs::is_directory(dir, ignored)) {
        HVL_LOG(Error, "'" << dir << "' is not a directory.");
        return kDeploymentFailed;
    }
    const PackagesFolder folder = ReadPackagesFolder(dir, acceptedNames);
    if (folder.hasStranger) {
        return kDeploymentFailed;
    }
    progress.DivideAmong(folder.packageBytes);
    ReadSuiteInfo(folder);

    const EngineResult preflightResult = RunPreflightPhase(folder.preflightPackages);
    if (IsFailure(preflightResult)) {
        HVL_LOG(Crit, "** Preflight package install returned " << preflightResult);
        return preflightResult;
    }
    const EngineResult result = RunMainPhases(folder);
    // Fixed (contracts, packages folder): a failed run reports this too. Its result tells the listener.
    progress.SetTo(100.0F, "Installation complete.");
    if (!IsFailure(result)) {
        // The run has succeeded by now, and what becomes of the entry does not change that.
        OSRegisterUninstall(uninstallPath, suiteInfo);
    }
    return result;
}

// A run without a suite goes on with an empty record.
void Deploy::ReadSuiteInfo(const PackagesFolder& folder) {
    if (!folder.suitePath.empty() && ReadSuiteFile(folder.suitePath, suiteInfo)) {
        return;
    }
    std::string text;
    if (!SynthesizeSuiteInfoFromProducts(folder.synthesisPackages, text)) {
        HVL_LOG(Warn, "failed to read suite data from file " << folder.suitePath);
        return;
    }
    TakeSuiteText(text, folder.suitePath, suiteInfo);
}

bool Deploy::SynthesizeSuiteInfoFromProducts(const std::vector<fs::path>& packages, std::string& suiteText) {
    // Fixed (contracts, run): the one entry line of this class that names the class once.
    HVL_LOG(Debug, kDeployClass << "SynthesizeSuiteInfoFromProducts");
    for (const fs::path& path : packages) {
        try {
            Package package(path);
            (void)package.Validate(true);
            const Manifest& manifest = package.manifest;
            const std::string identifier = manifest.GetProductData("suite_identifier");
            const std::string version = manifest.GetProductData("suite_version");
            const std::string displayName = SuiteDisplayName(identifier, manifest.GetProductData("suite_display_name"));
            if (!identifier.empty() && !version.empty()) {
                suiteText = SuiteText(identifier, version, displayName);
                return true;
            }
        } catch (const std::exception&) {
            // A package that cannot be opened names no suite; the next one may.
            continue;
        }
    }
    return false;
}

EngineResult Deploy::RunPreflightPhase(const std::vector<fs::path>& packages) {
    try {
        HVL_LOG(Info, "Deploying Preflight Packages");
        HVL_LOG(Debug, "Preflight packages");
        HVL_LOG(Debug, "-------------------");
        for (const fs::path& path : packages) {
            HVL_LOG(Debug, path);
        }
        HVL_LOG(Debug, "-------------------");
        return DeployPackages(packages);
    } catch (const std::exception& error) {
        // What prepares the machine may fail in ways of its own; the products are installed all the same.
        HVL_LOG(Error, error.what());
        return kNothingDone;
    }
}

EngineResult Deploy::RunMainPhases(const PackagesFolder& folder) {
    HVL_LOG(Info, "Deploying Main Packages");
    HVL_LOG(Info, "------------------------");
    EngineResult result = DeployPackages(folder.mainPackages);
    if (IsFailure(result)) {
        HVL_LOG(Error, "Main package install returned " << result);
    }
    progress.SetTo(98.0F, "Completing installation.");
    if (!IsFailure(result)) {
        result = DeployPackages(folder.postflightPackages);
        if (IsFailure(result)) {
            HVL_LOG(Error, "Postflight package install returned " << result);
        }
    }
    return result;
}

EngineResult Deploy::DeployPackages(const std::vector<fs::path>& paths) {
    TraceEntry(kDeployClass, "DeployPackages");
    // Each phase starts with both empty, so a package can lean on packages of its own phase alone.
    installedIdentifiers.clear();
    deployedPackages.clear();
    if (paths.empty()) {
        return kNothingDone;
    }
    ReportProgress("Installing packages...", 0);
    deployedPackages.reserve(paths.size());
    EngineResult result = DeployEach(paths);
    if (!IsFailure(result) && !IsCancelled()) {
        ReportProgress("Verifying installation...", 0);
        if (IsFailure(EnsureDependencies())) {
            result = kFailed;
        }
    }
    if (IsCancelled()) {
        ReportProgress("Cancelling install...", 0);
    } else if (IsFailure(result)) {
        ReportProgress("An error has occured", static_cast<std::int32_t>(lastError));
    }
    return result;
}

// The result is that of the last package: a phase whose last package was skipped gives 0 though others placed files.
EngineResult Deploy::DeployEach(const std::vector<fs::path>& paths) {
    EngineResult result = kNothingDone;
    for (std::size_t i = 0; i < paths.size(); ++i) {
        HVL_LOG(Info, "==============================");
        HVL_LOG(Info, "Installing package [" << i + 1 << "/" << paths.size() << "]");
        HVL_LOG(Info, "==============================");
        result = DeployPackage(paths[i]);
        if (IsFailure(result)) {
            HVL_LOG(Crit, "Error deploying package: '" << paths[i] << "' err:" << result);
            break;
        }
    }
    return result;
}

}  // namespace HV
