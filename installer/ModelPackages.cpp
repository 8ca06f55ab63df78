// What the model knows of the packages folder: which files are there, whether each is what this build may install, and
// what the wizard has to know of it.
#include <algorithm>
#include <functional>
#include <iostream>
#include <optional>
#include <set>
#include <tuple>
#include <utility>

#include "hvdeploy/src/PackagesFolder.h"
#include "hvframework/FileUtils.h"
#include "hvframework/Log.h"
#include "installer/InstallerModel.h"
#include "package/Package.h"
#include "package/PackageNames.h"
#include "platform/filesystem.h"

namespace HV {
namespace {

using HVL::FileUtils::GetFileName;

/// What the walk over the packages folder finds.
struct FolderFiles {
    std::vector<std::string> packageFiles;
    std::string suiteJsonPath;
};

// The case of an extension counts here, though the engine passes over it: the name of a package has to stand in the
// table of this build, to the letter.
void AddFile(const fs::path& path, FolderFiles& files) {
    const bool isSuite = path.extension().string() == kSuiteEnding;
    if (IsNamedAsPackage(path)) {
        files.packageFiles.push_back(path.string());
    } else if (isSuite && files.suiteJsonPath.empty()) {
        files.suiteJsonPath = path.string();
    } else if (isSuite) {
        std::cerr << "WARNING: found additional json file at root level of packages dir: " << path << std::endl;
    }
}

/// ForEachFile(), and whether the folder could be listed to its end.
bool ListFolder(const std::string& folder, const std::function<void(const fs::path&)>& take) {
    try {
        ForEachFile(fs::path(folder), take);
        return true;
    } catch (const fs::filesystem_error&) {
        return false;
    }
}

void LogStranger(const std::string& name) {
    HVL_LOG(Error, "ERROR: " << name << " is not valid payload.");
}

void LogSpoiled(const std::string& name) {
    HVL_LOG(Error, "validation of " << name << " failed.");
}

// JSON that is no object throws; for the user of the wizard it is a suite file that cannot be read, like any other.
bool ParseSuite(const std::string& json, HVL::ProductData& suite) {
    try {
        return suite.ReadJSON(json);
    } catch (const std::exception&) {
        return false;
    }
}

bool ReadSuite(const std::string& path, HVL::ProductData& suite) {
    std::string json;
    if (!HVL::FileUtils::FileExists(path) || HVL::FileUtils::ReadFileToString(path, json) != 0) {
        return false;
    }
    if (!ParseSuite(json, suite)) {
        std::cerr << "ERROR: failed to read suite data from file " << path << std::endl;
        return false;
    }
    return true;
}

std::string PropertyOr(const Manifest& manifest, const std::string& key, const std::string& otherwise) {
    const auto found = manifest.productData.find(key);
    return found == manifest.productData.end() ? otherwise : found->second;
}

bool NeedsNoHost(const Payload& payload) {
    return !payload.GoesIntoHosts() && payload.hosts.empty();
}

// One host is enough to make the payload worth installing. The others are not looked at, so of several hosts of one
// payload the user is asked to quit only the first that is there.
void NoteFirstHost(const Payload& payload, const HostAppCheck& hostCheck, PackageInfo& info) {
    const auto hostRef =
        std::ranges::find_if(payload.hosts, [&](const std::string& ref) { return hostCheck.HasHost(ref); });
    if (hostRef == payload.hosts.end()) {
        return;
    }
    info.hostFound = true;
    if (std::ranges::find(info.hostRefs, *hostRef) == info.hostRefs.end()) {
        info.hostRefs.push_back(*hostRef);
    }
}

// The order of the payloads counts: the first one that needs no host ends the look, and the hosts that were met before
// it are still hosts that the package will use. A package without any payload for this system needs a host, and has
// none: there is nothing in it that could be installed without one.
void ClassifyForHosts(const std::vector<Payload>& payloads, const HostAppCheck& hostCheck, PackageInfo& info) {
    info.requiresHost = true;
    for (const Payload& payload : payloads) {
        if (!payload.MatchesOS()) {
            continue;
        }
        if (NeedsNoHost(payload)) {
            info.requiresHost = false;
            info.hostFound = false;
            return;
        }
        NoteFirstHost(payload, hostCheck, info);
    }
}

PackageInfo MakeInfo(const std::string& path, const Manifest& manifest, const HostAppCheck& hostCheck) {
    PackageInfo info;
    info.identifier = manifest.productId;
    info.path = path;
    info.show = manifest.policy.show;
    info.version = PropertyOr(manifest, "version", manifest.productVersion);
    info.displayName = PropertyOr(manifest, "display_name", info.identifier);
    ClassifyForHosts(manifest.payloads, hostCheck, info);
    return info;
}

/// Nothing when the package is bad; the log says why.
std::optional<PackageInfo> ReadPackage(const std::string& path, const HostAppCheck& hostCheck) {
    try {
        Package package{fs::path(path)};
        if (package.Validate(false)) {
            return MakeInfo(path, package.manifest, hostCheck);
        }
    } catch (const std::exception& error) {
        // The file has gone since it was listed.
        HVL_LOG(Error, error.what());
    }
    return std::nullopt;
}

// Shown packages first. Names are compared byte by byte; packages of one name stay in the order of the folder.
void SortForDisplay(std::vector<PackageInfo>& packages) {
    const auto rank = [](const PackageInfo& package) {
        return std::tuple<bool, const std::string&>(!package.show, package.displayName);
    };
    std::ranges::stable_sort(packages, {}, rank);
}

}  // namespace

bool InstallerModel::ScanPackages() {
    packagesDirectory = release_.packagesDirectory;
    FolderFiles files;
    const auto add = [&](const fs::path& path) { AddFile(path, files); };
    if (!HVL::FileUtils::DirectoryExists(packagesDirectory) || !ListFolder(packagesDirectory, add)) {
        return false;
    }
    packageFiles = std::move(files.packageFiles);
    suiteJsonPath = std::move(files.suiteJsonPath);
    HoldSuites();
    // The suite is read even where there is no package: its name stands in the window that says so.
    return ReadSuite(suiteJsonPath, suite) && !packageFiles.empty();
}

// Before the first is read. The engine reads one of them too, and which one is the system's order.
void InstallerModel::HoldSuites() {
    (void)ListFolder(packagesDirectory, [this](const fs::path& path) {
        if (IsNamedAsSuite(path)) {
            held_.emplace_back(path);
        }
    });
}

/// Whether the file is one of this release, byte for byte. From before its bytes are read it is held.
bool InstallerModel::IsReleased(const std::string& path, const std::set<std::string>& releasedNames) {
    const std::string name = GetFileName(path);
    if (!releasedNames.contains(name)) {
        LogStranger(name);
        return false;
    }
    ValidationInfo row;
    GetValidationInfo(name, row, release_.rows());
    const FileDigests released{row.md5, SecondDigestOf(name, release_.digests())};
    if (held_.emplace_back(fs::path(path)).Digests() != released) {
        LogSpoiled(name);
        return false;
    }
    return true;
}

// The first bad file ends it, and then there is no list of packages at all: the wizard offers all of a release or none.
bool InstallerModel::ValidatePackages() {
    std::vector<std::string> names;
    GetValidationFileNames(names, release_.rows());
    if (names.empty()) {
        std::cerr << "Fatal error - this installer build does not include validation information." << std::endl;
        return false;
    }
    const std::set<std::string> releasedNames(names.begin(), names.end());
    std::vector<PackageInfo> good;
    for (const std::string& path : packageFiles) {
        std::optional<PackageInfo> info = IsReleased(path, releasedNames) ? ReadPackage(path, hostCheck) : std::nullopt;
        if (!info) {
            return false;
        }
        good.push_back(std::move(*info));
    }
    SortForDisplay(good);
    packages = std::move(good);
    return true;
}

std::set<std::string> InstallerModel::NamesOfRelease() const {
    std::set<std::string> names;
    for (const HeldFile& file : held_) {
        names.insert(file.Path().filename().string());
    }
    return names;
}

// A file that the scan has passed over because of its case is no more a part of the release than one that came later.
bool InstallerModel::PackagesAreUntouched() const {
    const std::set<std::string> known = NamesOfRelease();
    std::vector<std::string> strangers;
    const bool listed = ListFolder(packagesDirectory, [&](const fs::path& path) {
        if (IsReadByRun(path) && !known.contains(path.filename().string())) {
            strangers.push_back(path.filename().string());
        }
    });
    if (!strangers.empty()) {
        LogStranger(strangers.front());
        return false;
    }
    const auto touched = std::ranges::find_if_not(held_, &HeldFile::IsUntouched);
    if (touched != held_.end()) {
        LogSpoiled(touched->Path().filename().string());
    }
    return listed && touched == held_.end();
}

}  // namespace HV
