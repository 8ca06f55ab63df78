#pragma once

#include <algorithm>
#include <array>

#include "system/SystemDirectories.h"

namespace HV {

/// Whether payloads and shortcuts of this system can be put into `directory`. The other keywords are those of the other
/// system; an application alone may name them.
inline bool IsTargetDirectory(SysDir directory) {
    constexpr std::array targets{
        SysDir::AbsolutePath, SysDir::CommonDocs,     SysDir::LocalAppData, SysDir::Ofx,      SysDir::ProgramData,
        SysDir::ProgramFiles, SysDir::ProgramFiles32, SysDir::Logs,         SysDir::UserLogs, SysDir::History,
        SysDir::StartMenu,    SysDir::Temp,           SysDir::WinSys,
    };
    return std::find(targets.begin(), targets.end(), directory) != targets.end();
}

}  // namespace HV
