#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <thread>

#include "platform/utf8.h"
#include "platform/win32.h"
#include "tests/support/Machine.h"
#include "tests/support/RunningProgram.h"

struct RunningProgram::Process {
    HANDLE handle = nullptr;
};

namespace {

/// A new process has its list of modules only after a while.
bool CanBeSeen(HANDLE process) {
    using namespace std::chrono_literals;
    char path[1024];
    const auto deadline = std::chrono::steady_clock::now() + 30s;
    while (std::chrono::steady_clock::now() < deadline) {
        HMODULE module = nullptr;
        DWORD needed = 0;
        if (K32EnumProcessModules(process, &module, sizeof module, &needed) &&
            K32GetModuleFileNameExA(process, module, path, sizeof path) > 0) {
            return true;
        }
        std::this_thread::sleep_for(10ms);
    }
    return false;
}

}  // namespace

RunningProgram::RunningProgram(Machine& machine, const std::string& path) {
    machine.HasFolder(path.substr(0, path.rfind('\\')));
    const std::filesystem::path file = platform::WideFromUtf8(path);
    std::error_code error;
    std::filesystem::copy_file("Z:" HV_PROGRAM_FOLDER "/waiting_program.exe", file, error);
    STARTUPINFOW start{};
    start.cb = sizeof start;
    PROCESS_INFORMATION process{};
    if (error ||
        !CreateProcessW(file.c_str(), nullptr, nullptr, nullptr, FALSE, 0, nullptr, nullptr, &start, &process)) {
        ADD_FAILURE() << "cannot start " << path << ": " << error.message() << " " << GetLastError();
        return;
    }
    CloseHandle(process.hThread);
    process_ = std::make_unique<Process>(Process{process.hProcess});
    EXPECT_TRUE(CanBeSeen(process.hProcess)) << path;
}

RunningProgram::~RunningProgram() {
    End();
}

void RunningProgram::End() {
    if (process_) {
        TerminateProcess(process_->handle, 0);
        WaitForSingleObject(process_->handle, INFINITE);
        CloseHandle(process_->handle);
        process_.reset();
    }
}
