#include "bench/Process.h"

#include <fcntl.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <chrono>
#include <stdexcept>

namespace HVBench {
namespace {

constexpr int kCannotStart = 127;

void WriteOut(const std::string& folder) {
    const int descriptor = ::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (descriptor >= 0) {
        ::syncfs(descriptor);
        ::close(descriptor);
    }
}

[[noreturn]] void Become(const std::vector<std::string>& command, const std::string& machine) {
    std::vector<char*> arguments;
    for (const std::string& argument : command) {
        arguments.push_back(const_cast<char*>(argument.c_str()));
    }
    arguments.push_back(nullptr);
    const int nothing = ::open("/dev/null", O_RDWR);
    ::dup2(nothing, STDOUT_FILENO);
    ::dup2(nothing, STDERR_FILENO);
    ::setenv("HV_MACHINE", machine.c_str(), 1);
    ::execvp(arguments[0], arguments.data());
    ::_exit(kCannotStart);
}

double Seconds(const timeval& time) {
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_usec) / 1e6;
}

int WaitFor(pid_t process, rusage& usage) {
    int status = 0;
    while (::wait4(process, &status, 0, &usage) < 0) {
        if (errno != EINTR) {
            throw std::runtime_error("a program that was started is gone");
        }
    }
    return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
}

}  // namespace

Run RunProgram(const std::vector<std::string>& command, const std::string& machine, int expectedStatus) {
    WriteOut(machine);
    const auto start = std::chrono::steady_clock::now();
    const pid_t process = ::fork();
    if (process == 0) {
        Become(command, machine);
    }
    if (process < 0) {
        throw std::runtime_error("cannot start " + command[0]);
    }
    rusage usage{};
    Run run;
    run.status = WaitFor(process, usage);
    run.seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    run.processorSeconds = Seconds(usage.ru_utime) + Seconds(usage.ru_stime);
    run.peakKilobytes = usage.ru_maxrss;
    if (run.status != expectedStatus) {
        throw std::runtime_error(command[0] + " ended with status " + std::to_string(run.status));
    }
    return run;
}

}  // namespace HVBench
