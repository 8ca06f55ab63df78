// Installs a release over an older one again and again, each time with something else broken, and says what became of
// the machine: prove HVDEPLOY PACKAGES MACHINE.reg [EVERY]
//
// Every operation fails once, on the way and on the way back, space ends at every 4 KB, every file that is replaced is
// held, and the run is cancelled and killed at 500 moments. A machine must be as it was, have the whole new release, or
// be what rules say (Rules.h). What scripts, registry entries and the removal script leave is not undone by design, and
// is not looked at. EVERY takes each so many rounds of a kind alone. The exit status is 1 when there was a violation.
#include <signal.h>

#include <algorithm>
#include <array>
#include <atomic>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <functional>
#include <mutex>
#include <thread>

#include "tests/prove/Machines.h"
#include "tests/prove/Rules.h"

namespace Prove {
namespace {

constexpr int kMoments = 500;
constexpr std::uint64_t kSpaceStep = 4096;
constexpr int kRoundsAfterTheLast = 2;
constexpr int kViolationsShown = 20;
constexpr std::size_t kProgressEach = 500;

struct Round {
    std::string kind;
    Fault fault;
};

std::string Described(const Fault& fault) {
    if (fault.signal == 0) {
        return fault.orders;
    }
    return (fault.signal == SIGKILL ? "killed after " : "cancelled after ") + std::to_string(fault.moment.count()) +
           " us";
}

/// What the rounds came to, by kind.
class Tally {
public:
    void Add(const Round& round, const Verdict& verdict, bool isKilled) {
        const std::lock_guard guard(mutex_);
        Counts& counts = counts_[round.kind];
        ++counts.rounds;
        counts.killed += isKilled ? 1 : 0;
        ++counts.by.at(static_cast<std::size_t>(verdict.kind));
        for (const std::string& rule : verdict.rules) {
            if (verdict.kind == Kind::ByRule) {
                ++rules_[rule];
            }
        }
        if (verdict.kind == Kind::Violation && ++violations_ <= kViolationsShown) {
            Show(round, verdict);
        }
        if (++rounds_ % kProgressEach == 0) {
            std::fprintf(stderr, "prove: %zu rounds\n", rounds_);
        }
    }

    /// Prints the table. Gives the exit status.
    [[nodiscard]] int Report() const {
        std::printf("%-28s %7s %9s %7s %8s %10s\n", "broken", "rounds", "as before", "whole", "by rule", "violations");
        Counts sum;
        for (const auto& [kind, counts] : counts_) {
            Print(kind, counts);
            sum.rounds += counts.rounds;
            std::ranges::transform(sum.by, counts.by, sum.by.begin(), std::plus<>());
        }
        Print("all", sum);
        for (const auto& [rule, count] : rules_) {
            std::printf("%7d  %s\n", count, rule.c_str());
        }
        for (const auto& [kind, counts] : counts_) {
            if (counts.killed != 0) {
                std::printf("%7d  of \"%s\" ended by the signal itself\n", counts.killed, kind.c_str());
            }
        }
        return violations_ == 0 && rounds_ != 0 ? 0 : 1;
    }

private:
    struct Counts {
        int rounds = 0;
        int killed = 0;
        std::array<int, 4> by{};
    };

    static void Print(const std::string& kind, const Counts& counts) {
        std::printf("%-28s %7d %9d %7d %8d %10d\n", kind.c_str(), counts.rounds, counts.by[0], counts.by[1],
                    counts.by[2], counts.by[3]);
    }

    static void Show(const Round& round, const Verdict& verdict) {
        std::printf("VIOLATION  %s: %s\n", round.kind.c_str(), Described(round.fault).c_str());
        for (const std::string& detail : verdict.details) {
            std::printf("    %s\n", detail.c_str());
        }
        std::fflush(stdout);
    }

    std::mutex mutex_;
    std::map<std::string, Counts> counts_;
    std::map<std::string, int> rules_;
    int violations_ = 0;
    std::size_t rounds_ = 0;
};

/// The bytes that a run has to be able to write until nothing is missing; more change nothing.
std::uint64_t SpaceOfARun(const Machines& machines) {
    const auto isEnough = [&](std::uint64_t steps) {
        return IsQuiet(machines.Run({"space=" + std::to_string(steps * kSpaceStep), 0, {}}, 0));
    };
    std::uint64_t enough = 1;
    while (!isEnough(enough)) {
        enough *= 2;
    }
    std::uint64_t tooFew = enough / 2;
    while (tooFew + 1 < enough) {
        const std::uint64_t middle = (tooFew + enough) / 2;
        (isEnough(middle) ? enough : tooFew) = middle;
    }
    return enough * kSpaceStep;
}

/// The registry change whose failure comes latest and sends a run back, which then undoes nearly all of it.
std::string LatestWayBack(const Machines& machines) {
    for (std::uint64_t n = machines.TheRelease().operations.at("registry"); n > 0; --n) {
        const std::string orders = "registry=" + std::to_string(n);
        if (machines.Run({orders, 0, {}}, 0).said.find("failed and undone") != std::string::npos) {
            return orders;
        }
    }
    Stop("no failure of the registry sends a run back");
}

std::vector<Round> AllRounds(const Machines& machines) {
    std::vector<Round> rounds;
    const Release& release = machines.TheRelease();
    const auto breakEach = [&](const std::string& kind, const std::string& before, const Counts& operations) {
        for (const auto& [word, count] : operations) {
            for (std::uint64_t n = 1; n <= count + kRoundsAfterTheLast; ++n) {
                rounds.push_back({kind + word, {before + word + "=" + std::to_string(n), 0, {}}});
            }
        }
    };
    breakEach("", "", release.operations);
    const std::string back = LatestWayBack(machines);
    Counts onTheWayBack = machines.CountOperations(back);
    onTheWayBack.erase("registry");
    breakEach("on the way back: ", back + ";", onTheWayBack);
    const std::uint64_t space = SpaceOfARun(machines);
    for (std::uint64_t bytes = 0; bytes <= space; bytes += kSpaceStep) {
        rounds.push_back({"space", {"space=" + std::to_string(bytes), 0, {}}});
    }
    for (const auto& [path, content] : release.older) {
        if (const auto newer = release.newer.find(path); newer != release.newer.end() && newer->second != content) {
            rounds.push_back({"held file", {"lock=" + WindowsName(path), 0, {}}});
        }
    }
    for (int i = 0; i < kMoments; ++i) {
        rounds.push_back({"cancelled", {{}, SIGINT, release.duration * i / kMoments}});
        rounds.push_back({"killed", {{}, SIGKILL, release.duration * i / kMoments}});
    }
    return rounds;
}

/// Each so many of every kind, and one of each at least.
std::vector<Round> SampleOf(const std::vector<Round>& rounds, int every) {
    std::vector<Round> sample;
    std::map<std::string, int> counts;
    for (const Round& round : rounds) {
        if (counts[round.kind]++ % every == 0) {
            sample.push_back(round);
        }
    }
    return sample;
}

int ProveAll(const Machines& machines, int slots, int every) {
    const std::vector<Round> rounds = SampleOf(AllRounds(machines), every);
    std::atomic<std::size_t> next{0};
    Tally tally;
    std::vector<std::thread> threads;
    for (int slot = 0; slot < slots; ++slot) {
        threads.emplace_back([&, slot] {
            for (std::size_t i = next++; i < rounds.size(); i = next++) {
                const Outcome outcome = machines.Run(rounds[i].fault, slot);
                tally.Add(rounds[i], Judge(machines.TheRelease(), rounds[i].fault, outcome), outcome.isKilled);
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    return tally.Report();
}

}  // namespace
}  // namespace Prove

int main(int argc, char** argv) try {
    if (argc != 4 && argc != 5) {
        Prove::Stop("usage: prove HVDEPLOY PACKAGES MACHINE.reg [EVERY]");
    }
    const int every = argc == 5 ? std::atoi(argv[4]) : 1;
    if (every < 1) {
        Prove::Stop("EVERY is a number from 1 on");
    }
    const int slots = static_cast<int>(std::max(1U, std::thread::hardware_concurrency()));
    const Prove::Machines machines(std::filesystem::absolute(argv[1]), std::filesystem::absolute(argv[2]),
                                   std::filesystem::absolute(argv[3]), slots);
    return Prove::ProveAll(machines, slots, every);
} catch (const std::exception& error) {
    std::fprintf(stderr, "prove: %s\n", error.what());
    return 2;
}
