// The run over a folder: which file is what, and in which order the packages go.
#include <algorithm>
#include <cctype>
#include <iterator>

#include "hvdeploy/src/Deploy.h"
#include "hvdeploy/src/EntryTrace.h"
#include "hvframework/FileUtils.h"
#include "hvframework/Log.h"
#include "hvframework/StringUtils.h"

namespace HV {
namespace {

// Fixed (contracts, packages folder): the name is reserved. The engine treats no package apart from the others by its
// identifier, this one neither.
[[maybe_unused]] constexpr const char* kRuntimePackage = "com.halvorn.vcredist-x64-2012";
constexpr const char* kPreflightPrefix = "preflight-";
constexpr const char* kPostflightPrefix = "postflight-";

std::string ToLower(std::string text) {
    std::transform(text.begin(), text.end(), text.begin(),
                   [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
    return text;
}

bool IsPackageExtension(const std::string& extension) {
    return extension == ".zip" || extension == ".hvpkg";
}

bool IsRead(const std::string& extension) {
    return IsPackageExtension(extension) || extension == ".json";
}

// A suite in a test phase says so in its name.
std::string SuiteDisplayName(const std::string& identifier, std::string displayName) {
    if (displayName.empty()) {
        displayName = "Unknown";
    }
    const bool isBeta = identifier.find("-beta") != std::string::npos;
    if (isBeta && ToLower(displayName).find("beta") == std::string::npos) {
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

Deploy::Deploy(ProgressListenerInterface* listener) : history(kHistoryFolder), progress(listener) {
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
    const FolderContent content = ScanFolder(dir);
    if (content.hasStranger) {
        return kDeploymentFailed;
    }
    progress.DivideAmong(content.packageBytes);
    ReadSuiteInfo(content);

    const EngineResult preflightResult = RunPreflightPhase(content.preflightPackages);
    if (IsFailure(preflightResult)) {
        HVL_LOG(Crit, "** Preflight package install returned " << preflightResult);
        return preflightResult;
    }
    const EngineResult result = RunMainPhases(content);
    // Fixed (contracts, packages folder): a failed run reports this too. Its result tells the listener.
    progress.SetTo(100.0F, "Installation complete.");
    if (!IsFailure(result)) {
        // The run has succeeded by now, and what becomes of the entry does not change that.
        OSRegisterUninstall(uninstallPath, suiteInfo);
    }
    return result;
}

Deploy::FolderContent Deploy::ScanFolder(const fs::path& dir) {
    FolderContent content;
    for (const fs::directory_entry& entry : fs::directory_iterator(dir)) {
        if (!fs::is_regular_file(entry.status())) {
            continue;
        }
        const fs::path& path = entry.path();
        const std::string extension = ToLower(path.extension().string());
        if (IsRead(extension) && !IsAccepted(path)) {
            content.hasStranger = true;
        } else if (IsPackageExtension(extension)) {
            AddPackageFile(path, content);
        } else if (extension == ".json" && content.suitePath.empty()) {
            HVL_LOG(Debug, "Located suite .json file...");
            content.suitePath = path;
        } else if (extension == ".json") {
            HVL_LOG(Warn, "found additional json file at root level of packages dir: " << path);
        }
    }
    return content;
}

// Which files a release consists of is known to whoever has tested it; what has come since is none of them.
bool Deploy::IsAccepted(const fs::path& file) const {
    const std::string name = file.filename().string();
    if (!acceptedNames || acceptedNames->contains(name)) {
        return true;
    }
    HVL_LOG(Error, "ERROR: " << name << " is not valid payload.");
    return false;
}

// Packages to skip are listed and counted like all others and fall out later, so the percentages do not depend on them.
// None is added to the packages that a suite could be synthesised from: a folder without a suite file has no suite.
void Deploy::AddPackageFile(const fs::path& path, FolderContent& content) {
    content.packageBytes += fs::file_size(path);
    const std::string name = ToLower(path.filename().string());
    if (HVL::StringUtils::StartsWith(name, kPreflightPrefix)) {
        content.preflightPackages.push_back(path);
    } else if (HVL::StringUtils::StartsWith(name, kPostflightPrefix)) {
        content.postflightPackages.push_back(path);
    } else {
        content.mainPackages.push_back(path);
    }
}

// A run without a suite goes on with an empty record.
void Deploy::ReadSuiteInfo(const FolderContent& content) {
    if (!content.suitePath.empty() && ReadSuiteFile(content.suitePath)) {
        return;
    }
    std::string text;
    if (!SynthesizeSuiteInfoFromProducts(content.synthesisPackages, text)) {
        HVL_LOG(Warn, "failed to read suite data from file " << content.suitePath);
        return;
    }
    AcceptSuiteText(text, content.suitePath);
}

bool Deploy::ReadSuiteFile(const fs::path& suitePath) {
    std::string text;
    return HVL::FileUtils::ReadFileToString(suitePath.string(), text) == 0 && AcceptSuiteText(text, suitePath);
}

bool Deploy::AcceptSuiteText(const std::string& text, const fs::path& suitePath) {
    if (!ReadSuiteText(text, suitePath)) {
        HVL_LOG(Warn, "failed to read suite data from file " << suitePath);
        return false;
    }
    return IsSuite(suitePath);
}

// An exception ends the run, and what it says itself may be the library's own words alone: the file is named here.
bool Deploy::ReadSuiteText(const std::string& text, const fs::path& suitePath) {
    try {
        return suiteInfo.ReadJSON(text);
    } catch (const std::exception& error) {
        HVL_LOG(Error, "cannot take suite data from file " << suitePath << ": " << error.what());
        throw;
    }
}

bool Deploy::IsSuite(const fs::path& suitePath) const {
    if (suiteInfo.GetProductType() != 0) {
        HVL_LOG(Warn, "non-suite product type encountered in json file " << suitePath);
        return false;
    }
    return true;
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

EngineResult Deploy::RunMainPhases(const FolderContent& content) {
    HVL_LOG(Info, "Deploying Main Packages");
    HVL_LOG(Info, "------------------------");
    EngineResult result = DeployPackages(content.mainPackages);
    if (IsFailure(result)) {
        HVL_LOG(Error, "Main package install returned " << result);
    }
    progress.SetTo(98.0F, "Completing installation.");
    if (!IsFailure(result)) {
        result = DeployPackages(content.postflightPackages);
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
