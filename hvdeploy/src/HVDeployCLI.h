#pragma once

#include <boost/enable_shared_from_this.hpp>
#include <boost/thread/mutex.hpp>
#include <boost/thread/thread.hpp>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "hvdeploy/src/Deploy.h"
#include "hvdeploy/src/ProgressListener.h"
#include "platform/filesystem.h"

namespace HV {

/// The front end "hvdeploy": one text line of arguments becomes one run of the engine.
///
/// Call ParseLine(), and Run() only when that gave 0. One object serves one line and one thread; Cancel() alone may be
/// called from another.
class DeployCLI : boost::enable_shared_from_this<DeployCLI> {
public:
    /// Constructs the engine, which reports "Preparing to install..." to `listener`. The listener may be null, is not
    /// owned and must outlive this object. Throws what the engine's constructor throws.
    explicit DeployCLI(ProgressListenerInterface* listener);
    virtual ~DeployCLI();

    DeployCLI(const DeployCLI&) = delete;
    DeployCLI& operator=(const DeployCLI&) = delete;

    /// Splits `line`, brings logging to life unless somebody has, and reads the arguments. Returns 0, or -1 for a blank
    /// line, a line with unbalanced double quotes (which gets a line on standard error), or a bad argument. Throws
    /// std::runtime_error when the value of "log=" is too long.
    [[nodiscard]] int ParseLine(std::string line);

    /// What ParseLine() does with the pieces of its line, for arguments that are split already and stand as they are,
    /// whatever quotes and blanks they hold. Without any it is a blank line.
    [[nodiscard]] int ParseArguments(const std::vector<std::string>& arguments);

    /// Reads arguments that are split already; argument 0 is the program. Returns 0, or the code of the first argument
    /// that fails; those after it are not looked at.
    [[nodiscard]] int ParseArgs(int argc, const char* const* argv);

    /// Reads one argument: a flag, or a key with its value. Returns 0, or -1 when it is null or not supported.
    [[nodiscard]] int ParseArg(const char* arg);

    /// The value stored for `key`, which ends in "="; empty when the key is absent.
    [[nodiscard]] std::string GetArg(const std::string& key) const;

    /// Whether the key is present.
    [[nodiscard]] bool CountArg(const std::string& key) const;

    /// Runs the command that the line selects. Returns 0, -1, or the code that an exception's text carries. Throws
    /// nothing that derives from std::exception.
    [[nodiscard]] int Run();

    /// The deploy command: installs a package, a folder of packages, or the default folder. Returns 0 or -1.
    [[nodiscard]] int DoDeployCommand();

    /// The list command: prints what "list=" asks for. Returns 0.
    [[nodiscard]] int DoListCommand();

    /// Raises the engine's cancel switch and returns at once. Any thread may call this while Run() is going.
    void Cancel();

    /// Brings the log categories to life from "log=" and "loglevel=". Throws std::runtime_error when the value of
    /// "log=" is too long.
    void InitLogging(int argc, const char* const* argv);

    ProgressListenerInterface* Listener() const { return listener; }
    Deploy& Engine() { return deploy; }
    const std::vector<std::string>& Flags() const { return flags; }
    /// Whether an exception ended Run(), whose result may be 0 all the same.
    bool WasBrokenOff() const { return brokenOff; }

private:
    bool HasFlag(const char* flag) const;
    int RunCommand();
    void PrintBanner();
    fs::path DefaultPackagesFolder() const;
    int DeployFile(const fs::path& file);
    int DeployFolder(fs::path dir);
    std::vector<std::string> SkipList() const;
    int ListHosts();
    int ListInstalled();
    int ListPackages();
    int ListCommands();

    std::map<std::string, std::string> args;
    std::vector<std::string> flags;
    bool verbose = false;
    bool testError = false;
    bool brokenOff = false;
    fs::path exePath;
    fs::path initialDir;
    fs::path exeDir;
    ProgressListenerInterface* listener;
    Deploy deploy;
    bool running = false;  // cleared at the end of Run(), under the mutex; nothing sets it
    boost::mutex runningMutex;
    std::unique_ptr<boost::thread> thread;  // stays empty: a run's thread belongs to its job
};

/// Whether `argument` by itself is one of a line: a flag, or a known key with any value.
[[nodiscard]] bool IsArgument(const std::string& argument);

/// The code that the text of an exception carries in the shape "ERROR(" number ")", or -1. A number that no code can
/// hold gives the nearest that one can.
[[nodiscard]] int ErrorCodeFromText(const std::string& text);

}  // namespace HV
