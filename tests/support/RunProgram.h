#pragma once

#include <map>
#include <string>
#include <vector>

/// What a finished program gave: its exit status (-1 when it did not end by itself) and its two streams, as text with
/// CR LF read as LF.
struct ProgramResult {
    int exitStatus = -1;
    std::string output;
    std::string errors;
};

/// Runs one of the shipped programs, such as "hvdeploy", as a user starts it, on the current Machine, and waits for its
/// end. `environment` is set on top of this process's own. A program that cannot be started fails the test.
ProgramResult RunProgram(const std::string& program, const std::vector<std::string>& arguments,
                         const std::map<std::string, std::string>& environment = {});
