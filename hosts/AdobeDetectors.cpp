#include "hosts/AdobeDetectors.h"

#include <array>
#include <optional>
#include <string>
#include <utility>

#include "hosts/HostRegistry.h"
#include "hvframework/FileUtils.h"
#include "hvframework/Log.h"
#include "hvframework/Version.h"
#include "system/SystemDirectories.h"

namespace HV {
namespace {

/// Builds the record of the version `version` from its key, or nothing when something is missing.
using ReadHost = std::optional<HostRecord> (*)(const Win32RegKeyHandle& key, const std::string& version);

/// One record for each subkey of `product` that is no older than `minimum` and that `read` makes a record of.
bool ReadVersions(const std::string& product, const std::string& minimum, ReadHost read,
                  std::vector<HostRecord>& hosts) {
    hosts.clear();
    Win32RegKeyHandle versions;
    if (!OpenSoftwareKey(product, versions)) {
        return false;
    }
    for (const std::string& version : SubkeyNames(versions)) {
        if (HVL::Version(version).IsLess(HVL::Version(minimum))) {
            continue;
        }
        const Win32RegKeyHandle key(versions.key, version, false);
        if (key.key == nullptr) {
            continue;
        }
        if (auto host = read(key, version)) {
            hosts.push_back(std::move(*host));
        }
    }
    return !hosts.empty();
}

/// A fresh record with what both hosts read alike. A host counts only when it has both of these folders.
HostRecord FreshRecord(HostType type, const char* abbreviation, const std::string& version,
                       const Win32RegKeyHandle& key) {
    HostRecord host;
    host.hostType = type;
    host.hostAbbreviation = abbreviation;
    host.hostVersion = version;
    host.hostPluginPath = ReadText(key, "PluginInstallPath");
    host.hostSharedPath = ReadText(key, "CommonPluginInstallPath");
    return host;
}

bool HasPluginFolders(const HostRecord& host) {
    return !host.hostPluginPath.empty() && !host.hostSharedPath.empty();
}

// The versions are texts, not numbers: "13" does not stand for "13.0", nor "14" for "14.0". The first two lie below
// the lowest version that counts; they stay as the record of where these versions are.
constexpr std::array<std::pair<const char*, const char*>, 9> kAfterEffectsFolders{{
    {"11.0", "\\Adobe\\Adobe After Effects CS6\\Support Files\\"},
    {"12", "\\Adobe\\Adobe After Effects CC\\Support Files\\"},
    {"13", "\\Adobe\\Adobe After Effects CC 2014\\Support Files\\"},
    {"13.5", "\\Adobe\\Adobe After Effects CC 2015\\Support Files\\"},
    {"13.8", "\\Adobe\\Adobe After Effects CC 2015.3\\Support Files\\"},
    {"14", "\\Adobe\\Adobe After Effects CC 2017\\Support Files\\"},
    {"15", "\\Adobe\\Adobe After Effects CC 2018\\Support Files\\"},
    {"16", "\\Adobe\\Adobe After Effects CC 2019\\Support Files\\"},
    {"17", "\\Adobe\\Adobe After Effects 2020\\Support Files\\"},
}};

std::string KnownAfterEffectsFolder(const std::string& version) {
    for (const auto& [name, folder] : kAfterEffectsFolders) {
        if (version == name) {
            return GetSystemDirectory(SysDir::ProgramFiles).string() + folder;
        }
    }
    return "";
}

/// The application's folder, with a separator at its end. A value that is there but empty is an answer too.
std::string AfterEffectsFolder(const Win32RegKeyHandle& key, const std::string& version) {
    std::string folder;
    const bool isRead = key.ReadValue("", "InstallPath", folder) != -1;
    return isRead ? folder : KnownAfterEffectsFolder(version);
}

std::optional<HostRecord> ReadAfterEffects(const Win32RegKeyHandle& key, const std::string& version) {
    const std::string appDir = AfterEffectsFolder(key, version);
    if (appDir.empty()) {
        HVL_LOG(Warn, "could not read app path for host AE version " << version << ", skipping it.");
        return std::nullopt;
    }
    HostRecord host = FreshRecord(HostType::AfterEffects, "aftereffects", version, key);
    if (!HasPluginFolders(host)) {
        HVL_LOG(Warn, "could not read plugin or mediacore path for AE version " << version << ", skipping it.");
        return std::nullopt;
    }
    host.hostAppPath = appDir + "AfterFX.exe";
    host.hostPresetsPath = ReadText(key, "FFXInstallPath");
    host.hostScriptsPath = appDir + "Scripts";
    host.hostDisplayName = HVL::FileUtils::GetFileName(HVL::FileUtils::GetParentPath(appDir));
    return host;
}

std::optional<HostRecord> ReadPremiere(const Win32RegKeyHandle& key, const std::string& version) {
    HostRecord host = FreshRecord(HostType::Premiere, "premiere", version, key);
    if (!HasPluginFolders(host)) {
        HVL_LOG(Warn, "could not read plugin or mediacore path for Premiere version " << version << ", skipping it.");
        return std::nullopt;
    }
    // Premiere does not say where it is; its plug-ins lie two levels below it, in Plug-ins\Common.
    const std::string appDir = HVL::FileUtils::GetParentPath(HVL::FileUtils::GetParentPath(host.hostPluginPath));
    host.hostDisplayName = HVL::FileUtils::GetFileName(appDir);
    host.hostAppPath = appDir + "\\Adobe Premiere Pro.exe";
    return host;
}

}  // namespace

bool AdobeAEDetector_Win::Run(std::vector<HostRecord>& hosts) {
    // Fixed (contracts, hosts): the first word is misspelt.
    HVL_LOG(Debug, "HV::AdobeAEDector_Win "
                       << "HV::AdobeAEDetector_Win::Run");
    return ReadVersions("\\Adobe\\After Effects", "13.0", ReadAfterEffects, hosts);
}

bool AdobePremiereDetector_Win::Run(std::vector<HostRecord>& hosts) {
    return ReadVersions("\\Adobe\\Premiere Pro", "8", ReadPremiere, hosts);
}

}  // namespace HV
