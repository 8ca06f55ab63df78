#include "package/Package.h"

#include <algorithm>
#include <stdexcept>

#include "hvframework/FileUtils.h"
#include "hvframework/Log.h"
#include "hvframework/XmlNesting.h"
#include "package/PackageNames.h"
#include "package/PayloadSources.h"
#include "package/ZipEntries.h"

namespace HV {
namespace {

using HVL::FileUtils::GetFileName;

constexpr const char* kAbsolutePathKeyword = "absolutepath";

bool IsRegularFile(const fs::path& path) {
    boost::system::error_code error;
    return fs::is_regular_file(path, error);
}

bool IsDirectory(const fs::path& path) {
    boost::system::error_code error;
    return fs::is_directory(path, error);
}

std::string TextUpToZero(const std::vector<char>& bytes) {
    return {bytes.begin(), std::ranges::find(bytes, '\0')};
}

void LogMissingSource(const std::string& name, const Payload& payload) {
    HVL_LOG(Error, "Error in package " << name << "- cannot find source for payload " << payload.id << ", source "
                                       << payload.source);
}

void LogMissingSysDir(const std::string& name, const Payload& payload) {
    HVL_LOG(Error, "Error in package " << name << "-  payload " << payload.id
                                       << " has deployment=sysdir with no sysdir value set.");
}

}  // namespace

Package::Package(const fs::path& path) {
    if (IsNamedAsPackage(path)) {
        if (!IsRegularFile(path)) {
            throw std::runtime_error("File not found at path " + path.string());
        }
        zipPath = path;
    } else if (IsDirectory(path)) {
        extractedPath = path;
    }
}

bool Package::Validate(bool metadataOnly) {
    const std::string name = GetFileName(zipPath.string());
    if (zipPath.empty() || !IsRegularFile(zipPath)) {
        HVL_LOG(Warn, "In HV::Package::Validate - zip does not exist at " << name);
        return false;
    }
    if (ReadZipEntries(zipPath.string(), zipFiles, zipDirs) != 0) {
        HVL_LOG(Error, "ReadZipEntries failed for " << name);
        return false;
    }
    return ReadRootManifest(name) && (metadataOnly || CheckPayloads(name));
}

/// The first root manifest is read before a second one is met and spoils the package.
bool Package::ReadRootManifest(const std::string& name) {
    bool found = false;
    bool parsed = false;
    for (const std::string& entry : zipFiles) {
        if (!IsRootManifest(entry)) {
            continue;
        }
        if (found) {
            HVL_LOG(Warn, "In HV::Package::Validate - multiple root manifests found in " << name);
            return false;
        }
        found = true;
        parsed = ParseManifestEntry(entry, name);
    }
    if (!found) {
        HVL_LOG(Error, "No manifest XML file found in " << name);
    }
    return parsed;
}

bool Package::ParseManifestEntry(const std::string& entry, const std::string& name) {
    std::vector<char> bytes;
    if (ReadZipEntryBytes(zipPath.string(), entry, bytes, HVL::kLongestXml) != 0) {
        HVL_LOG(Error, "Reading zip file byts of manifest.xml failed for " << name);
        return false;
    }
    if (!manifest.Parse(TextUpToZero(bytes))) {
        HVL_LOG(Error, "Manifest XML parsing failed for " << name);
        return false;
    }
    return true;
}

bool Package::CheckPayloads(const std::string& name) const {
    const PayloadSources sources(zipDirs, zipFiles);
    for (const Payload& payload : manifest.payloads) {
        if (!payload.MatchesOS()) {
            continue;
        }
        if (!sources.Has(payload.source)) {
            LogMissingSource(name, payload);
            return false;
        }
        if (payload.deployment == DeploymentType::SysDir && payload.sysdir.empty()) {
            LogMissingSysDir(name, payload);
            return false;
        }
    }
    return true;
}

bool Package::ExtractTo(const fs::path& destination) {
    if (zipPath.empty() || !IsRegularFile(zipPath) || ExtractZip(zipPath.string(), destination.string()) != 0) {
        return false;
    }
    extractedPath = destination;
    return IsExtracted();
}

bool Package::IsExtracted() const {
    return !extractedPath.empty() && IsDirectory(extractedPath);
}

std::string Package::GetName() const {
    return zipPath.empty() ? manifest.productId : GetFileName(zipPath.string());
}

void Package::GetPayloadPaths(const fs::path& destDir, const Payload& payload,
                              std::vector<PayloadPathPair>& out) const {
    if (destDir.empty() && payload.sysdir != kAbsolutePathKeyword) {
        HVL_LOG(Error, "unexpected logic issue in HV::Package::"
                           << "HV::Package::GetPayloadPaths"
                           << " - destPath is empty.");
        return;
    }
    out.clear();
    const fs::path base = payload.subpath.empty() ? destDir : destDir / payload.subpath;
    const fs::path source = extractedPath / payload.source;
    if (payload.HasWildcardSource()) {
        AddMatchingItems(base, source, out);
        return;
    }
    const fs::path destination = base / GetFileName(source.string());
    if (destination.empty()) {
        HVL_LOG(Error, "dest path is empty in HV::Package::"
                           << "HV::Package::GetPayloadPaths"
                           << " line "
                           << "277");
    }
    out.push_back({source, destination});
}

/// Only the last component is a pattern: a `*` in a folder's name is looked for as it stands.
void Package::AddMatchingItems(const fs::path& base, const fs::path& wildcard,
                               std::vector<PayloadPathPair>& out) const {
    const std::string full = wildcard.string();
    const std::string pattern = GetFileName(full);
    const fs::path folder(HVL::FileUtils::GetParentPath(full));
    for (const fs::directory_entry& entry : fs::directory_iterator(folder)) {
        const fs::path name = entry.path().filename();
        if (pattern == "*" || HVL::FileUtils::MatchesWildcard(pattern, name.string())) {
            out.push_back({folder / name, base / name});
        }
    }
}

}  // namespace HV
