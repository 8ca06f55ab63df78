#pragma once

#include <chrono>
#include <cstdint>
#include <filesystem>
#include <map>
#include <set>
#include <string>
#include <vector>

/// Machines on which an older release is installed, and runs that install the newer one over it.
///
/// Everything lies in one folder that goes with the object. Several threads may run at once, each with a slot of its
/// own.
namespace Prove {

namespace host = std::filesystem;
using Clock = std::chrono::steady_clock;
using Microseconds = std::chrono::microseconds;

/// Contents by path in the machine's folder. Logs and removal scripts are left out: they are added to, not undone.
using Files = std::map<std::string, std::string>;

/// What happens to a run.
struct Fault {
    std::string orders;  // for the machine, as HV_MACHINE_FAULTS takes them
    int signal = 0;      // sent after `moment`
    Microseconds moment{0};
};

/// What became of a run.
struct Outcome {
    int status = 0;                   // the exit status
    bool isKilled = false;            // ended by a signal, without an exit status
    Files files;                      // as Release::older and Release::newer
    std::set<std::string> temporary;  // contents that lie in the folder for temporary files
    std::string log;
    std::string said;  // on standard error
    [[nodiscard]] bool Says(const std::string& words) const { return log.find(words) != std::string::npos; }
};

/// Operations of a run that can be broken, in the order of the machine's words for them.
using Counts = std::map<std::string, std::uint64_t>;

/// A release and what it is installed over.
struct Release {
    Files older;
    Files newer;
    std::map<std::string, std::vector<std::string>> items;  // of each payload, in lower case
    std::set<std::string> withShortcuts;                    // payloads
    Counts operations;
    Microseconds duration{0};  // of a run beside others
};

/// A folder that is there for as long as the object.
class WorkFolder {
public:
    WorkFolder();
    ~WorkFolder();
    WorkFolder(const WorkFolder&) = delete;
    WorkFolder& operator=(const WorkFolder&) = delete;
    [[nodiscard]] host::path operator/(const std::string& name) const { return path_ / name; }

private:
    host::path path_;
};

class Machines {
public:
    /// Installs `packages` on the machine of `registry`, and makes each of its files an older one; every seventh is
    /// taken away, so that the newer release brings files that the older one lacks. Ends the process when the release
    /// does not install.
    Machines(host::path program, host::path packages, const host::path& registry, int slots);

    [[nodiscard]] const Release& TheRelease() const { return release_; }
    [[nodiscard]] Outcome Run(const Fault& fault, int slot) const;

    /// Counts the operations of a run on a machine with such orders. Not while others run.
    [[nodiscard]] Counts CountOperations(const std::string& orders) const;

private:
    void MakeOlder(const host::path& registry);
    void LearnFromCleanRun();
    void LearnItems(const std::string& log);
    [[noreturn]] void CountInThisProcess(const host::path& machine, const std::string& orders, int end) const;
    void MeasureDuration(int slots);
    [[nodiscard]] host::path Fresh(const std::string& name) const;
    void Start(const host::path& machine, const Fault& fault, Outcome& outcome) const;
    [[nodiscard]] std::vector<std::string> CommandLine(const host::path& machine) const;

    host::path program_;
    host::path packages_;
    WorkFolder work_;
    Release release_;
    std::set<std::string> scriptFiles_;  // written by the packages' scripts, and other ones after each run
};

/// Throws a std::runtime_error: there is nothing to prove.
[[noreturn]] void Stop(const std::string& why);

[[nodiscard]] std::string LowerCase(std::string text);

/// What Windows calls the file at `path` in a machine's folder.
[[nodiscard]] std::string WindowsName(const std::string& path);

/// The path in the machine's folder, in lower case, of what Windows calls `name`.
[[nodiscard]] std::string PathInMachine(std::string name);

}  // namespace Prove
