#include "hvdeploy/src/StandAlone.h"

#include <atomic>
#include <iostream>
#include <memory>

#include "hvdeploy/src/HVDeployCLI.h"
#include "hvdeploy/src/ProgressBar.h"
#include "platform/win32.h"

namespace HV {
namespace {

constexpr const char* kUsage =
    "usage: hvdeploy dir=FOLDER | file=PACKAGE | list=hosts|installed  [OPTION...]\n"
    "  dir=FOLDER       install the packages of a folder (default: the folder \"packages\" in the current folder)\n"
    "  file=PACKAGE     install one package\n"
    "  skip=NAME,...    leave these packages out (product identifier or file name)\n"
    "  log=FILE         write the log to FILE, besides standard output\n"
    "  loglevel=NAME    log from this priority on: debug (default), info, warn, error, crit\n"
    "  list=hosts       show the host applications of this machine\n"
    "  list=installed   show the products that are installed\n"
    "  --verbose --about --version --legacyuninstall --error\n";

/// For a run that nobody watches: the log says it all.
class SilentListener : public ProgressListenerInterface {
public:
    void update(std::uint32_t /*percent*/, const char* /*message*/, std::int32_t /*error*/) override {}
};

/// Turns an interrupt from the keyboard into a cancel of one front end, for as long as this object lives.
class InterruptCancels {
public:
    explicit InterruptCancels(DeployCLI& cli) {
        Target() = &cli;
        SetConsoleCtrlHandler(&OnInterrupt, TRUE);
    }
    ~InterruptCancels() {
        SetConsoleCtrlHandler(&OnInterrupt, FALSE);
        Target() = nullptr;
    }
    InterruptCancels(const InterruptCancels&) = delete;
    InterruptCancels& operator=(const InterruptCancels&) = delete;

private:
    static std::atomic<DeployCLI*>& Target() {
        static std::atomic<DeployCLI*> target{nullptr};
        return target;
    }
    // Called on a thread of the platform's own.
    static BOOL WINAPI OnInterrupt(DWORD event) {
        DeployCLI* const cli = Target();
        if (cli == nullptr || (event != CTRL_C_EVENT && event != CTRL_BREAK_EVENT)) {
            return FALSE;
        }
        cli->Cancel();
        return TRUE;
    }
};

bool HasAny(const std::string& text, const char* characters) {
    return text.find_first_of(characters) != std::string::npos;
}

std::string Requoted(const std::string& argument) {
    if (!HasAny(argument, " \t\n\v\f\r") || HasAny(argument, "\"'")) {
        return argument;
    }
    const std::size_t equals = argument.find('=');
    const std::size_t valueStart = equals == std::string::npos ? 0 : equals + 1;
    return argument.substr(0, valueStart) + "\"" + argument.substr(valueStart) + "\"";
}

int RunLine(const std::string& line, ProgressListenerInterface& listener) {
    DeployCLI cli(&listener);
    const InterruptCancels interrupts(cli);
    const bool done = cli.ParseLine(line) == 0 && cli.Run() == 0;
    return done ? 0 : 1;
}

}  // namespace

std::string LineFromArguments(const std::vector<std::string>& arguments) {
    std::string line;
    for (const std::string& argument : arguments) {
        line += (line.empty() ? "" : " ") + Requoted(argument);
    }
    return line;
}

int RunStandAlone(const std::vector<std::string>& arguments) {
    if (arguments.empty()) {
        std::cerr << kUsage;
        return 1;
    }
    try {
        if (_isatty(_fileno(stdout)) != 0) {
            ProgressBar bar(std::cout);
            return RunLine(LineFromArguments(arguments), bar);
        }
        SilentListener silent;
        return RunLine(LineFromArguments(arguments), silent);
    } catch (const std::exception& error) {
        std::cerr << "hvdeploy: " << error.what() << std::endl;
        return 1;
    }
}

}  // namespace HV
