#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace platform {

/// A process that this one may look into.
struct RunningProcess {
    std::uint32_t number = 0;
    std::string program = {};    ///< The full path of its program, cut to kLongestProgram; empty when it is not told.
    std::uint32_t ownerTag = 0;  ///< The start of what the system says of its user; 0 when it says nothing.
};

inline constexpr std::size_t kLongestProgram = 1024;

/// Looks at the first `most` processes of the system's list, and gives those of them that this one may look into, in
/// the system's order. Nothing when the list cannot be had.
///
/// Hosted they are the host's processes, in the order of their numbers, and whole programs, never threads. A program in
/// the machine's folder is on drive C, any other on Z. What this process may not look into are other users' processes,
/// unless it is root, and the kernel's own.
std::optional<std::vector<RunningProcess>> RunningProcesses(std::size_t most);

}  // namespace platform
