#include "hvdeploy/src/StandAlone.h"

#include <algorithm>
#include <iostream>
#include <optional>

#include "hvdeploy/src/ArgumentLine.h"
#include "hvdeploy/src/GuardedFolders.h"
#include "hvdeploy/src/HVDeployCLI.h"
#include "hvdeploy/src/Interrupts.h"
#include "hvdeploy/src/ProgressBar.h"
#include "platform/command_processor.h"
#include "platform/redirection_guard.h"
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

constexpr const char* kNoRun = "bad arguments; run hvdeploy without any to see its options";

/// Hands reports on once it is open, beginning with the last one before: what turns out to be no installation has
/// nothing to show. Without a target nobody watches, and the log says it all.
class Gate : public ProgressListenerInterface {
public:
    explicit Gate(ProgressListenerInterface* target) : target_(target) {}

    void update(std::uint32_t percent, const char* message, std::int32_t error) override {
        if (!isOpen_) {
            percent_ = percent;
            message_ = message != nullptr ? message : "";
        } else if (target_ != nullptr) {
            target_->update(percent, message, error);
        }
    }

    void Open() {
        isOpen_ = true;
        update(percent_, message_.c_str(), 0);
    }

private:
    ProgressListenerInterface* target_;
    bool isOpen_ = false;
    std::uint32_t percent_ = 0;
    std::string message_;
};

bool Holds(const std::string& text, char character) {
    return text.find(character) != std::string::npos;
}

/// Whether the rules of a line leave the argument as it is: its white space lies between quotes of its own.
bool IsOnePiece(const std::string& argument) {
    std::vector<std::string> pieces;
    return SplitArgumentLine(argument, pieces) == LineSplit::Done && pieces == std::vector<std::string>{argument};
}

std::string Requoted(const std::string& argument) {
    if (argument.empty() || IsOnePiece(argument) || Holds(argument, '"')) {
        return argument;
    }
    const std::size_t equals = argument.find('=');
    const std::size_t valueStart = equals == std::string::npos ? 0 : equals + 1;
    return argument.substr(0, valueStart) + "\"" + argument.substr(valueStart) + "\"";
}

// A line has no way to write two apostrophes that are none of its quotes, nor a file's name with a blank. So arguments
// go as the process got them, unless somebody has written them in the manner of a line, with quotes for it to pair.
int Parse(DeployCLI& cli, const std::vector<std::string>& arguments) {
    const bool standAlone = std::all_of(arguments.begin(), arguments.end(), [](const std::string& argument) {
        return IsArgument(argument) && !Holds(argument, '"');
    });
    return standAlone ? cli.ParseArguments(arguments) : cli.ParseLine(LineFromArguments(arguments));
}

const char* FailedOutcome(const DeployRollback& rollback) {
    if (rollback.HasRolledBack()) {
        return "failed and undone";
    }
    return rollback.HasInstalledFiles() ? "failed; what was installed until then stays"
                                        : "failed; nothing was installed";
}

const char* Outcome(bool failed, Deploy& engine) {
    if (failed) {
        return FailedOutcome(engine.Rollback());
    }
    if (engine.Rollback().HasInstalledFiles()) {
        return engine.HasLeftOut() ? "installed, but not all; the log says what is missing" : "installed";
    }
    return engine.HasLeftOut() ? "nothing was installed; the log says why" : "nothing to do";
}

/// What the user is told in the end, besides the exit status. A list speaks for itself.
struct Ending {
    int exitStatus = 1;
    const char* text = nullptr;
};

Ending RunArguments(const std::vector<std::string>& arguments, ProgressListenerInterface* watcher) {
    Gate reports(watcher);
    DeployCLI cli(&reports);
    const Interrupts interrupts([&cli] { cli.Cancel(); });
    if (Parse(cli, arguments) != 0) {
        return {1, kNoRun};
    }
    const bool isList = cli.CountArg("list=");
    std::optional<GuardedFolders> guarded;
    if (!isList) {
        guarded.emplace().LogWarnings();
        reports.Open();
    }
    const int exitStatus = cli.Run() == 0 ? 0 : 1;
    const bool failed = exitStatus != 0 || cli.WasBrokenOff();
    return {exitStatus, isList && !failed ? nullptr : Outcome(failed, cli.Engine())};
}

/// The bar is gone from the terminal when this comes back.
Ending RunWatched(const std::vector<std::string>& arguments) {
    if (_isatty(_fileno(stdout)) == 0) {
        return RunArguments(arguments, nullptr);
    }
    ProgressBar bar(std::cout);
    return RunArguments(arguments, &bar);
}

void Tell(const char* text) {
    std::cerr << "hvdeploy: " << text << std::endl;
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
    (void)platform::RefusePlantedJunctions();
    if (arguments.empty()) {
        std::cerr << kUsage;
        return 1;
    }
    try {
        platform::UseSystemCommandProcessor();
        const Ending ending = RunWatched(arguments);
        if (ending.text != nullptr) {
            Tell(ending.text);
        }
        return ending.exitStatus;
    } catch (const std::exception& error) {
        Tell(error.what());
        return 1;
    }
}

}  // namespace HV
