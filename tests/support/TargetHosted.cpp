#include <sys/mman.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "platform/hosted/failure.h"
#include "platform/hosted/machine.h"
#include "tests/support/RunProgram.h"
#include "tests/support/ScratchFile.h"
#include "tests/support/Target.h"

#include <gtest/gtest.h>

namespace {

std::string MakeFolderForMachine() {
    const char* parent = std::getenv("TMPDIR");
    std::string name = std::string(parent != nullptr ? parent : "/tmp") + "/hv-machine-XXXXXX";
    if (mkdtemp(name.data()) == nullptr) {
        hosted::EndWithMessage("cannot make a folder for a machine: " + name + ": " + std::strerror(errno));
    }
    return name;
}

hosted::Machine& Current() {
    return hosted::Machine::Current();
}

}  // namespace

MachineTarget::MachineTarget() : folder_(MakeFolderForMachine()), environment_(Environment()) {
    hosted::Machine::Use(folder_);
    baseItems_ = ListItems({});
    baseTemp_ = ListTemp();
}

MachineTarget::~MachineTarget() {
    hosted::Machine::Abandon();
    clearenv();
    for (const auto& [name, value] : environment_) {
        setenv(name.c_str(), value.c_str(), 1);
    }
    std::error_code error;
    std::filesystem::remove_all(folder_, error);
    if (error) {
        ADD_FAILURE() << "cannot remove the machine in " << folder_ << ": " << error.message();
    }
}

std::map<std::string, std::string> MachineTarget::Environment() {
    std::map<std::string, std::string> variables;
    for (char** entry = environ; *entry != nullptr; ++entry) {
        const std::string text(*entry);
        const std::size_t equals = text.find('=');
        variables.emplace(text.substr(0, equals), text.substr(equals + 1));
    }
    return variables;
}

std::filesystem::path MachineTarget::HostPath(const std::string& path) const {
    return Current().HostPath(path);
}

std::filesystem::path MachineTarget::DriveC() const {
    return folder_ + "/drive_c";
}

std::string MachineTarget::Variable(const std::string& name) const {
    return Current().GetEnvironment().Get(name).value_or("");
}

void MachineTarget::LoadRegistry(const std::vector<hosted::RegistryChange>&, const std::string& text) {
    Current().GetRegistry().LoadText(text, "a test's registry text");
}

RegistryContent MachineTarget::AddedRegistry() const {
    return ContentOf(hosted::ParseRegistryText(Current().GetRegistry().Text()));
}

int OpenScratchFile() {
    const int descriptor = memfd_create("scratch", MFD_CLOEXEC);
    if (descriptor < 0) {
        hosted::EndWithMessage(std::string("cannot make a scratch file: ") + std::strerror(errno));
    }
    return descriptor;
}

namespace {

[[noreturn]] void Become(const std::string& program, const std::vector<std::string>& arguments,
                         const std::map<std::string, std::string>& environment, int output, int errors) {
    dup2(output, STDOUT_FILENO);
    dup2(errors, STDERR_FILENO);
    setenv("HV_MACHINE", Current().Folder().c_str(), 1);
    for (const auto& [name, value] : environment) {
        setenv(name.c_str(), value.c_str(), 1);
    }
    std::vector<char*> words{const_cast<char*>(program.c_str())};
    for (const std::string& argument : arguments) {
        words.push_back(const_cast<char*>(argument.c_str()));
    }
    words.push_back(nullptr);
    execv(program.c_str(), words.data());
    std::fprintf(stderr, "cannot start %s: %s\n", program.c_str(), std::strerror(errno));
    _exit(127);
}

int WaitFor(pid_t process) {
    int status = 0;
    while (waitpid(process, &status, 0) < 0 && errno == EINTR) {
    }
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

}  // namespace

ProgramResult RunProgram(const std::string& program, const std::vector<std::string>& arguments,
                         const std::map<std::string, std::string>& environment) {
    const std::string file = std::string(HV_PROGRAM_FOLDER) + "/" + program;
    if (access(file.c_str(), X_OK) != 0) {
        ADD_FAILURE() << "there is no program " << file;
        return {};
    }
    // The program reads the registry from its file, and leaves its own changes there.
    Current().GetRegistry().Flush();
    const int output = OpenScratchFile();
    const int errors = OpenScratchFile();
    std::fflush(nullptr);
    const pid_t process = fork();
    if (process == 0) {
        Become(file, arguments, environment, output, errors);
    }
    ProgramResult result;
    result.exitStatus = WaitFor(process);
    result.output = ReadScratchFile(output);
    result.errors = ReadScratchFile(errors);
    close(output);
    close(errors);
    Current().GetRegistry().Reload();
    return result;
}
