#include "hvdeploy/src/UninstallScripts.h"

#include <cstdio>
#include <ctime>
#include <iostream>
#include <utility>

#include "hvdeploy/src/GuardedFolders.h"
#include "hvdeploy/src/ScriptMaker.h"
#include "hvframework/FileUtils.h"
#include "hvframework/StringUtils.h"
#include "hvframework/Version.h"
#include "platform/files.h"
#include "platform/filesystem.h"
#include "platform/win32.h"
#include "system/RegistryKey.h"
#include "system/SystemDirectories.h"

namespace HV {
namespace {

using namespace HVL::FileUtils;

// The version is part of the name, so a new version gets an entry of its own, and the older one stays until its script
// removes it.
std::string EntryName(const HVL::ProductData& product) {
    return product.GetDisplayName() + " v" + product.GetVersion();
}

std::string RegistryDeleteLine(const HVL::ProductData& product) {
    const std::string key = std::string("HKEY_LOCAL_MACHINE\\") + kInstalledProgramsPath + "\\" + EntryName(product);
    return "CALL reg delete \"" + key + "\" /f";
}

// The call of the separate uninstaller up to the closing quote of its path; the machine's folders do not move while
// the process lives.
const std::string& UninstallerCall() {
    static const std::string call = [] {
        const std::string folder = JoinPath(GetSystemDirectory(SysDir::ProgramFiles).string(), "Halvorn");
        return "CALL \"" + JoinPath(JoinPath(folder, "Services"), "hvuninstaller") + "\"";
    }();
    return call;
}

std::string UninstallerCallLine(const std::string& identifier, const std::string& version) {
    return UninstallerCall() + " command=uninstall identifier=" + identifier + " version=" + version;
}

void MakeParentFolder(const std::string& path) {
    if (const std::string folder = GetParentPath(path); !DirectoryExists(folder)) {
        // A folder that cannot be made shows when the script is opened.
        (void)CreateDirectories(folder);
    }
}

std::uint64_t SizeOf(const std::string& path) {
    boost::system::error_code error;
    const auto size = fs::file_size(fs::path(path), error);
    return error ? 0 : static_cast<std::uint64_t>(size);
}

void AddHeader(ScriptMaker& script) {
    script.AddLine(script.GetHeader());
    script.AddEmptyLine();
}

void AddEcho(ScriptMaker& script, const std::string& name, const std::string& version) {
    script.AddLine(script.MakeEchoLine("Uninstalling " + name + " v" + version));
    script.AddEmptyLine();
}

void SetText(HKEY key, const char* name, const std::string& text) {
    RegSetValueExA(key, name, 0, REG_SZ, reinterpret_cast<const BYTE*>(text.c_str()),
                   static_cast<DWORD>(text.size() + 1));
}

void SetNumber(HKEY key, const char* name, int number) {
    const auto value = static_cast<DWORD>(number);
    RegSetValueExA(key, name, 0, REG_DWORD, reinterpret_cast<const BYTE*>(&value), sizeof value);
}

std::string Today() {
    const std::time_t now = std::time(nullptr);
    const std::tm* const local = std::localtime(&now);
    char digits[32];
    std::snprintf(digits, sizeof digits, "%.4d%.2d%.2d", local->tm_year + 1900, local->tm_mon + 1, local->tm_mday);
    return digits;
}

}  // namespace

const char* const kUninstallScriptFolder = "C:\\ProgramData\\Halvorn\\uninstall";

// Fixed (contracts, removal script): bare carriage returns between the lines, and no equals sign after the first
// SCRIPT_NAME.
std::string ScriptMaker::GetHeader() const {
    return "@echo off\rSET SCRIPT_NAME%0\rSET SCRIPT_DIR=%~dp0\rSET SCRIPT_PATH=%SCRIPT_DIR%%SCRIPT_NAME%\r";
}

std::string GetUninstallScriptPath(const Package& package, const HVL::ProductData& product) {
    std::string tag;
    if (!product.GetIdentifier().empty() && !product.GetVersion().empty()) {
        tag = product.GetIdentifier() + "_v" + product.GetVersion();
    } else {
        tag = package.GetName() + "_v" + package.manifest.productVersion;
    }
    return JoinPath(kUninstallScriptFolder, "uninstall-" + tag + ScriptMaker().GetScriptExtension());
}

bool UninstallScripts::WriteStandaloneUninstallScript(std::string& scriptPath,
                                                      const std::vector<std::string>& installedFiles,
                                                      const Package& package, const HVL::ProductData& product,
                                                      const std::string& extraPath) {
    if (scriptPath.empty()) {
        scriptPath = GetUninstallScriptPath(package, product);
    }
    ScriptMaker script;
    if (!ReadExistingLines(scriptPath)) {
        MakeParentFolder(scriptPath);
        AddHeader(script);
        if (!product.GetDisplayName().empty()) {
            AddEcho(script, product.GetDisplayName(), product.GetVersion());
        }
    }
    AddEcho(script, package.GetName(), package.manifest.productVersion);
    // Only the lines of earlier segments are compared: a file that this package reports twice is deleted twice.
    const auto addDeleteLine = [&](const std::string& path) {
        const std::string line = script.MakeDeleteLine(path);
        if (knownLines.count(line) == 0) {
            script.AddLine(line);
        }
    };
    for (const std::string& path : installedFiles) {
        addDeleteLine(path);
    }
    if (!extraPath.empty()) {
        addDeleteLine(extraPath);
    }
    script.AddEmptyLine();
    script.AddLine(RegistryDeleteLine(product));
    script.AddEmptyLine();
    Append(scriptPath, script.GetText());
    return true;
}

bool UninstallScripts::WriteServiceUninstallScript(std::string& scriptPath, const Package& package,
                                                   const HVL::ProductData& product) {
    if (scriptPath.empty()) {
        scriptPath = GetUninstallScriptPath(package, product);
    }
    const std::string& identifier = package.manifest.productId;
    const std::string& version = package.manifest.productVersion;
    ScriptMaker script;
    if (!ReadExistingLines(scriptPath)) {
        std::cout << "DEBUG uninstall script does not exist at " << scriptPath << ", creating it..." << std::endl;
        MakeParentFolder(scriptPath);
        AddHeader(script);
        if (!product.GetDisplayName().empty()) {
            AddEcho(script, product.GetDisplayName(), product.GetVersion());
            script.AddLine(UninstallerCallLine(product.GetIdentifier(), product.GetVersion()));
            script.AddEmptyLine();
        }
    } else {
        const std::string wanted = "identifier=" + identifier + " version=" + version;
        for (const std::string& line : knownLines) {
            if (line.find(wanted) != std::string::npos) {
                return true;
            }
        }
    }
    AddEcho(script, package.GetName(), version);
    script.AddLine(UninstallerCallLine(identifier, version));
    script.AddEmptyLine();
    script.AddLine(RegistryDeleteLine(product));
    script.AddEmptyLine();
    Append(scriptPath, script.GetText());
    return true;
}

// Returns whether the script exists; its lines are in `knownLines` then.
bool UninstallScripts::ReadExistingLines(const std::string& scriptPath) {
    const bool exists = FileExists(scriptPath) && !IsRefused(scriptPath);
    if (exists && scriptPath == knownPath && SizeOf(scriptPath) == knownSize) {
        return true;
    }
    knownPath.clear();
    knownLines.clear();
    if (exists) {
        std::vector<std::string> lines;
        // A script that cannot be read counts as one without lines; the segment is appended to it all the same.
        (void)ReadFileLines(scriptPath, lines);
        knownLines.insert(lines.begin(), lines.end());
    }
    return exists;
}

void UninstallScripts::Append(const std::string& scriptPath, const std::string& text) {
    if (IsRefused(scriptPath)) {
        return;
    }
    std::FILE* const file = platform::OpenStream(scriptPath, "a");
    if (file == nullptr) {
        return;
    }
    const bool isWritten = std::fwrite(text.data(), 1, text.size(), file) == text.size();
    if (std::fclose(file) != 0 || !isWritten) {
        // The run does not fail for it; only what stands in the file now has to be read again.
        knownPath.clear();
        return;
    }
    for (std::string& line : HVL::StringUtils::Split(text, '\n')) {
        knownLines.insert(std::move(line));
    }
    knownPath = scriptPath;
    knownSize = SizeOf(scriptPath);
}

void OSRegisterUninstall(const std::string& scriptPath, const HVL::ProductData& product) {
    if (!FileExists(scriptPath) || IsRefused(scriptPath)) {
        return;
    }
    Win32RegKeyHandle entry;
    if (!Win32RegKeyHandle::OpenUninstallKey(EntryName(product), entry)) {
        return;
    }
    int majorNumber = 0;
    int minorNumber = 0;
    int patchNumber = 0;
    HVL::Version(product.GetVersion()).GetShortParts(majorNumber, minorNumber, patchNumber);
    // Fixed (contracts, installed programs): these values and no others.
    SetText(entry.key, "DisplayName", product.GetDisplayName());
    SetNumber(entry.key, "MajorVersion", majorNumber);
    SetNumber(entry.key, "MinorVersion", minorNumber);
    SetText(entry.key, "UninstallString", "\"" + scriptPath + "\"");
    SetText(entry.key, "Publisher", "Halvorn LLC");
    SetText(entry.key, "InstallDate", Today());
    SetNumber(entry.key, "NoRepair", 1);
    SetNumber(entry.key, "NoModify", 1);
}

}  // namespace HV
