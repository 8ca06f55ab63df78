// Installs a release over an older one again and again, each time with something else broken, and says what became of
// the machine: prove HVDEPLOY PACKAGES MACHINE.reg
//
// Every operation fails once, space ends at every 4 KB, every file that is replaced is held, and the run is cancelled
// and killed at 500 moments. A machine must be as it was, or have the whole new release, or be what a named rule says.
// What scripts, registry entries and the removal script leave is not undone by design, and is not looked at.
#include <fcntl.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>
#include <iterator>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <vector>

namespace {

namespace host = std::filesystem;
using Clock = std::chrono::steady_clock;
using Files = std::map<std::string, std::string>;

constexpr int kMoments = 500;
constexpr std::uint64_t kSpaceStep = 4096;
/// So many runs one after the other without a sign of the fault mean that it lies behind the run's end.
constexpr int kQuietRuns = 25;

// What the log says of the outcomes that rules name.
constexpr const char* kGuard = "exception deploying payload";
constexpr const char* kStashing = "stashing existing file in case of rollback, from ";
constexpr const char* kRestoring = "Restoring original file at ";

std::string Read(const host::path& file) {
    std::ifstream stream(file, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), {}};
}

[[noreturn]] void Stop(const std::string& why) {
    std::fprintf(stderr, "prove: %s\n", why.c_str());
    std::exit(2);
}

std::string LowerCase(std::string text) {
    std::ranges::transform(text, text.begin(), [](char c) { return c >= 'A' && c <= 'Z' ? char(c - 'A' + 'a') : c; });
    return text;
}

/// What happens to a run.
struct Fault {
    std::string orders;  // for the machine, as HV_MACHINE_FAULTS takes them
    int signal = 0;      // sent at `moment`
    std::chrono::microseconds moment{0};
};

struct Outcome {
    int status = 0;
    Files files;
    std::set<std::string> stashed;  // contents that wait in the folder for temporary files
    std::string log;
    [[nodiscard]] bool Says(const std::string& words) const { return log.find(words) != std::string::npos; }
};

class Prover {
public:
    Prover(host::path program, host::path packages, host::path registry)
        : program_(std::move(program)), packages_(std::move(packages)), registry_(std::move(registry)) {
        std::string name = host::temp_directory_path() / "hv-prove-XXXXXX";
        if (mkdtemp(name.data()) == nullptr) {
            Stop("cannot make a folder for machines");
        }
        work_ = name;
        MakeOlderMachine();
    }
    ~Prover() {
        std::error_code ignored;
        host::remove_all(work_, ignored);
    }
    Prover(const Prover&) = delete;
    Prover& operator=(const Prover&) = delete;

    int Prove() {
        for (const char* kind : {"write", "create", "rename", "delete", "registry"}) {
            SweepUntilQuiet(kind, [&](int n) { return std::string(kind) + "=" + std::to_string(n); });
        }
        SweepUntilQuiet("space", [](int n) { return "space=" + std::to_string(kSpaceStep * (n - 1U)); });
        for (const std::string& path : replaced_) {
            Judge("locked target", "lock=" + path, Run({"lock=" + path, 0, {}}), false);
        }
        SweepMoments("cancel", SIGINT);
        SweepMoments("kill", SIGKILL);
        return Report();
    }

private:
    /// The release is installed, and each of its files then made an older one.
    void MakeOlderMachine() {
        const host::path machine = work_ / "older";
        host::create_directory(machine);
        host::copy_file(registry_, machine / "registry.reg");
        const Files bare = FilesOf(machine, nullptr);
        Start(machine, {});
        newFiles_ = FilesOf(machine, nullptr);
        for (const auto& [path, content] : newFiles_) {
            if (bare.count(path) == 0) {
                std::ofstream(machine / path, std::ios::binary | std::ios::app) << "older";
                replaced_.push_back(WindowsName(path));
            }
        }
        host::remove_all(machine / "log");
        oldFiles_ = FilesOf(machine, nullptr);
        const auto begin = Clock::now();
        const Outcome clean = Run({});
        duration_ = std::chrono::duration_cast<std::chrono::microseconds>(Clock::now() - begin);
        // The scripts' own files differ from run to run, or are added to; what is compared is what the release brings.
        for (const auto& [path, content] : newFiles_) {
            if (const auto found = clean.files.find(path); found == clean.files.end() || found->second != content) {
                ownFiles_.insert(path);
            }
        }
        Forget(oldFiles_);
        Forget(newFiles_);
        if (clean.status != 0 || newFiles_.empty() || replaced_.size() < 20) {
            Stop("the release does not install over itself: " + clean.log);
        }
    }

    void Forget(Files& files) const {
        std::erase_if(files, [&](const auto& item) { return ownFiles_.count(item.first) != 0; });
    }

    static std::string WindowsName(const std::string& path) {
        std::string name = "C:" + path.substr(std::string("drive_c").size());
        std::ranges::replace(name, '/', '\\');
        return name;
    }

    /// What counts of a machine, by path in its folder. Scripts for removal and logs do not; the temporary folder goes
    /// into `stashed`.
    static Files FilesOf(const host::path& machine, std::set<std::string>* stashed) {
        Files files;
        std::error_code error;
        for (const auto& entry : host::recursive_directory_iterator(machine / "drive_c", error)) {
            const std::string path = host::relative(entry.path(), machine);
            const std::string lower = LowerCase(path);
            if (!entry.is_regular_file(error)) {
                continue;
            }
            if (lower.find("/local/temp/") != std::string::npos) {
                if (stashed != nullptr) {
                    stashed->insert(Read(entry.path()));
                }
            } else if (lower.find("/halvorn/uninstall/") == std::string::npos &&
                       lower.find("/halvorn/logs/") == std::string::npos) {
                files[path] = Read(entry.path());
            }
        }
        return files;
    }

    Outcome Run(const Fault& fault) {
        const host::path machine = work_ / "machine";
        host::remove_all(machine);
        host::copy(work_ / "older", machine, host::copy_options::recursive);
        Outcome outcome;
        outcome.status = Start(machine, fault);
        outcome.files = FilesOf(machine, &outcome.stashed);
        Forget(outcome.files);
        outcome.log = Read(machine / "log");
        return outcome;
    }

    int Start(const host::path& machine, const Fault& fault) const {
        const pid_t child = fork();
        if (child == 0) {
            Become(machine, fault);
        }
        if (fault.signal != 0) {
            usleep(static_cast<useconds_t>(fault.moment.count()));
            kill(child, fault.signal);
        }
        int status = 0;
        while (waitpid(child, &status, 0) < 0 && errno == EINTR) {
        }
        return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    }

    [[noreturn]] void Become(const host::path& machine, const Fault& fault) const {
        const int nowhere = open("/dev/null", O_RDWR);
        dup2(nowhere, STDIN_FILENO);
        dup2(nowhere, STDOUT_FILENO);
        dup2(nowhere, STDERR_FILENO);
        setenv("HV_MACHINE", machine.c_str(), 1);
        if (!fault.orders.empty()) {
            setenv("HV_MACHINE_FAULTS", fault.orders.c_str(), 1);
        }
        const std::string from = "dir=" + packages_.string();
        const std::string log = "log=" + (machine / "log").string();
        execl(program_.c_str(), program_.c_str(), from.c_str(), log.c_str(), "loglevel=DEBUG", nullptr);
        _exit(127);
    }

    /// Whether the run showed any sign of trouble.
    static bool IsQuiet(const Outcome& outcome) {
        return outcome.status == 0 && !outcome.Says("[ERROR]") && !outcome.Says("[WARN]");
    }

    void SweepUntilQuiet(const std::string& kind, const std::function<std::string(int)>& orders) {
        int quiet = 0;
        for (int n = 1; quiet < kQuietRuns; ++n) {
            const Outcome outcome = Run({orders(n), 0, {}});
            quiet = IsQuiet(outcome) ? quiet + 1 : 0;
            Judge(kind, orders(n), outcome, false);
        }
    }

    void SweepMoments(const std::string& kind, int signal) {
        for (int i = 0; i < kMoments; ++i) {
            const auto moment = duration_ * i / kMoments;
            Judge(kind, kind + " after " + std::to_string(moment.count()) + " us", Run({"", signal, moment}),
                  signal == SIGKILL);
        }
    }

    /// How a machine may be that is neither as it was nor whole, by the first rule that fits; else empty.
    [[nodiscard]] std::string RuleFor(const Outcome& outcome, bool killed) const {
        if (killed && EveryOldFileIsSomewhere(outcome)) {
            return "the records of the stash live in memory: after a kill it stays, with every file that was moved "
                   "aside";
        }
        if (outcome.Says("Failed to extract package") && EachIsOldOrNew(outcome, {})) {
            return "a package that does not extract ends the run without a way back: each file is the old or the new "
                   "one";
        }
        if (outcome.Says(kGuard) && EachIsOldOrNew(outcome, ItemsOfExceptions(outcome))) {
            return "an exception in the copy loop keeps the result: what was moved aside for that item is gone";
        }
        if (outcome.Says("Failed to move/copy existing item") && EachIsOldOrNew(outcome, {})) {
            return "what cannot be moved aside stays, and the copy meets it";
        }
        if (outcome.Says("failed to delete installed file") && EachIsOldOrNew(outcome, {})) {
            return "what cannot be removed on the way back stays";
        }
        if (outcome.Says(kRestoring) && EachIsOldOrNew(outcome, ItemsNamed(outcome.log, kRestoring))) {
            return "what cannot be put back has no message, and goes with the stash";
        }
        return {};
    }

    /// The items in quotes behind `words` in the log, as paths in the machine's folder.
    static std::vector<std::string> ItemsNamed(const std::string& log, const std::string& words) {
        std::vector<std::string> items;
        for (std::size_t at = log.find(words); at != std::string::npos; at = log.find(words, at + 1)) {
            const std::size_t begin = log.find("\"C:", at);
            if (begin != std::string::npos) {
                std::string item = log.substr(begin + 3, log.find('"', begin + 1) - begin - 3);
                std::ranges::replace(item, '\\', '/');
                items.push_back(LowerCase("drive_c" + item));
            }
        }
        return items;
    }

    /// For each exception the item that had just been moved aside: it alone may be gone.
    static std::vector<std::string> ItemsOfExceptions(const Outcome& outcome) {
        std::vector<std::string> items;
        for (std::size_t at = outcome.log.find(kGuard); at != std::string::npos;
             at = outcome.log.find(kGuard, at + 1)) {
            const std::vector<std::string> before = ItemsNamed(outcome.log.substr(0, at), kStashing);
            if (!before.empty()) {
                items.push_back(before.back());
            }
        }
        return items;
    }

    static bool IsBelow(const std::string& path, const std::vector<std::string>& items) {
        const std::string lower = LowerCase(path);
        return std::ranges::any_of(
            items, [&](const std::string& item) { return lower == item || lower.rfind(item + "/", 0) == 0; });
    }

    /// Each file is the old or the new one, and none is missing but in the items that `mayMiss` names.
    [[nodiscard]] bool EachIsOldOrNew(const Outcome& outcome, const std::vector<std::string>& mayMiss) const {
        const bool nothingElseMisses = std::ranges::all_of(oldFiles_, [&](const auto& item) {
            return outcome.files.count(item.first) != 0 || IsBelow(item.first, mayMiss);
        });
        return nothingElseMisses && std::ranges::all_of(outcome.files, [&](const auto& item) {
                   return Is(oldFiles_, item) || Is(newFiles_, item);
               });
    }

    [[nodiscard]] bool EveryOldFileIsSomewhere(const Outcome& outcome) const {
        return std::ranges::all_of(oldFiles_, [&](const auto& item) {
            const auto found = outcome.files.find(item.first);
            const bool there = found != outcome.files.end() && (Is(oldFiles_, *found) || Is(newFiles_, *found));
            return there || outcome.stashed.count(item.second) != 0;
        });
    }

    static bool Is(const Files& files, const Files::value_type& item) {
        const auto found = files.find(item.first);
        return found != files.end() && found->second == item.second;
    }

    void Judge(const std::string& kind, const std::string& fault, const Outcome& outcome, bool killed) {
        ++rounds_[kind];
        if (outcome.files == oldFiles_) {
            ++asBefore_[kind];
        } else if (outcome.files == newFiles_) {
            ++whole_[kind];
        } else if (const std::string rule = RuleFor(outcome, killed); !rule.empty()) {
            ++byRule_[kind];
            ++rules_[rule];
        } else {
            ++violations_[kind];
            std::printf("VIOLATION  %s\n", fault.c_str());
            Explain(outcome);
        }
        std::fflush(stdout);
    }

    void Explain(const Outcome& outcome) const {
        for (const auto& [path, content] : oldFiles_) {
            if (outcome.files.count(path) == 0) {
                std::printf("    is missing: %s\n", path.c_str());
            }
        }
        for (const auto& item : outcome.files) {
            if (!Is(oldFiles_, item) && !Is(newFiles_, item)) {
                std::printf("    is neither: %s\n", item.first.c_str());
            }
        }
    }

    int Report() {
        int violations = 0;
        std::printf("%-14s %7s %9s %7s %8s %10s\n", "broken", "rounds", "as before", "whole", "by rule", "violations");
        for (const auto& [kind, rounds] : rounds_) {
            std::printf("%-14s %7d %9d %7d %8d %10d\n", kind.c_str(), rounds, asBefore_[kind], whole_[kind],
                        byRule_[kind], violations_[kind]);
            violations += violations_[kind];
        }
        for (const auto& [rule, count] : rules_) {
            std::printf("%7d  %s\n", count, rule.c_str());
        }
        return violations == 0 ? 0 : 1;
    }

    host::path program_;
    host::path packages_;
    host::path registry_;
    host::path work_;
    Files oldFiles_;
    Files newFiles_;
    std::set<std::string> ownFiles_;     // the scripts'
    std::vector<std::string> replaced_;  // Windows paths
    std::chrono::microseconds duration_{0};
    std::map<std::string, int> rounds_;
    std::map<std::string, int> asBefore_;
    std::map<std::string, int> whole_;
    std::map<std::string, int> byRule_;
    std::map<std::string, int> violations_;
    std::map<std::string, int> rules_;
};

}  // namespace

int main(int argc, char** argv) {
    if (argc != 4) {
        Stop("usage: prove HVDEPLOY PACKAGES MACHINE.reg");
    }
    return Prover(host::absolute(argv[1]), host::absolute(argv[2]), host::absolute(argv[3])).Prove();
}
