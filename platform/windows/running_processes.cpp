#include "platform/running_processes.h"

#include <algorithm>
#include <array>
#include <cstring>

#include "platform/windows/win32.h"

namespace platform {
namespace {

/// The full path of the program that the process runs; empty when it cannot be read.
std::string ProgramOf(HANDLE process) {
    HMODULE program = nullptr;
    DWORD needed = 0;
    // A process has many modules, and the program is the first.
    // NOLINTNEXTLINE(bugprone-sizeof-expression): a module's handle is a pointer.
    if (!K32EnumProcessModules(process, &program, sizeof program, &needed)) {
        return {};
    }
    std::array<char, kLongestProgram> path{};
    if (K32GetModuleFileNameExA(process, program, path.data(), static_cast<DWORD>(path.size())) == 0) {
        return {};
    }
    // A path that has been cut need not end in a null.
    return {path.begin(), std::find(path.begin(), path.end(), '\0')};
}

/// The first four bytes of what the system says of the user behind the process, or 0.
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

}  // namespace

// The handles of the processes and of their tokens are not closed: the wizard asks a few times in its life, and they
// end with it. An open handle also keeps the number from being given to another process while a record names it.
std::optional<std::vector<RunningProcess>> RunningProcesses(std::size_t most) {
    std::vector<DWORD> numbers(most);
    DWORD filled = 0;
    if (!K32EnumProcesses(numbers.data(), static_cast<DWORD>(most * sizeof(DWORD)), &filled)) {
        return std::nullopt;
    }
    numbers.resize(filled / sizeof(DWORD));
    std::vector<RunningProcess> running;
    for (const DWORD number : numbers) {
        if (const HANDLE process = OpenProcess(PROCESS_QUERY_INFORMATION | PROCESS_VM_READ, FALSE, number)) {
            running.push_back({static_cast<std::uint32_t>(number), ProgramOf(process), OwnerTagOf(process)});
        }
    }
    return running;
}

}  // namespace platform
