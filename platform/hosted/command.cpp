#include "platform/hosted/command.h"

#include <fcntl.h>
#include <spawn.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <charconv>
#include <map>
#include <mutex>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "platform/hosted/host_file.h"
#include "platform/hosted/machine.h"

namespace {

constexpr const char* MachineVariable = "HV_MACHINE=";
constexpr int EndedFromOutside = static_cast<int>(0xC000013A);

// The descriptor on which the shell tells its whole exit code. Scripts use small numbers.
constexpr int CodeDescriptor = 9;
constexpr const char* RunLine = "trap 'echo $? >&9' EXIT; eval \"$1\"";
constexpr const char* RunFile = "trap 'echo $? >&9' EXIT; . \"$0\"";

using hosted::Descriptor;

struct Child {
    pid_t process = -1;
    Descriptor code;
};

class Children {
public:
    void Add(std::FILE* stream, Child child) {
        const std::lock_guard<std::mutex> guard(mutex_);
        children_[stream] = std::move(child);
    }
    // False when `stream` is none of ours.
    bool Take(std::FILE* stream, Child& child) {
        const std::lock_guard<std::mutex> guard(mutex_);
        const auto found = children_.find(stream);
        if (found == children_.end()) {
            return false;
        }
        child = std::move(found->second);
        children_.erase(found);
        return true;
    }
    static Children& All() {
        static Children all;
        return all;
    }

private:
    std::mutex mutex_;
    std::map<std::FILE*, Child> children_;
};

// The host's name of the file, when the line is nothing but its quoted path; else empty.
std::string ScriptFile(std::string_view line) {
    if (line.size() < 3 || line.front() != '"' || line.find('"', 1) != line.size() - 1) {
        return {};
    }
    std::string path = hosted::Machine::Current().HostPath(line.substr(1, line.size() - 2));
    struct stat status {};
    return stat(path.c_str(), &status) == 0 && S_ISREG(status.st_mode) ? path : std::string();
}

// A line that begins with two quotes and ends in one has a pair around the whole, which cmd takes off.
std::string_view WithoutOuterQuotes(std::string_view line) {
    const bool quoted = line.size() > 3 && line.starts_with("\"\"") && line.ends_with('"');
    return quoted ? line.substr(1, line.size() - 2) : line;
}

std::vector<std::string> Arguments(std::string_view given) {
    const std::string line(WithoutOuterQuotes(given));
    const std::string script = ScriptFile(line);
    if (!script.empty()) {
        return {"/bin/sh", "-c", RunFile, script};
    }
    return {"/bin/sh", "-c", RunLine, "/bin/sh", line};
}

std::vector<std::string> ChildEnvironment() {
    std::vector<std::string> variables;
    for (char** variable = environ; *variable != nullptr; ++variable) {
        if (!std::string_view(*variable).starts_with(MachineVariable)) {
            variables.emplace_back(*variable);
        }
    }
    variables.push_back(MachineVariable + hosted::Machine::Current().Folder());
    return variables;
}

std::vector<char*> Pointers(std::vector<std::string>& texts) {
    std::vector<char*> pointers;
    for (std::string& text : texts) {
        pointers.push_back(text.data());
    }
    pointers.push_back(nullptr);
    return pointers;
}

// The process, or -1. Of this process's descriptors the child gets what is named here and the standard streams.
pid_t Spawn(const std::string& line, int output, int code) {
    std::vector<std::string> arguments = Arguments(line);
    std::vector<std::string> variables = ChildEnvironment();
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_adddup2(&actions, output, STDOUT_FILENO);
    posix_spawn_file_actions_adddup2(&actions, code, CodeDescriptor);
    pid_t process = -1;
    const int error =
        posix_spawn(&process, "/bin/sh", &actions, nullptr, Pointers(arguments).data(), Pointers(variables).data());
    posix_spawn_file_actions_destroy(&actions);
    errno = error;
    return error == 0 ? process : -1;
}

// The number that the shell told aside. False when it told none, as a script that traps its own exit does.
bool ReadCode(int descriptor, int& code) {
    char text[32];
    const ssize_t length = pread(descriptor, text, sizeof text, 0);
    return length > 0 && std::from_chars(text, text + length, code).ec == std::errc();
}

int Wait(pid_t process) {
    int status = 0;
    while (waitpid(process, &status, 0) < 0) {
        if (errno != EINTR) {
            return -1;
        }
    }
    return WIFEXITED(status) ? WEXITSTATUS(status) : EndedFromOutside;
}

}  // namespace

FILE* _popen(const char* line, const char* mode) {
    int ends[2];
    if (std::string_view(mode) != "r") {
        errno = EINVAL;
        return nullptr;
    }
    if (pipe2(ends, O_CLOEXEC) != 0) {
        return nullptr;
    }
    Descriptor input(ends[0]);
    const Descriptor output(ends[1]);
    Descriptor code(memfd_create("exit code", MFD_CLOEXEC));
    if (!code.IsOpen()) {
        return nullptr;
    }
    std::FILE* const stream = fdopen(input.Get(), "r");
    if (stream == nullptr) {
        return nullptr;
    }
    static_cast<void>(input.Give());
    const pid_t process = Spawn(line, output.Get(), code.Get());
    if (process < 0) {
        std::fclose(stream);
        return nullptr;
    }
    Children::All().Add(stream, {process, std::move(code)});
    return stream;
}

int _pclose(FILE* stream) {
    Child child;
    if (!Children::All().Take(stream, child)) {
        errno = EINVAL;
        return -1;
    }
    // The reading end goes first, so that a child that still writes ends too.
    std::fclose(stream);
    const int status = Wait(child.process);
    int code = 0;
    return status != EndedFromOutside && ReadCode(child.code.Get(), code) ? code : status;
}
