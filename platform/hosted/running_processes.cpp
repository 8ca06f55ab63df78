#include "platform/running_processes.h"

#include <dirent.h>
#include <sys/stat.h>

#include <algorithm>
#include <charconv>
#include <memory>
#include <string_view>

#include "platform/hosted/program.h"

namespace platform {
namespace {

/// The number that names a process in /proc; nothing for its other entries.
std::optional<std::uint32_t> ProcessNumber(std::string_view entry) {
    std::uint32_t number = 0;
    const auto [end, error] = std::from_chars(entry.data(), entry.data() + entry.size(), number);
    return error == std::errc() && end == entry.data() + entry.size() ? std::optional(number) : std::nullopt;
}

/// In rising order; nothing when the list cannot be had.
std::optional<std::vector<std::uint32_t>> ProcessNumbers() {
    struct Close {
        void operator()(DIR* folder) const { closedir(folder); }
    };
    const std::unique_ptr<DIR, Close> folder(opendir("/proc"));
    if (!folder) {
        return std::nullopt;
    }
    std::vector<std::uint32_t> numbers;
    while (const dirent* entry = readdir(folder.get())) {
        if (const auto number = ProcessNumber(entry->d_name)) {
            numbers.push_back(*number);
        }
    }
    std::sort(numbers.begin(), numbers.end());
    return numbers;
}

std::uint32_t UserOf(std::uint32_t process) {
    struct stat entry {};
    return stat(("/proc/" + std::to_string(process)).c_str(), &entry) == 0 ? entry.st_uid : 0;
}

}  // namespace

// A process that has ended and only waits for its parent to notice has no program any more, so it is left out.
std::optional<std::vector<RunningProcess>> RunningProcesses(std::size_t most) {
    const auto numbers = ProcessNumbers();
    if (!numbers) {
        return std::nullopt;
    }
    std::vector<RunningProcess> running;
    for (std::size_t at = 0; at < std::min(most, numbers->size()); ++at) {
        const std::uint32_t number = (*numbers)[at];
        const std::string program = hosted::ProgramOfProcess(std::to_string(number));
        if (!program.empty()) {
            running.push_back({number, program.substr(0, kLongestProgram), UserOf(number)});
        }
    }
    return running;
}

}  // namespace platform
