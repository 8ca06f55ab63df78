#include "tests/support/ScriptedProcesses.h"

#include <algorithm>

#include "platform/win32.h"

ProcessScript& ProcessScript::Current() {
    static ProcessScript script;
    return script;
}

ProcessScript& ProcessScript::Renew() {
    return Current() = ProcessScript();
}

ProcessScript& ProcessScript::Runs(const std::string& path) {
    processes.push_back({.number = static_cast<std::uint32_t>(1000 + 4 * processes.size()), .path = path});
    return *this;
}

namespace {

ProcessScript& Script() {
    return ProcessScript::Current();
}

const ScriptedProcess& ProcessOf(HANDLE handle) {
    return *static_cast<const ScriptedProcess*>(handle);
}

BOOL EnumScriptedProcesses(LPDWORD numbers, DWORD size, LPDWORD filled) {
    ++Script().snapshots;
    Script().listBytes = size;
    if (Script().listFails) {
        return FALSE;
    }
    const std::size_t count = std::min<std::size_t>(Script().processes.size(), size / sizeof(DWORD));
    std::transform(Script().processes.begin(), Script().processes.begin() + static_cast<std::ptrdiff_t>(count), numbers,
                   [](const ScriptedProcess& process) { return process.number; });
    *filled = static_cast<DWORD>(count * sizeof(DWORD));
    return TRUE;
}

HANDLE OpenScriptedProcess(DWORD access, BOOL inherit, DWORD number) {
    Script().processAccess = static_cast<std::uint32_t>(access);
    Script().inherited = inherit != FALSE;
    const auto found = std::ranges::find(Script().processes, number, &ScriptedProcess::number);
    return found != Script().processes.end() && found->opens ? &*found : nullptr;
}

BOOL EnumScriptedModules(HANDLE process, HMODULE* modules, DWORD size, LPDWORD needed) {
    Script().moduleBytes = static_cast<std::uint32_t>(size);
    *modules = static_cast<HMODULE>(process);
    *needed = 40 * sizeof(HMODULE);
    return ProcessOf(process).showsModules ? TRUE : FALSE;
}

/// As the system does with a path that does not fit: nothing ends it.
DWORD GetScriptedFileName(HANDLE process, HMODULE module, LPSTR path, DWORD size) {
    Script().pathCharacters = static_cast<std::uint32_t>(size);
    const std::string& whole = ProcessOf(process).path;
    const std::size_t length = module == process ? whole.copy(path, size) : 0;
    if (length < size) {
        path[length] = '\0';
    }
    return static_cast<DWORD>(length);
}

BOOL OpenScriptedToken(HANDLE process, DWORD access, HANDLE* token) {
    Script().tokenAccess = static_cast<std::uint32_t>(access);
    *token = process;
    return ProcessOf(process).showsToken ? TRUE : FALSE;
}

BOOL GetScriptedTokenInformation(HANDLE token, TOKEN_INFORMATION_CLASS what, LPVOID block, DWORD size, LPDWORD needed) {
    Script().tokenClass = what;
    const std::vector<char>& user = ProcessOf(token).user;
    *needed = static_cast<DWORD>(user.size());
    if (block == nullptr || size < user.size()) {
        return FALSE;
    }
    std::copy(user.begin(), user.end(), static_cast<char*>(block));
    *needed = ProcessOf(token).takesUserBack ? 0 : *needed;
    return TRUE;
}

}  // namespace

#define K32EnumProcesses EnumScriptedProcesses
#define OpenProcess OpenScriptedProcess
#define K32EnumProcessModules EnumScriptedModules
#define K32GetModuleFileNameExA GetScriptedFileName
#define OpenProcessToken OpenScriptedToken
#define GetTokenInformation GetScriptedTokenInformation

// The operations under test, with the system's answers replaced: they stand here in place of those of their room.
#include "system/Processes.cpp"
