// What goes with a placed payload: scripts, registry entries and shortcuts.
#include <cstdio>

#include "hvdeploy/src/Deploy.h"
#include "hvdeploy/src/EntryTrace.h"
#include "hvdeploy/src/TargetDirectories.h"
#include "hvframework/FileUtils.h"
#include "hvframework/Log.h"
#include "hvframework/Shortcut.h"
#include "hvframework/StringUtils.h"
#include "platform/win32.h"
#include "system/RegistryKey.h"
#include "system/SystemDirectories.h"

namespace HV {
namespace {

using namespace HVL;

constexpr unsigned kBroadcastTimeoutMilliseconds = 1000;

// Whether `line` begins with a path in quotes. A quoted word without a separator is a command like any other, and a
// second quote in place of the path means that the author has put quotes around the whole already.
bool BeginsWithQuotedPath(const std::string& line) {
    const std::size_t end = line.starts_with('"') ? line.find('"', 1) : std::string::npos;
    return end != std::string::npos && line.substr(1, end - 1).find_first_of("\\/") != std::string::npos;
}

// The command processor takes the first and the last quote off a line that begins with one, but for a line of one kind:
// two quotes in all, and between them the name of a program with a blank and without any of &<>()@^|. A path that is
// not of that kind, as in the folder of a user who is called "A&B", would lose its quotes, and its parts be taken for
// commands. So the line gets one more pair, which is the one that goes.
std::string ForCommandProcessor(const std::string& line) {
    return BeginsWithQuotedPath(line) ? "\"" + line + "\"" : line;
}

// Runs `line` through the command processor and collects what it prints on standard output.
int RunCommandCapture(const std::string& line, std::string& output) {
    output.clear();
    std::FILE* const pipe = _popen(ForCommandProcessor(line).c_str(), "r");
    if (pipe == nullptr) {
        return -1;
    }
    char piece[128];
    while (std::fgets(piece, sizeof piece, pipe) != nullptr) {
        output += piece;
    }
    // Fixed (contracts, scripts): on this platform the status is the exit code itself, so the division makes every code
    // below 256 a success.
    return _pclose(pipe) / 256;
}

std::string ShortcutFolder(const Shortcut& shortcut, SysDir directory) {
    if (directory == SysDir::AbsolutePath) {
        return shortcut.subdir;
    }
    const std::string folder = GetSystemDirectory(directory).string();
    return shortcut.subdir.empty() ? folder : FileUtils::JoinPath(folder, shortcut.subdir);
}

// Fixed (contracts, shortcuts): for folders the search is for any one character of `original`, not for the text.
std::string FindShortcutTarget(const Shortcut& shortcut, const std::vector<std::string>& placedFiles) {
    const bool isFolder = shortcut.originalType == "dir" || shortcut.originalType == "bundle";
    for (const std::string& path : placedFiles) {
        if (!isFolder) {
            if (StringUtils::EndsWith(path, shortcut.original)) {
                return path;
            }
            continue;
        }
        if (const std::size_t position = path.find_first_of(shortcut.original); position != std::string::npos) {
            return path.substr(0, position + shortcut.original.size());
        }
    }
    return {};
}

std::string LinkPath(const std::string& folder, const std::string& original) {
    std::string path = FileUtils::JoinPath(folder, FileUtils::GetFileName(original));
    if (StringUtils::EndsWith(path, ".exe")) {
        path.resize(path.size() - 4);
    }
    return path + ".lnk";
}

bool Exists(const std::string& path) {
    return FileUtils::FileExists(path) || FileUtils::DirectoryExists(path);
}

/// What a line is called in the log: at the start of a text, and inside one.
struct LineKind {
    const char* title;
    const char* noun;
};

// Gives 1 when the line succeeded, `result` when it failed and may fail, -2 when it failed and must not.
EngineResult RunLine(const std::string& line, const PayloadScript& script, const LineKind& kind, EngineResult result) {
    std::string output;
    const int code = RunCommandCapture(line, output);
    HVL_LOG(Debug, kind.title << " output: [id: " << script.id << "] \n" << output);
    if (code == 0) {
        HVL_LOG(Debug, "Script execution succeeded");
        return kPlaced;
    }
    if (script.failOnError) {
        HVL_LOG(Error, kind.noun << " returned " << code);
        return kDeploymentFailed;
    }
    HVL_LOG(Warn, script.id << " execution returned " << code << ". Continuing");
    return result;
}

// Tells running programs that the environment may have changed. Sent for every entry, whatever key it wrote.
void AnnounceEnvironmentChange() {
    SendMessageTimeoutA(HWND_BROADCAST, WM_SETTINGCHANGE, 0, reinterpret_cast<LPARAM>("Environment"), SMTO_ABORTIFHUNG,
                        kBroadcastTimeoutMilliseconds, nullptr);
}

}  // namespace

EngineResult Deploy::RunPreOrPostflight(const PayloadScript& script, const Package& package) {
    TraceEntry(kDeployClass, "RunPreOrPostflight");
    EngineResult result = kNothingDone;
    if (!script.source.empty()) {
        HVL_LOG(Debug, "Running payload script: [id: " << script.id << "]");
        const std::string path = FileUtils::JoinPath(package.extractedPath.string(), script.source);
        HVL_LOG(Debug, "Running payload script: [id: " << script.id << "] : '" << path << "'");
        result = RunLine("\"" + path + "\"", script, {"Script", "script"}, result);
    }
    if (!script.command.empty() && !IsFailure(result)) {
        // The wording holds for the commands of preflights too.
        HVL_LOG(Debug, "Running postflight command: [id:" << script.id << "]");
        HVL_LOG(Debug, "Postflight command: " << script.command);
        result = RunLine(script.command, script, {"Command", "command"}, result);
    }
    return result;
}

EngineResult Deploy::MakeRegistryEntry(const RegistryEntry& entry) {
    TraceEntry(kDeployClass, "MakeRegistryEntry");
    if (entry.os != "windows") {
        return kNothingDone;
    }
    HKEY hive = Win32RegKeyHandle::HiveFromName(entry.root);
    if (hive == nullptr) {
        hive = HKEY_LOCAL_MACHINE;
    }
    Win32RegKeyHandle key;
    if (!Win32RegKeyHandle::OpenPath(hive, entry.key, key, true)) {
        return kFailed;
    }
    const LONG result = RegSetKeyValueA(key.key, nullptr, entry.name.c_str(), REG_EXPAND_SZ, entry.value.c_str(),
                                        static_cast<DWORD>(entry.value.size() + 1));
    key.Close();
    if (result == ERROR_SUCCESS) {
        AnnounceEnvironmentChange();
    }
    return static_cast<EngineResult>(result);
}

EngineResult Deploy::MakeShortcut(const Shortcut& shortcut, const std::vector<std::string>& placedFiles,
                                  std::vector<std::string>& installedFiles) {
    TraceEntry(kDeployClass, "MakeShortcut");
    const SysDir directory = SysDirFromKeyword(shortcut.sysdir);
    if (!IsTargetDirectory(directory)) {
        HVL_LOG(Error, "Invalid sysdir specified for shortcut.");
        return kFailed;
    }
    const std::string folder = ShortcutFolder(shortcut, directory);
    if (folder.empty()) {
        HVL_LOG(Error, "Empty shortcut system directory specification.");
        return kFailed;
    }
    const std::string target = FindShortcutTarget(shortcut, placedFiles);
    if (target.empty() || !Exists(target)) {
        HVL_LOG(Error, "Shortcut source path not found.");
        return kFailed;
    }
    if (!FileUtils::DirectoryExists(folder)) {
        // What counts is whether the folder is there now.
        (void)FileUtils::CreateDirectories(folder);
    }
    if (!FileUtils::DirectoryExists(folder)) {
        HVL_LOG(Error, "Failed to create shortcut directory at " << folder);
        return kFailed;
    }
    const std::string link = LinkPath(folder, shortcut.original);
    if (FileUtils::FileExists(link)) {
        return kNothingDone;
    }
    if (const int error = FileUtils::MakeShortcut(target, link); error != 0) {
        HVL_LOG(Error, "MakeShortcut() returned " << error);
        return error;
    }
    // Listed with the files, so that the uninstall script removes it.
    installedFiles.push_back(link);
    return kPlaced;
}

}  // namespace HV
