#include "hvdeploy/src/InstalledHistory.h"

#include "hvdeploy/src/GuardedFolders.h"
#include "hvframework/FileUtils.h"
#include "hvframework/StringUtils.h"
#include "package/PackageNames.h"
#include "platform/filesystem.h"
#include "system/SystemDirectories.h"

namespace HV {
namespace {

constexpr const char* kVersionMark = "_v";

}  // namespace

std::string HistoryFolder() {
    return GetSystemDirectory(SysDir::History).string();
}

std::vector<std::string> ReadHistoryStems(const std::string& folder) {
    std::vector<std::string> stems;
    if (IsRefused(folder) || !HVL::FileUtils::DirectoryExists(folder)) {
        return stems;
    }
    for (const fs::directory_entry& entry : fs::directory_iterator(fs::path(folder))) {
        const std::string name = entry.path().filename().string();
        if (HVL::StringUtils::EndsWith(name, kManifestEnding) && fs::is_regular_file(entry.status()) &&
            !IsRefused(HVL::FileUtils::JoinPath(folder, name))) {
            stems.push_back(name.substr(0, name.size() - kManifestEnding.size()));
        }
    }
    return stems;
}

std::string IdentifierOfStem(const std::string& stem) {
    return stem.substr(0, stem.find(kVersionMark));
}

std::string VersionOfStem(const std::string& stem) {
    const std::size_t mark = stem.find(kVersionMark);
    if (mark == std::string::npos || mark + 2 >= stem.size()) {
        return stem;
    }
    return stem.substr(mark + 2);
}

const std::vector<std::string>& InstalledHistory::Identifiers() {
    Read();
    return identifiers;
}

const std::vector<HVL::Version>& InstalledHistory::Versions(const std::string& identifier) {
    static const std::vector<HVL::Version> none;
    Read();
    const auto found = versions.find(identifier);
    return found == versions.end() ? none : found->second;
}

// An empty reading is not kept: the next question looks at the folder again.
void InstalledHistory::Read() {
    if (!stems.empty()) {
        return;
    }
    stems = ReadHistoryStems(folder);
    for (const std::string& stem : stems) {
        const std::string identifier = IdentifierOfStem(stem);
        std::vector<HVL::Version>& known = versions[identifier];
        if (known.empty()) {
            identifiers.push_back(identifier);
        }
        known.emplace_back(VersionOfStem(stem));
    }
}

}  // namespace HV
