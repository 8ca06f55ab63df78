#pragma once

#include <string>

#include "platform/filesystem.h"
#include "platform/win32.h"

/// System directories by keyword: a manifest never spells a target folder out, it names one of these.
///
/// Nothing here fails or prints. An unknown keyword is SysDir::Unknown, and an empty path is a normal answer; the
/// caller decides what either means. The directories are names only: they need not exist.
namespace HV {

enum class SysDir {
    Unknown = 0,
    AbsolutePath,
    Applications,
    AppSupport,
    CommonDocs,
    Frameworks,
    LaunchDaemons,
    LocalAppData,
    Ofx,
    ProgramData,
    ProgramFiles,
    ProgramFiles32,
    Logs,
    UserLogs,
    History,
    StartMenu,
    Temp,
    UserAppSupport,
    UsersShared,
    WinSys,
};

/// The directory that `keyword` names, in exactly this case, or SysDir::Unknown. "commonappdata" is "programdata" by
/// another name.
[[nodiscard]] SysDir SysDirFromKeyword(const std::string& keyword);

/// The path of `directory`; empty for AbsolutePath, for Unknown, for a value outside the enumeration, and where the
/// environment variable that it is taken from is not set. ProgramData, ProgramFiles and ProgramFiles32 are read from
/// the environment once in the process's life; all others that depend on it are read at each call.
[[nodiscard]] fs::path GetSystemDirectory(SysDir directory);

/// Where an application goes whose manifest names no directory: that of ProgramFiles.
[[nodiscard]] fs::path GetDefaultInstallDirectory();

}  // namespace HV
