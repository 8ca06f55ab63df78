#include "hvdeploy/src/PackagesFolder.h"

#include "hvframework/FileUtils.h"
#include "hvframework/Log.h"
#include "hvframework/StringUtils.h"
#include "package/PackageNames.h"

namespace HV {
namespace {

using HVL::StringUtils::StartsWith;
using HVL::StringUtils::ToLower;

using AcceptedNames = std::optional<std::set<std::string>>;

constexpr const char* kPreflightPrefix = "preflight-";
constexpr const char* kPostflightPrefix = "postflight-";

std::string ExtensionInLowerCase(const fs::path& file) {
    return ToLower(file.extension().string());
}

// Which files a release consists of is known to whoever has tested it; what has come since is none of them.
bool IsAccepted(const fs::path& file, const AcceptedNames& acceptedNames) {
    const std::string name = file.filename().string();
    if (!acceptedNames || acceptedNames->contains(name)) {
        return true;
    }
    HVL_LOG(Error, "ERROR: " << name << " is not valid payload.");
    return false;
}

// Packages to skip are listed and counted like all others and fall out later, so the percentages do not depend on them.
void AddPackage(const fs::path& path, PackagesFolder& folder) {
    folder.packageBytes += fs::file_size(path);
    const std::string name = ToLower(path.filename().string());
    if (StartsWith(name, kPreflightPrefix)) {
        folder.preflightPackages.push_back(path);
    } else if (StartsWith(name, kPostflightPrefix)) {
        folder.postflightPackages.push_back(path);
    } else {
        folder.mainPackages.push_back(path);
    }
}

void AddSuite(const fs::path& path, PackagesFolder& folder) {
    if (folder.suitePath.empty()) {
        HVL_LOG(Debug, "Located suite .json file...");
        folder.suitePath = path;
    } else {
        HVL_LOG(Warn, "found additional json file at root level of packages dir: " << path);
    }
}

void AddFile(const fs::path& path, const AcceptedNames& acceptedNames, PackagesFolder& folder) {
    if (!IsReadByRun(path)) {
        return;
    }
    if (!IsAccepted(path, acceptedNames)) {
        folder.hasStranger = true;
    } else if (IsNamedAsSuite(path)) {
        AddSuite(path, folder);
    } else {
        AddPackage(path, folder);
    }
}

// An exception ends the run, and what it says itself may be the library's own words alone: the file is named here.
bool Parse(const std::string& text, const fs::path& suitePath, HVL::ProductData& suite) {
    try {
        return suite.ReadJSON(text);
    } catch (const std::exception& error) {
        HVL_LOG(Error, "cannot take suite data from file " << suitePath << ": " << error.what());
        throw;
    }
}

}  // namespace

bool IsNamedAsSuite(const fs::path& file) {
    return ExtensionInLowerCase(file) == kSuiteEnding;
}

bool IsReadByRun(const fs::path& file) {
    return IsNamedAsSuite(file) || IsPackageExtension(ExtensionInLowerCase(file));
}

void ForEachFile(const fs::path& folder, const std::function<void(const fs::path&)>& take) {
    for (const fs::directory_entry& entry : fs::directory_iterator(folder)) {
        if (fs::is_regular_file(entry.status())) {
            take(entry.path());
        }
    }
}

PackagesFolder ReadPackagesFolder(const fs::path& dir, const AcceptedNames& acceptedNames) {
    PackagesFolder folder;
    ForEachFile(dir, [&](const fs::path& path) { AddFile(path, acceptedNames, folder); });
    return folder;
}

bool ReadSuiteFile(const fs::path& suitePath, HVL::ProductData& suite) {
    std::string text;
    return HVL::FileUtils::ReadFileToString(suitePath.string(), text) == 0 && TakeSuiteText(text, suitePath, suite);
}

bool TakeSuiteText(const std::string& text, const fs::path& suitePath, HVL::ProductData& suite) {
    if (!Parse(text, suitePath, suite)) {
        HVL_LOG(Warn, "failed to read suite data from file " << suitePath);
        return false;
    }
    if (suite.GetProductType() != 0) {
        HVL_LOG(Warn, "non-suite product type encountered in json file " << suitePath);
        return false;
    }
    return true;
}

}  // namespace HV
