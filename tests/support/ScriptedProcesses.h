#pragma once

#include <cstdint>
#include <string>
#include <vector>

/// One process as the system is to tell of it.
struct ScriptedProcess {
    std::uint32_t number = 0;
    std::string path = {};
    std::vector<char> user = {};  // the block that tells of the user
    bool takesUserBack = false;   // the block is written, and then said to be empty
    bool opens = true;
    bool showsModules = true;
    bool showsToken = true;
};

/// The system's answers to who asks for processes, and how it was asked. A program that has ScriptedProcesses.cpp among
/// its sources asks here and not the system: there are processes that no test can bring about, and systems that fail.
///
/// There is one. A test begins by Renew().
struct ProcessScript {
    static ProcessScript& Current();
    static ProcessScript& Renew();
    /// A running program that can be inspected.
    ProcessScript& Runs(const std::string& path);

    std::vector<ScriptedProcess> processes;
    bool listFails = false;

    int snapshots = 0;  // how often the list was asked for
    std::uint32_t listBytes = 0;
    std::uint32_t processAccess = 0;
    bool inherited = true;
    std::uint32_t moduleBytes = 0;
    std::uint32_t pathCharacters = 0;
    std::uint32_t tokenAccess = 0;
    std::int32_t tokenClass = 0;
};
