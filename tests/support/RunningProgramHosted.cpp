#include <gtest/gtest.h>
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <filesystem>

#include "tests/support/Machine.h"
#include "tests/support/RunningProgram.h"

struct RunningProgram::Process {
    pid_t number = 0;
};

RunningProgram::RunningProgram(Machine& machine, const std::string& path) {
    machine.HasFolder(path.substr(0, path.rfind('\\')));
    const std::string file = machine.HostName(path);
    std::error_code error;
    std::filesystem::copy_file(HV_PROGRAM_FOLDER "/waiting_program", file, error);
    char* arguments[] = {const_cast<char*>(file.c_str()), nullptr};
    pid_t number = 0;
    // Returns when the new process runs the new program.
    const int failed = error ? error.value() : posix_spawn(&number, file.c_str(), nullptr, nullptr, arguments, environ);
    if (failed != 0) {
        ADD_FAILURE() << "cannot start " << file << ": " << std::strerror(failed);
        return;
    }
    process_ = std::make_unique<Process>(Process{number});
}

RunningProgram::~RunningProgram() {
    End();
}

void RunningProgram::End() {
    if (process_) {
        kill(process_->number, SIGKILL);
        while (waitpid(process_->number, nullptr, 0) < 0 && errno == EINTR) {
        }
        process_.reset();
    }
}
