// Which calls the list of running processes is asked for by, and what becomes of their answers, those included that no
// real process gives on demand.
#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

#include "platform/running_processes.h"
#include "platform/windows/win32.h"

namespace {

/// One process as the system is to tell of it.
struct ScriptedProcess {
    DWORD number = 0;
    std::string path = {};
    std::vector<char> user = {};  // the block that tells of the user
    bool takesUserBack = false;   // the block is written, and then said to be empty
    bool opens = true;
    bool showsModules = true;
    bool showsToken = true;
};

/// The system's answers, and how it was asked.
struct SystemScript {
    std::vector<ScriptedProcess> processes;
    bool listFails = false;

    DWORD listBytes = 0;
    DWORD processAccess = 0;
    bool inherited = true;
    DWORD moduleBytes = 0;
    DWORD pathCharacters = 0;
    DWORD tokenAccess = 0;
    int tokenClass = 0;
};
SystemScript script;

const ScriptedProcess& ProcessOf(HANDLE handle) {
    return *static_cast<const ScriptedProcess*>(handle);
}

BOOL EnumScriptedProcesses(LPDWORD numbers, DWORD size, LPDWORD filled) {
    script.listBytes = size;
    if (script.listFails) {
        return FALSE;
    }
    const std::size_t count = std::min<std::size_t>(script.processes.size(), size / sizeof(DWORD));
    std::transform(script.processes.begin(), script.processes.begin() + static_cast<std::ptrdiff_t>(count), numbers,
                   [](const ScriptedProcess& process) { return process.number; });
    *filled = static_cast<DWORD>(count * sizeof(DWORD));
    return TRUE;
}

HANDLE OpenScriptedProcess(DWORD access, BOOL inherit, DWORD number) {
    script.processAccess = access;
    script.inherited = inherit != FALSE;
    const auto found = std::ranges::find(script.processes, number, &ScriptedProcess::number);
    return found != script.processes.end() && found->opens ? &*found : nullptr;
}

BOOL EnumScriptedModules(HANDLE process, HMODULE* modules, DWORD size, LPDWORD needed) {
    script.moduleBytes = size;
    *modules = static_cast<HMODULE>(process);
    *needed = 40 * sizeof(HMODULE);
    return ProcessOf(process).showsModules ? TRUE : FALSE;
}

/// As the system does with a path that does not fit: nothing ends it.
DWORD GetScriptedFileName(HANDLE process, HMODULE module, LPSTR path, DWORD size) {
    script.pathCharacters = size;
    const std::string& whole = ProcessOf(process).path;
    const std::size_t length = module == process ? whole.copy(path, size) : 0;
    if (length < size) {
        path[length] = '\0';
    }
    return static_cast<DWORD>(length);
}

BOOL OpenScriptedToken(HANDLE process, DWORD access, HANDLE* token) {
    script.tokenAccess = access;
    *token = process;
    return ProcessOf(process).showsToken ? TRUE : FALSE;
}

BOOL GetScriptedTokenInformation(HANDLE token, TOKEN_INFORMATION_CLASS what, LPVOID block, DWORD size, LPDWORD needed) {
    script.tokenClass = what;
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

// The operation under test, with the system's answers replaced.
#define RunningProcesses ScriptedRunningProcesses
#include "platform/windows/running_processes.cpp"  // NOLINT(bugprone-suspicious-include): its calls are to be replaced.

namespace {

constexpr std::size_t kMost = 1024;

std::vector<platform::RunningProcess> Snapshot(std::vector<ScriptedProcess> processes) {
    script = {.processes = std::move(processes)};
    const auto running = platform::ScriptedRunningProcesses(kMost);
    EXPECT_TRUE(running.has_value());
    return running.value_or(std::vector<platform::RunningProcess>{});
}

TEST(RunningProcessesCalls, AskForTheRightsThatSuffice) {
    Snapshot({{.number = 4, .path = R"(C:\a.exe)"}});
    EXPECT_EQ(script.listBytes, 4096U);
    EXPECT_EQ(script.processAccess, 1040U);
    EXPECT_FALSE(script.inherited);
    EXPECT_EQ(script.moduleBytes, sizeof(void*));
    EXPECT_EQ(script.pathCharacters, 1024U);
    EXPECT_EQ(script.tokenAccess, 0x20008U);
    EXPECT_EQ(script.tokenClass, 1);
}

TEST(RunningProcessesCalls, GiveNothingWhenTheListCannotBeHad) {
    script = {.processes = {{.number = 4, .path = R"(C:\a.exe)"}}, .listFails = true};
    EXPECT_FALSE(platform::ScriptedRunningProcesses(kMost).has_value());
}

TEST(RunningProcessesCalls, KeepTheOrderOfTheSystem) {
    const auto all = Snapshot({{.number = 9, .path = R"(C:\b.exe)"}, {.number = 4, .path = R"(C:\a.exe)"}});
    ASSERT_EQ(all.size(), 2U);
    EXPECT_EQ(all[0].number, 9U);
    EXPECT_EQ(all[0].program, R"(C:\b.exe)");
    EXPECT_EQ(all[1].number, 4U);
}

TEST(RunningProcessesCalls, SeeAsManyAsTheyAreToldTo) {
    EXPECT_EQ(Snapshot(std::vector<ScriptedProcess>(kMost + 1)).size(), kMost);
}

TEST(RunningProcessesCalls, LeaveOutWhatCannotBeOpened) {
    const auto all = Snapshot({{.number = 4, .path = R"(C:\a.exe)", .opens = false},  //
                               {.number = 8, .path = R"(C:\b.exe)"}});
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].number, 8U);
}

TEST(RunningProcessesCalls, GiveNoPathWithoutModules) {
    const auto all = Snapshot({{.number = 4, .path = R"(C:\a.exe)", .user = {1, 0, 0, 0}, .showsModules = false}});
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].number, 4U);
    EXPECT_EQ(all[0].program, "");
    EXPECT_EQ(all[0].ownerTag, 1U);
}

TEST(RunningProcessesCalls, GiveTheFirst1024CharactersOfAPath) {
    const std::string path = R"(C:\)" + std::string(2000, 'x');
    const auto all = Snapshot({{.number = 4, .path = path}});
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].program, path.substr(0, 1024));
}

TEST(RunningProcessesCalls, TakeTheFirstFourBytesOfTheUser) {
    const auto all = Snapshot({{.number = 4, .user = {1, 2, 3, 4, 5, 6, 7, 8}}});
    ASSERT_EQ(all.size(), 1U);
    EXPECT_EQ(all[0].ownerTag, 0x04030201U);
}

// What stands in a block counts only as far as the system says that it has filled it.
TEST(RunningProcessesCalls, GiveTheTagZeroWhereNothingIsSaidOfTheUser) {
    const auto all = Snapshot({{.number = 4, .user = {1, 2, 3, 4}, .showsToken = false},
                               {.number = 8},
                               {.number = 12, .user = {1, 2, 3, 4}, .takesUserBack = true}});
    ASSERT_EQ(all.size(), 3U);
    EXPECT_EQ(all[0].ownerTag, 0U);
    EXPECT_EQ(all[1].ownerTag, 0U);
    EXPECT_EQ(all[2].ownerTag, 0U);
}

}  // namespace
