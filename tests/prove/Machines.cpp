#include "tests/prove/Machines.h"

#include <fcntl.h>
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <sstream>
#include <stdexcept>
#include <thread>
#include <utility>

#include "hvdeploy/src/StandAlone.h"
#include "platform/arguments.h"
#include "platform/hosted/machine.h"

namespace Prove {
namespace {

constexpr int kEachSoManyIsNew = 7;
constexpr std::size_t kFewestFiles = 20;
constexpr std::pair<const char*, hosted::Operation> kOperations[] = {{"write", hosted::Operation::Write},
                                                                     {"create", hosted::Operation::Create},
                                                                     {"rename", hosted::Operation::Rename},
                                                                     {"delete", hosted::Operation::Delete},
                                                                     {"registry", hosted::Operation::RegistrySet}};

std::string Read(const host::path& file) {
    std::ifstream stream(file, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), {}};
}

/// In memory where the host has such a folder: a sweep copies a machine thousands of times.
host::path RoomForMachines() {
    return std::getenv("TMPDIR") == nullptr && access("/dev/shm", W_OK) == 0 ? "/dev/shm" : host::temp_directory_path();
}

Files FilesOf(const host::path& machine, std::set<std::string>& temporary) {
    Files files;
    std::error_code error;
    for (const auto& entry : host::recursive_directory_iterator(machine / "drive_c", error)) {
        if (!entry.is_regular_file(error)) {
            continue;
        }
        const std::string path = entry.path().string().substr(machine.string().size() + 1);
        const std::string lower = LowerCase(path);
        if (lower.find("/local/temp/") != std::string::npos) {
            temporary.insert(Read(entry.path()));
        } else if (lower.find("/halvorn/uninstall/") == std::string::npos &&
                   lower.find("/halvorn/logs/") == std::string::npos) {
            files[path] = Read(entry.path());
        }
    }
    return files;
}

Files FilesOf(const host::path& machine) {
    std::set<std::string> ignored;
    return FilesOf(machine, ignored);
}

/// The process's environment with the machine and its faults, as one that starts a program hands it over.
std::vector<std::string> EnvironmentFor(const host::path& machine, const std::string& orders) {
    std::vector<std::string> environment;
    for (char** variable = environ; *variable != nullptr; ++variable) {
        const std::string text = *variable;
        if (text.rfind("HV_MACHINE", 0) != 0) {
            environment.push_back(text);
        }
    }
    environment.push_back("HV_MACHINE=" + machine.string());
    if (!orders.empty()) {
        environment.push_back("HV_MACHINE_FAULTS=" + orders);
    }
    return environment;
}

std::vector<char*> Pointers(std::vector<std::string>& texts) {
    std::vector<char*> pointers;
    for (std::string& text : texts) {
        pointers.push_back(text.data());
    }
    pointers.push_back(nullptr);
    return pointers;
}

int WaitFor(pid_t child) {
    int status = 0;
    while (waitpid(child, &status, 0) < 0 && errno == EINTR) {
    }
    return status;
}

}  // namespace

[[noreturn]] void Stop(const std::string& why) {
    throw std::runtime_error(why);
}

std::string LowerCase(std::string text) {
    std::ranges::transform(text, text.begin(), [](char c) { return c >= 'A' && c <= 'Z' ? char(c - 'A' + 'a') : c; });
    return text;
}

std::string WindowsName(const std::string& path) {
    std::string name = "C:" + path.substr(std::string("drive_c").size());
    std::ranges::replace(name, '/', '\\');
    return name;
}

std::string PathInMachine(std::string name) {
    std::ranges::replace(name, '\\', '/');
    return LowerCase("drive_c" + name.substr(std::min<std::size_t>(2, name.size())));
}

WorkFolder::WorkFolder() {
    std::string name = RoomForMachines() / "hv-prove-XXXXXX";
    if (mkdtemp(name.data()) == nullptr) {
        Stop("cannot make a folder for machines");
    }
    path_ = name;
}

WorkFolder::~WorkFolder() {
    std::error_code ignored;
    host::remove_all(path_, ignored);
}

Machines::Machines(host::path program, host::path packages, const host::path& registry, int slots)
    : program_(std::move(program)), packages_(std::move(packages)) {
    MakeOlder(registry);
    LearnFromCleanRun();
    release_.operations = CountOperations("");
    MeasureDuration(slots);
}

void Machines::MakeOlder(const host::path& registry) {
    const host::path machine = work_ / "older";
    host::create_directory(machine);
    host::copy_file(registry, machine / "registry.reg");
    const Files bare = FilesOf(machine);
    Outcome outcome;
    Start(machine, {}, outcome);
    release_.newer = FilesOf(machine);
    int count = 0;
    for (const auto& [path, content] : release_.newer) {
        if (bare.count(path) == 0 && ++count % kEachSoManyIsNew == 0) {
            host::remove(machine / path);
        } else if (bare.count(path) == 0) {
            std::ofstream(machine / path, std::ios::binary | std::ios::app) << "older";
        }
    }
    release_.older = FilesOf(machine);
}

/// What the scripts write is told from what the release brings: after a second installation it is not the same.
void Machines::LearnFromCleanRun() {
    const Outcome clean = Run({}, 0);
    for (const auto& [path, content] : release_.newer) {
        if (const auto found = clean.files.find(path); found == clean.files.end() || found->second != content) {
            scriptFiles_.insert(path);
        }
    }
    for (Files* files : {&release_.older, &release_.newer}) {
        std::erase_if(*files, [&](const auto& item) { return scriptFiles_.count(item.first) != 0; });
    }
    if (clean.status != 0 || release_.newer.size() < kFewestFiles || scriptFiles_.size() * 4 > release_.newer.size()) {
        Stop("the release does not install over itself: " + clean.said + clean.log);
    }
    LearnItems(clean.log);
}

void Machines::LearnItems(const std::string& log) {
    const std::string payloadWords = "HV::Deploy::DeployPayload ";
    const std::string itemWords = " to: ";
    std::istringstream lines(log);
    std::string payload;
    for (std::string line; std::getline(lines, line);) {
        line.erase(line.find_last_not_of('\r') + 1);
        if (const std::size_t at = line.find(payloadWords); at != std::string::npos) {
            const std::size_t begin = at + payloadWords.size();
            payload = line.substr(begin, line.find(' ', begin) - begin);
        } else if (line.rfind(itemWords, 0) == 0) {
            release_.items[payload].push_back(PathInMachine(line.substr(itemWords.size())));
        } else if (line.ends_with("HV::Deploy::MakeShortcut")) {
            release_.withShortcuts.insert(payload);
        }
    }
}

/// In a process of its own, which runs the program's code and then asks the machine.
Counts Machines::CountOperations(const std::string& orders) const {
    const host::path machine = Fresh("counting");
    int ends[2];
    if (pipe(ends) != 0) {
        Stop("cannot make a pipe");
    }
    std::fflush(nullptr);
    const pid_t child = fork();
    if (child == 0) {
        CountInThisProcess(machine, orders, ends[1]);
    }
    close(ends[1]);
    Counts counts;
    for (const auto& [word, operation] : kOperations) {
        std::uint64_t count = 0;
        if (read(ends[0], &count, sizeof count) != sizeof count || count == 0) {
            Stop("cannot count the operations of a run");
        }
        counts[word] = count;
    }
    close(ends[0]);
    WaitFor(child);
    return counts;
}

[[noreturn]] void Machines::CountInThisProcess(const host::path& machine, const std::string& orders, int end) const {
    const int nowhere = open("/dev/null", O_RDWR);
    dup2(nowhere, STDOUT_FILENO);
    dup2(nowhere, STDERR_FILENO);
    setenv("HV_MACHINE", machine.c_str(), 1);
    setenv("HV_MACHINE_FAULTS", orders.c_str(), 1);
    hosted::Faults& faults = hosted::Machine::Current().GetFaults();
    faults.StartCounting();
    std::vector<std::string> words = CommandLine(machine);
    (void)HV::RunStandAlone(platform::ProgramArguments(static_cast<int>(words.size()), Pointers(words).data()));
    for (const auto& [word, operation] : kOperations) {
        const std::uint64_t count = faults.Count(operation);
        (void)!write(end, &count, sizeof count);
    }
    std::exit(0);
}

void Machines::MeasureDuration(int slots) {
    const auto begin = Clock::now();
    std::vector<std::thread> threads;
    for (int slot = 0; slot < slots; ++slot) {
        threads.emplace_back([this, slot] {
            const host::path machine = Fresh(std::to_string(slot));
            Outcome outcome;
            Start(machine, {}, outcome);
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    release_.duration = std::chrono::duration_cast<Microseconds>(Clock::now() - begin);
}

host::path Machines::Fresh(const std::string& name) const {
    host::path machine = work_ / name;
    host::remove_all(machine);
    host::copy(work_ / "older", machine, host::copy_options::recursive);
    host::remove(machine / "log");
    return machine;
}

Outcome Machines::Run(const Fault& fault, int slot) const {
    const host::path machine = Fresh(std::to_string(slot));
    Outcome outcome;
    Start(machine, fault, outcome);
    outcome.files = FilesOf(machine, outcome.temporary);
    std::erase_if(outcome.files, [&](const auto& item) { return scriptFiles_.count(item.first) != 0; });
    outcome.log = Read(machine / "log");
    outcome.said = Read(machine / "said");
    return outcome;
}

void Machines::Start(const host::path& machine, const Fault& fault, Outcome& outcome) const {
    std::vector<std::string> arguments = CommandLine(machine);
    std::vector<std::string> environment = EnvironmentFor(machine, fault.orders);
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
    posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, "/dev/null", O_WRONLY, 0);
    posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, (machine / "said").c_str(), O_WRONLY | O_CREAT, 0644);
    pid_t child = 0;
    const int error = posix_spawn(&child, program_.c_str(), &actions, nullptr, Pointers(arguments).data(),
                                  Pointers(environment).data());
    posix_spawn_file_actions_destroy(&actions);
    if (error != 0) {
        Stop("cannot start " + program_.string());
    }
    if (fault.signal != 0) {
        std::this_thread::sleep_for(fault.moment);
        kill(child, fault.signal);
    }
    const int status = WaitFor(child);
    outcome.isKilled = WIFSIGNALED(status);
    outcome.status = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

std::vector<std::string> Machines::CommandLine(const host::path& machine) const {
    return {program_.string(), "dir=" + packages_.string(), "log=" + (machine / "log").string(), "loglevel=DEBUG"};
}

}  // namespace Prove
