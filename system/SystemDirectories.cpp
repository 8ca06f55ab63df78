#include "system/SystemDirectories.h"

#include <map>
#include <string_view>

#include "hvframework/FileUtils.h"
#include "hvframework/StringUtils.h"

namespace HV {
namespace {

using HVL::FileUtils::JoinPath;
using HVL::StringUtils::GetEnvironmentValue;

using KeywordMap = std::map<std::string, SysDir>;

// The map is made at the first look-up, which comes before a deployment starts its thread.
const KeywordMap& Keywords() {
    static const KeywordMap keywords = {
        {"absolutepath", SysDir::AbsolutePath},
        {"applications", SysDir::Applications},
        {"appsupport", SysDir::AppSupport},
        {"commonappdata", SysDir::ProgramData},
        {"commondocs", SysDir::CommonDocs},
        {"frameworks", SysDir::Frameworks},
        {"history", SysDir::History},
        {"launchdaemons", SysDir::LaunchDaemons},
        {"localappdata", SysDir::LocalAppData},
        {"logs", SysDir::Logs},
        {"ofx", SysDir::Ofx},
        {"programdata", SysDir::ProgramData},
        {"programfiles", SysDir::ProgramFiles},
        {"programfiles32", SysDir::ProgramFiles32},
        {"startmenu", SysDir::StartMenu},
        {"temp", SysDir::Temp},
        {"userappsupport", SysDir::UserAppSupport},
        {"userlogs", SysDir::UserLogs},
        {"usersshared", SysDir::UsersShared},
        {"winsys", SysDir::WinSys},
    };
    return keywords;
}

std::string EnvironmentOr(const char* name, const char* fallback) {
    const std::string value = GetEnvironmentValue(name);
    return value.empty() ? fallback : value;
}

// These three are asked for over and over while a run places files, and have to name one place throughout: each keeps
// what its first call found, even if the environment changes later.

const std::string& ProgramDataDirectory() {
    static const std::string directory = EnvironmentOr("ProgramData", R"(C:\ProgramData)");
    return directory;
}

const std::string& ProgramFilesDirectory() {
    static const std::string directory = EnvironmentOr("PROGRAMFILES", R"(C:\Program Files)");
    return directory;
}

const std::string& ProgramFiles32Directory() {
    static const std::string directory = EnvironmentOr("ProgramFiles(x86)", R"(C:\Program Files (x86))");
    return directory;
}

// Fixed (contracts, system directories): an unset variable gives `\Halvorn\logs`, on the current drive. Neither the
// fallback of ProgramDataDirectory nor what that one remembers is taken.
std::string LogsBelow(const char* variable) {
    return JoinPath(JoinPath(GetEnvironmentValue(variable), "Halvorn"), "logs");
}

std::string UserAppSupportDirectory() {
    return JoinPath(JoinPath(HVL::FileUtils::GetUserHomeDirectory(), "Library"), "Application Support");
}

std::string DirectoryText(SysDir directory) {
    switch (directory) {
        case SysDir::Unknown:
        case SysDir::AbsolutePath:
            return {};
        case SysDir::Applications:
            return "/Applications";
        case SysDir::AppSupport:
            return "/Library/Application Support";
        case SysDir::CommonDocs:
            return R"(C:\Users\Public\Documents)";
        case SysDir::Frameworks:
            return "/Library/Frameworks";
        case SysDir::LaunchDaemons:
            return "/Library/LaunchDaemons";
        case SysDir::LocalAppData:
            return GetEnvironmentValue("LOCALAPPDATA");
        case SysDir::Ofx:
            return R"(C:\Program Files\Common Files\OFX\Plugins)";
        case SysDir::ProgramData:
            return ProgramDataDirectory();
        case SysDir::ProgramFiles:
            return ProgramFilesDirectory();
        case SysDir::ProgramFiles32:
            return ProgramFiles32Directory();
        case SysDir::Logs:
            return LogsBelow("ProgramData");
        case SysDir::UserLogs:
            return LogsBelow("AppData");
        case SysDir::History:
            return R"(C:\ProgramData\Halvorn\.hvdeploy\history)";
        case SysDir::StartMenu:
            return R"(C:\ProgramData\Microsoft\Windows\Start Menu\Programs)";
        case SysDir::Temp:
            return HVL::FileUtils::GetTempDirectory();
        case SysDir::UserAppSupport:
            return UserAppSupportDirectory();
        case SysDir::UsersShared:
            return "/Users/Shared";
        case SysDir::WinSys:
            return R"(C:\Windows\System32)";
    }
    return {};
}

}  // namespace

SysDir SysDirFromKeyword(const std::string& keyword) {
    const auto found = Keywords().find(keyword);
    return found == Keywords().end() ? SysDir::Unknown : found->second;
}

fs::path GetSystemDirectory(SysDir directory) {
    return fs::path(DirectoryText(directory));
}

fs::path GetDefaultInstallDirectory() {
    return GetSystemDirectory(SysDir::ProgramFiles);
}

}  // namespace HV
