#include "system/Processes.h"

#include <algorithm>
#include <iterator>
#include <stdexcept>
#include <string_view>

#include "hvframework/StringUtils.h"
#include "platform/running_processes.h"

namespace HV {
namespace {

/// Processes beyond these are not seen.
constexpr std::size_t kMostProcesses = 1024;

std::string FileNameOf(const std::string& path) {
    const std::size_t separator = path.rfind('\\');
    return separator == std::string::npos ? std::string() : path.substr(separator + 1);
}

}  // namespace

Processes::Processes() {
    Refresh();
}

int Processes::Refresh() {
    records.clear();
    const auto running = platform::RunningProcesses(kMostProcesses);
    if (!running) {
        return -1;
    }
    for (const platform::RunningProcess& process : *running) {
        records.push_back({process.number, process.ownerTag, FileNameOf(process.program), process.program});
    }
    return 0;
}

bool Processes::FindByName(const std::string& name, std::vector<ProcessRecord>& out) const {
    out.clear();
    std::copy_if(records.begin(), records.end(), std::back_inserter(out),
                 [&](const ProcessRecord& record) { return record.name == name; });
    return !out.empty();
}

bool Processes::FindByPath(const std::string& fragment, std::vector<ProcessRecord>& out) const {
    out.clear();
    std::copy_if(records.begin(), records.end(), std::back_inserter(out),
                 [&](const ProcessRecord& record) { return record.fullPath.find(fragment) != std::string::npos; });
    return !out.empty();
}

std::string HostDisplayName(const ProcessRecord& record) {
    constexpr std::string_view extension = ".exe";
    if (record.name == "AfterFX.exe") {
        return "After Effects";
    }
    // Fixed (contracts, running programs): nothing catches this. A name without room for an extension is that of a
    // process whose name cannot be read, and a box that asks the user to quit a program without a name cannot be
    // answered. The words are said here because each runtime has words of its own for it.
    if (record.name.size() < extension.size()) {
        throw std::out_of_range("invalid string position");
    }
    const std::size_t stem = record.name.size() - extension.size();
    const bool isProgram = std::equal(extension.begin(), extension.end(), record.name.begin() + static_cast<int>(stem),
                                      [](char wanted, char c) { return wanted == HVL::StringUtils::ToLower(c); });
    return isProgram ? record.name.substr(0, stem) : record.name;
}

}  // namespace HV
