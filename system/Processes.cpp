#include "system/Processes.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <iterator>
#include <stdexcept>
#include <string_view>

#include "hvframework/StringUtils.h"
#include "platform/win32.h"

namespace HV {
namespace {

/// Processes beyond these are not seen.
constexpr std::size_t kMostProcesses = 1024;
constexpr std::size_t kLongestPath = 1024;

/// The full path of the program that the process runs; empty when it cannot be read.
std::string ProgramOf(HANDLE process) {
    HMODULE program = nullptr;
    DWORD needed = 0;
    // A process has many modules, and the program is the first.
    // NOLINTNEXTLINE(bugprone-sizeof-expression): a module's handle is a pointer.
    if (!K32EnumProcessModules(process, &program, sizeof program, &needed)) {
        return {};
    }
    std::array<char, kLongestPath> path{};
    if (K32GetModuleFileNameExA(process, program, path.data(), static_cast<DWORD>(path.size())) == 0) {
        return {};
    }
    // A path that has been cut need not end in a null.
    return {path.begin(), std::find(path.begin(), path.end(), '\0')};
}

std::string FileNameOf(const std::string& path) {
    const std::size_t separator = path.rfind('\\');
    return separator == std::string::npos ? std::string() : path.substr(separator + 1);
}

/// The first four bytes of what the system says of the user who runs the process, or 0.
std::uint32_t OwnerTagOf(HANDLE process) {
    HANDLE token = nullptr;
    if (!OpenProcessToken(process, TOKEN_READ, &token)) {
        return 0;
    }
    DWORD size = 0;
    GetTokenInformation(token, TokenUser, nullptr, 0, &size);
    std::uint32_t tag = 0;
    std::vector<char> block(std::max<std::size_t>(size, sizeof tag));
    if (GetTokenInformation(token, TokenUser, block.data(), size, &size) && size > 0) {
        std::memcpy(&tag, block.data(), sizeof tag);
    }
    return tag;
}

// The handles of the process and of its token are not closed: the wizard asks a few times in its life, and they end
// with it. An open handle also keeps the number from being given to another process while a record names it.
bool ReadProcess(DWORD number, ProcessRecord& record) {
    const HANDLE process = OpenProcess(PROCESS_QUERY_INFORMATION | PROCESS_VM_READ, FALSE, number);
    if (process == nullptr) {
        return false;
    }
    record.processId = static_cast<std::uint32_t>(number);
    record.fullPath = ProgramOf(process);
    record.name = FileNameOf(record.fullPath);
    record.ownerTag = OwnerTagOf(process);
    return true;
}

}  // namespace

Processes::Processes() {
    Refresh();
}

int Processes::Refresh() {
    records.clear();
    std::array<DWORD, kMostProcesses> numbers{};
    DWORD filled = 0;
    if (!K32EnumProcesses(numbers.data(), sizeof numbers, &filled)) {
        return -1;
    }
    const std::size_t count = filled / sizeof(DWORD);
    for (std::size_t at = 0; at < count; ++at) {
        ProcessRecord record;
        if (ReadProcess(numbers[at], record)) {
            records.push_back(std::move(record));
        }
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
