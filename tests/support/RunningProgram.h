#pragma once

#include <memory>
#include <string>

class Machine;

/// A program that runs at a path of the machine and does nothing, until the object ends: a host that the user has open.
///
/// It can be seen by whoever looks for processes once the constructor has returned. A program that cannot be started
/// fails the test.
class RunningProgram {
public:
    RunningProgram(Machine& machine, const std::string& path);
    ~RunningProgram();
    RunningProgram(const RunningProgram&) = delete;
    RunningProgram& operator=(const RunningProgram&) = delete;

    /// Ends it before the object does.
    void End();

private:
    struct Process;
    std::unique_ptr<Process> process_;
};
