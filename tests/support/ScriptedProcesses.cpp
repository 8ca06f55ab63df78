#include "tests/support/ScriptedProcesses.h"

#include <algorithm>

ProcessScript& ProcessScript::Current() {
    static ProcessScript script;
    return script;
}

ProcessScript& ProcessScript::Renew() {
    return Current() = ProcessScript();
}

ProcessScript& ProcessScript::Runs(const std::string& path) {
    processes.push_back({.number = static_cast<std::uint32_t>(1000 + 4 * processes.size()), .program = path});
    return *this;
}

// Stands here in place of the platform's own.
std::optional<std::vector<platform::RunningProcess>> platform::RunningProcesses(std::size_t most) {
    ProcessScript& script = ProcessScript::Current();
    ++script.snapshots;
    if (script.listFails) {
        return std::nullopt;
    }
    auto running = script.processes;
    running.resize(std::min(most, running.size()));
    return running;
}
