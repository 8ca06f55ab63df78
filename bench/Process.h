#pragma once

#include <string>
#include <vector>

namespace HVBench {

/// What one run of a program took.
struct Run {
    double seconds = 0;
    double processorSeconds = 0;  // its own and those of the programs that it waited for, in the system's calls as well
    long peakKilobytes = 0;       // the most memory that it held at once
    int status = 0;
};

/// Runs a program to its end over the machine in the folder `machine`; what it prints is dropped.
///
/// What earlier runs left to be written goes to the disk first, so that nobody pays for another's files. Throws
/// std::runtime_error when it cannot be started, or ends otherwise than with `expectedStatus`: a run that failed
/// measures nothing.
Run RunProgram(const std::vector<std::string>& command, const std::string& machine, int expectedStatus = 0);

}  // namespace HVBench
