#include "platform/windows/script_console.h"

#include <gtest/gtest.h>

#include <array>
#include <iostream>
#include <string>

namespace {

/// This program, as one that was started without a console.
class ScriptConsoleTest : public testing::Test {
protected:
    ScriptConsoleTest() { ::FreeConsole(); }
    ~ScriptConsoleTest() override { ::FreeConsole(); }
};

std::string OutputOf(const char* line) {
    FILE* const stream = _popen(line, "r");
    if (stream == nullptr) {
        return "no stream";
    }
    std::array<char, 256> text{};
    const std::size_t length = std::fread(text.data(), 1, text.size(), stream);
    _pclose(stream);
    return std::string(text.data(), length);
}

TEST_F(ScriptConsoleTest, GivesTheProgramAConsole) {
    ASSERT_EQ(::GetConsoleCP(), 0U);
    platform::WindowlessConsole console;
    EXPECT_TRUE(console.Join());
    EXPECT_NE(::GetConsoleCP(), 0U);
}

TEST_F(ScriptConsoleTest, ShowsNoWindow) {
    platform::WindowlessConsole console;
    ASSERT_TRUE(console.Join());
    EXPECT_EQ(::IsWindowVisible(::GetConsoleWindow()), FALSE);
}

TEST_F(ScriptConsoleTest, KeepsTheConsoleWhenTheObjectHasGone) {
    {
        platform::WindowlessConsole console;
        ASSERT_TRUE(console.Join());
    }
    EXPECT_NE(::GetConsoleCP(), 0U);
    EXPECT_EQ(OutputOf("echo hello"), "hello\n");
}

TEST_F(ScriptConsoleTest, LeavesAConsoleThatIsThereAlone) {
    ASSERT_NE(::AllocConsole(), FALSE);
    const HWND before = ::GetConsoleWindow();
    platform::WindowlessConsole console;
    EXPECT_TRUE(console.Join());
    EXPECT_EQ(::GetConsoleWindow(), before);
}

TEST_F(ScriptConsoleTest, JoinsOnce) {
    platform::WindowlessConsole console;
    EXPECT_TRUE(console.Join());
    EXPECT_TRUE(console.Join());
}

TEST(StandardStreams, StayWhereTheyLead) {
    const int descriptor = _fileno(stdout);
    const intptr_t handle = _get_osfhandle(descriptor);
    platform::OpenMissingStandardStreams();
    EXPECT_EQ(_fileno(stdout), descriptor);
    EXPECT_EQ(_get_osfhandle(descriptor), handle);
}

// Only a program that was started without streams can tell. This one starts itself again, without any, as a test of
// this name, whose exit status is the answer.
constexpr const char* kWithout = "HV_STARTED_WITHOUT_STREAMS";

bool StartedWithoutStreams() {
    return ::GetEnvironmentVariableA(kWithout, nullptr, 0) != 0;
}

int ExitStatusWithoutStreams(const std::string& test) {
    std::array<char, MAX_PATH> program{};
    ::GetModuleFileNameA(nullptr, program.data(), static_cast<DWORD>(program.size()));
    std::string line = "\"" + std::string(program.data()) + "\" --gtest_filter=" + test;
    STARTUPINFOA start{};
    start.cb = sizeof start;
    start.dwFlags = STARTF_USESTDHANDLES;
    PROCESS_INFORMATION made{};
    ::SetEnvironmentVariableA(kWithout, "1");
    const BOOL started = ::CreateProcessA(nullptr, line.data(), nullptr, nullptr, FALSE, DETACHED_PROCESS, nullptr,
                                          nullptr, &start, &made);
    ::SetEnvironmentVariableA(kWithout, nullptr);
    if (started == FALSE) {
        return -1;
    }
    DWORD status = 0;
    ::WaitForSingleObject(made.hProcess, INFINITE);
    ::GetExitCodeProcess(made.hProcess, &status);
    ::CloseHandle(made.hThread);
    ::CloseHandle(made.hProcess);
    return static_cast<int>(status);
}

// What a program without streams or console does, step by step; a number tells which step failed.
int RunAScriptWithoutStreams() {
    if (::GetFileType(::GetStdHandle(STD_OUTPUT_HANDLE)) != FILE_TYPE_UNKNOWN) {
        return 10;  // there is a stream after all, and nothing is shown
    }
    platform::OpenMissingStandardStreams();
    if (::GetFileType(::GetStdHandle(STD_OUTPUT_HANDLE)) == FILE_TYPE_UNKNOWN || _fileno(stdout) != 1) {
        return 11;
    }
    if (!(std::cout << "text" << std::flush) || !(std::cerr << "text") || std::cin.get() != EOF) {
        return 14;
    }
    platform::WindowlessConsole console;
    if (!console.Join()) {
        return 12;
    }
    return OutputOf("echo hello") == "hello\n" ? 42 : 13;
}

TEST(StandardStreams, LetAProgramThatWasStartedWithoutAnyRunAScript) {
    if (StartedWithoutStreams()) {
        ::ExitProcess(static_cast<UINT>(RunAScriptWithoutStreams()));
    }
    EXPECT_EQ(ExitStatusWithoutStreams("StandardStreams.LetAProgramThatWasStartedWithoutAnyRunAScript"), 42);
}

}  // namespace
