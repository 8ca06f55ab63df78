#include "platform/hosted/processes.h"

#include <dirent.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <cstring>
#include <memory>
#include <optional>
#include <string_view>
#include <vector>

#include "platform/hosted/handle.h"
#include "platform/hosted/machine.h"
#include "platform/utf8.h"

namespace {

using hosted::HandleKind;
using hosted::HandleOf;
using hosted::NumberOf;
using Stat = struct stat;

std::string EntryOf(pid_t process) {
    return "/proc/" + std::to_string(process);
}

std::string ReadLink(const std::string& link) {
    std::array<char, 4096> target{};
    const ssize_t length = readlink(link.c_str(), target.data(), target.size());
    return length > 0 ? std::string(target.data(), static_cast<std::size_t>(length)) : std::string();
}

bool IsSameFile(const std::string& left, const std::string& right) {
    Stat first{};
    Stat second{};
    return stat(left.c_str(), &first) == 0 && stat(right.c_str(), &second) == 0 && first.st_dev == second.st_dev &&
           first.st_ino == second.st_ino;
}

/// The host's name of the program of a process, empty when it may not be known. The host marks the name of a file that
/// has been deleted; a file may also be named so.
std::string HostProgramOf(pid_t process) {
    constexpr std::string_view mark = " (deleted)";
    const std::string link = EntryOf(process) + "/exe";
    std::string name = ReadLink(link);
    if (name.ends_with(mark) && !IsSameFile(name, link)) {
        name.resize(name.size() - mark.size());
    }
    return name;
}

/// The number that names a process in /proc; nothing for its other entries.
std::optional<DWORD> ProcessNumber(std::string_view entry) {
    DWORD number = 0;
    const auto [end, error] = std::from_chars(entry.data(), entry.data() + entry.size(), number);
    return error == std::errc() && end == entry.data() + entry.size() ? std::optional(number) : std::nullopt;
}

/// Nothing when the list cannot be had.
std::optional<std::vector<DWORD>> RunningProcesses() {
    struct Close {
        void operator()(DIR* folder) const { closedir(folder); }
    };
    const std::unique_ptr<DIR, Close> folder(opendir("/proc"));
    if (!folder) {
        return std::nullopt;
    }
    std::vector<DWORD> processes;
    while (const dirent* entry = readdir(folder.get())) {
        if (const auto number = ProcessNumber(entry->d_name)) {
            processes.push_back(*number);
        }
    }
    std::sort(processes.begin(), processes.end());
    return processes;
}

BOOL Refuse(LONG error) {
    SetLastError(static_cast<DWORD>(error));
    return FALSE;
}

}  // namespace

std::string hosted::ProgramOfProcess(pid_t process) {
    return platform::Utf8FromWide(Machine::Current().WindowsPath(HostProgramOf(process)));
}

BOOL K32EnumProcesses(LPDWORD processes, DWORD size, LPDWORD needed) {
    const auto running = RunningProcesses();
    if (!running) {
        return Refuse(ERROR_ACCESS_DENIED);
    }
    const std::size_t count = std::min<std::size_t>(running->size(), size / sizeof(DWORD));
    std::copy_n(running->begin(), count, processes);
    *needed = static_cast<DWORD>(count * sizeof(DWORD));
    return TRUE;
}

HANDLE OpenProcess(DWORD /*access*/, BOOL /*inherit*/, DWORD process) {
    const auto number = static_cast<pid_t>(process);
    if (HostProgramOf(number).empty()) {
        Refuse(access(EntryOf(number).c_str(), F_OK) == 0 ? ERROR_ACCESS_DENIED : ERROR_INVALID_PARAMETER);
        return nullptr;
    }
    return HandleOf(HandleKind::Process, number);
}

BOOL K32EnumProcessModules(HANDLE process, PHMODULE modules, DWORD size, LPDWORD needed) {
    if (NumberOf(process, HandleKind::Process) < 0) {
        return Refuse(ERROR_INVALID_HANDLE);
    }
    constexpr DWORD kOneModule = sizeof(HMODULE);  // NOLINT(bugprone-sizeof-expression): a handle is a pointer.
    *needed = kOneModule;
    if (size >= kOneModule) {
        *modules = reinterpret_cast<HMODULE>(process);
    }
    return TRUE;
}

DWORD K32GetModuleFileNameExA(HANDLE process, HMODULE /*module*/, LPSTR buffer, DWORD size) {
    const int number = NumberOf(process, HandleKind::Process);
    const std::string path = number >= 0 ? hosted::ProgramOfProcess(number) : std::string();
    if (path.empty() || size == 0) {
        Refuse(ERROR_INVALID_HANDLE);
        return 0;
    }
    const std::size_t length = path.copy(buffer, size);
    buffer[std::min<std::size_t>(length, size - 1)] = '\0';
    return static_cast<DWORD>(length);
}

BOOL OpenProcessToken(HANDLE process, DWORD /*access*/, PHANDLE token) {
    const int number = NumberOf(process, HandleKind::Process);
    if (number < 0) {
        return Refuse(ERROR_INVALID_HANDLE);
    }
    *token = HandleOf(HandleKind::Token, number);
    return TRUE;
}

BOOL GetTokenInformation(HANDLE token, TOKEN_INFORMATION_CLASS what, LPVOID block, DWORD size, LPDWORD needed) {
    const int number = NumberOf(token, HandleKind::Token);
    Stat entry{};
    if (number < 0 || what != TokenUser || stat(EntryOf(number).c_str(), &entry) != 0) {
        return Refuse(ERROR_INVALID_HANDLE);
    }
    const DWORD user = entry.st_uid;
    *needed = sizeof user;
    if (size < sizeof user) {
        return Refuse(ERROR_INSUFFICIENT_BUFFER);
    }
    std::memcpy(block, &user, sizeof user);
    return TRUE;
}
