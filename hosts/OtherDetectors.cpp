#include "hosts/OtherDetectors.h"

#include <cstdint>
#include <iostream>
#include <sstream>
#include <stdexcept>
#include <utility>

#include "hosts/HostRegistry.h"
#include "hvframework/FileUtils.h"
#include "hvframework/FileVersion.h"
#include "hvframework/Log.h"
#include "hvframework/StringUtils.h"
#include "hvframework/Version.h"
#include "platform/filesystem.h"
#include "system/SystemDirectories.h"

namespace HV {
namespace {

HostRecord FreshRecord(HostType type, const char* abbreviation) {
    HostRecord host;
    host.hostType = type;
    host.hostAbbreviation = abbreviation;
    return host;
}

std::string OfxFolder() {
    return GetSystemDirectory(SysDir::Ofx).string();
}

/// Writes `text` and the key's handle to standard output, as one line. Not into the log, whatever its level: who reads
/// the listing of hosts on a machine with EDIUS knows these lines and passes over them.
void PrintHandle(const char* text, const Win32RegKeyHandle& key) {
    std::ostringstream line;
    line << text << "0x" << std::hex << reinterpret_cast<std::uintptr_t>(key.key);
    std::cout << line.str() << std::endl;
}

HostRecord ReadEdius(const Win32RegKeyHandle& key, const std::string& appDir) {
    HostRecord host = FreshRecord(HostType::Edius, "edius");
    host.hostDisplayName = HVL::FileUtils::GetFileName(appDir);
    host.hostVersion = ReadText(key, "ConsistentVersion");
    host.hostAppPath = appDir + "EDIUS.exe";
    host.hostPluginPath = ReadText(key, "PlugInDir");
    host.hostSharedPath = OfxFolder();
    return host;
}

// A product that does not say where it is counts all the same: its plug-ins go to the OFX folder, which needs no
// answer.
HostRecord ReadHitFilm(const Win32RegKeyHandle& paths) {
    const std::string appDir = ReadText(paths, "Application");
    HostRecord host = FreshRecord(HostType::HitFilm, "hitfilm");
    host.hostAppPath = appDir + "HitFilmPro.exe";
    host.hostDisplayName = HVL::FileUtils::GetFileName(appDir);
    host.hostPluginPath = OfxFolder();
    host.hostSharedPath = OfxFolder();
    host.hostPresetsPath = ReadText(paths, "PluginPresets");
    HVL::Version version;
    // An executable without a version leaves the text empty.
    static_cast<void>(HVL::GetFileVersion(host.hostAppPath, version));
    host.hostVersion = version.text;
    return host;
}

/// The folder in which all versions of Vegas keep their help; empty where no version has said so.
std::string VegasHelpFolder() {
    Win32RegKeyHandle shared;
    if (!OpenSoftwareKey("Sony Creative Software\\Shared Information", shared)) {
        return "";
    }
    // Asked for with its neighbour and put to no use: nothing of ours goes among the components that versions share.
    static_cast<void>(ReadText(shared, "SharedComponentsFolder"));
    return ReadText(shared, "HelpFolder");
}

// A folder that cannot be listed costs the executable and nothing else: one version that is in disorder must not keep
// the other hosts of the machine from being found.
std::string VegasExecutable(const std::string& version, const std::string& appDir) {
    try {
        std::vector<std::string> files;
        const bool matched = HVL::FileUtils::MatchFilesInDirectory(appDir, "vegas*.exe", files);
        return VegasDetector_Win::FirstMatch(matched, files);
    } catch (const fs::filesystem_error& error) {
        HVL_LOG(Warn, "could not list the folder of Vegas " << version << ": " << error.what());
        return "";
    }
}

HostRecord MakeVegas(const std::string& version, const std::string& appDir, const std::string& helpFolder) {
    // It has no display name: a version of Vegas is told by its number alone, and listings have never shown another.
    HostRecord host = FreshRecord(HostType::Vegas, "vegas");
    host.hostVersion = version;
    host.hostAppPath = VegasExecutable(version, appDir);
    host.hostPluginPath = OfxFolder();
    host.hostSharedPath = OfxFolder();
    host.hostDocsPath = helpFolder;
    return host;
}

}  // namespace

bool EdiusDetector_Win::Run(std::vector<HostRecord>& hosts) {
    hosts.clear();
    Win32RegKeyHandle edius;
    if (!OpenSoftwareKey("\\Grass Valley\\EDIUS", edius)) {
        return false;
    }
    PrintHandle("DEBUG ediusReg hkey: ", edius);
    for (const std::string& name : SubkeyNames(edius)) {
        Win32RegKeyHandle instance;
        if (!Win32RegKeyHandle::OpenPath(edius.key, "\\" + name + "\\Installation\\EDIUS", instance, false)) {
            continue;
        }
        PrintHandle("DEBUG ediusInstance hkey: ", instance);
        const std::string appDir = ReadText(instance, "DestDir");
        if (!appDir.empty()) {
            hosts.push_back(ReadEdius(instance, appDir));
        }
    }
    return !hosts.empty();
}

bool HitFilmDetector_Win::Run(std::vector<HostRecord>& hosts) {
    hosts.clear();
    Win32RegKeyHandle vendor;
    if (!OpenSoftwareKey("FXHOME", vendor)) {
        return false;
    }
    for (const std::string& product : SubkeyNames(vendor)) {
        Win32RegKeyHandle paths;
        if (HVL::StringUtils::StartsWith(product, "HitFilm") &&
            Win32RegKeyHandle::OpenPath(vendor.key, product + "\\Paths", paths, false)) {
            hosts.push_back(ReadHitFilm(paths));
        }
    }
    return !hosts.empty();
}

bool MediaComposerDetector_Win::Run(std::vector<HostRecord>& hosts) {
    hosts.clear();
    Win32RegKeyHandle application;
    Win32RegKeyHandle plugins;
    if (!OpenSoftwareKey("Avid Technology\\Avid Media Composer", application) ||
        !OpenSoftwareKey("Avid Technology\\AVX Plug-ins", plugins)) {
        return false;
    }
    // The two keys are proof enough: values that are missing leave their fields empty, and the host counts all the
    // same.
    HostRecord host = FreshRecord(HostType::MediaComposer, "mediacomposer");
    host.hostDisplayName = HVL::FileUtils::GetFileName(ReadText(application, "InstallDir"));
    host.hostVersion = ReadText(application, "Version");
    host.hostAppPath = ReadText(application, "InstallFile");
    host.hostPluginPath = ReadText(plugins, "AVX2Directory");
    hosts.push_back(std::move(host));
    return true;
}

bool ResolveDetector_Win::Run(std::vector<HostRecord>& hosts) {
    hosts.clear();
    Win32RegKeyHandle resolve;
    if (!OpenSoftwareKey("Blackmagic Design\\DaVinci Resolve", resolve)) {
        return false;
    }
    // Resolve does not say where it is.
    const std::string appDir =
        GetSystemDirectory(SysDir::ProgramFiles).string() + "\\Blackmagic Design\\DaVinci Resolve";
    HostRecord host = FreshRecord(HostType::Resolve, "resolve");
    host.hostDisplayName = HVL::FileUtils::GetFileName(appDir);
    host.hostVersion = ReadText(resolve, "Version");
    host.hostAppPath = appDir + "\\Resolve.exe";
    // Without a plug-in folder of its own, plug-ins for Resolve go to the shared one.
    host.hostSharedPath = OfxFolder();
    hosts.push_back(std::move(host));
    return true;
}

bool VegasDetector_Win::Run(std::vector<HostRecord>& hosts) {
    hosts.clear();
    Win32RegKeyHandle vegas;
    if (!OpenSoftwareKey("Sony Creative Software\\Vegas Pro", vegas)) {
        return false;
    }
    const std::string helpFolder = VegasHelpFolder();
    for (const std::string& version : SubkeyNames(vegas)) {
        const Win32RegKeyHandle key(vegas.key, version, false);
        const std::string appDir = key.key != nullptr ? ReadText(key, "InstallPath") : "";
        if (!appDir.empty()) {
            hosts.push_back(MakeVegas(version, appDir, helpFolder));
        }
    }
    return !hosts.empty();
}

std::string VegasDetector_Win::FirstMatch(bool matched, const std::vector<std::string>& files) {
    if (matched && files.empty()) {
        throw std::logic_error("Unexpected error, MatchFilesInDirectory() returned true but result vector is empty.");
    }
    return matched ? files.front() : "";
}

}  // namespace HV
