#pragma once

#include <string>
#include <vector>

#include "platform/running_processes.h"

/// What a test says that runs. A program that has ScriptedProcesses.cpp among its sources asks here and not the system:
/// there are processes that no test can bring about, and systems that fail.
///
/// There is one. A test begins by Renew().
struct ProcessScript {
    static ProcessScript& Current();
    static ProcessScript& Renew();
    /// A running program that can be inspected.
    ProcessScript& Runs(const std::string& path);

    std::vector<platform::RunningProcess> processes;
    bool listFails = false;
    int snapshots = 0;  // how often the list was asked for
};
