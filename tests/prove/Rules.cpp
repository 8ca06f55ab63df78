#include "tests/prove/Rules.h"

#include <algorithm>
#include <map>
#include <set>

namespace Prove {
namespace {

using Items = std::vector<std::string>;

// What the log says of the outcomes that rules name.
constexpr const char* kRollback = "HV::DeployRollback::HV::DeployRollback::Rollback";
constexpr const char* kNotStashed = "Failed to move/copy existing item to rollback stash, from ";
constexpr const char* kNotRemoved = "failed to delete installed file at ";
constexpr const char* kRestoring = "Restoring original file at ";
constexpr const char* kGuard = "exception deploying payload ";
constexpr const char* kCopying = "\n to: ";
constexpr const char* kNotExtracted = "Failed to extract package";
constexpr const char* kNotLinked = "MakeShortcut() returned ";
constexpr const char* kNoLinkFolder = "Failed to create shortcut directory at ";
constexpr const char* kNoDependency = "requires package";

constexpr const char* kKilled =
    "the records of the stash live in memory: after a kill it stays, with every file that was moved aside";
constexpr const char* kNoWayBack =
    "a package that does not extract, or a product that is missing, ends the run without a way back";
constexpr const char* kKeptItem = "what cannot be moved aside stays, and the copy meets it";
constexpr const char* kGuardedItem =
    "an exception in the copy loop keeps the result: that item is lost or cut, the payload's others are as they were";
constexpr const char* kLeftItem =
    "what cannot be removed on the way back stays, and what was there before does not return";
constexpr const char* kLostItem = "what cannot be put back has no message, and goes with the stash";
constexpr const char* kShortcut = "shortcuts that were made are not undone";
constexpr const char* kNoShortcut = "a shortcut that cannot be made is noted in the log and changes nothing else";
constexpr const char* kLeftInTemp = "what cannot be deleted in the folder for temporary files stays there";

enum class State { Old, New, Missing, Cut, Strange };

/// One file, of which nothing is known but what it was, is and should become; null where there is none.
struct File {
    std::string path;  // in lower case
    const std::string* older = nullptr;
    const std::string* newer = nullptr;
    const std::string* now = nullptr;
};

bool Same(const std::string* one, const std::string* other) {
    return one == nullptr || other == nullptr ? one == other : *one == *other;
}

State StateOf(const File& file) {
    if (Same(file.now, file.older)) {
        return State::Old;
    }
    if (Same(file.now, file.newer)) {
        return State::New;
    }
    if (file.now == nullptr) {
        return State::Missing;
    }
    return file.newer != nullptr && file.newer->rfind(*file.now, 0) == 0 ? State::Cut : State::Strange;
}

const std::string* Find(const Files& files, const std::string& path) {
    const auto found = files.find(path);
    return found == files.end() ? nullptr : &found->second;
}

std::vector<File> AllFiles(const Release& release, const Outcome& outcome) {
    std::set<std::string> paths;
    for (const Files* files : {&release.older, &release.newer, &outcome.files}) {
        for (const auto& [path, content] : *files) {
            paths.insert(path);
        }
    }
    std::vector<File> all;
    for (const std::string& path : paths) {
        all.push_back(
            {LowerCase(path), Find(release.older, path), Find(release.newer, path), Find(outcome.files, path)});
    }
    return all;
}

/// A path as the log streams it: in double quotes, with `&` before what is escaped.
std::string Unquoted(const std::string& log, std::size_t quote) {
    std::string text;
    for (std::size_t at = quote + 1; at < log.size() && log[at] != '"'; ++at) {
        at += log[at] == '&' && at + 1 < log.size() ? 1 : 0;
        text += log[at];
    }
    return text;
}

/// The items in quotes right after `words` in the log.
Items ItemsNamed(const std::string& log, const std::string& words) {
    Items items;
    for (std::size_t at = log.find(words); at != std::string::npos; at = log.find(words, at + 1)) {
        if (const std::size_t quote = at + words.size(); quote < log.size() && log[quote] == '"') {
            items.push_back(PathInMachine(Unquoted(log, quote)));
        }
    }
    return items;
}

bool IsBelow(const std::string& path, const Items& items) {
    return std::ranges::any_of(items,
                               [&](const std::string& item) { return path == item || path.rfind(item + "/", 0) == 0; });
}

/// What the evidence of one run allows.
struct Evidence {
    Items notStashed;
    Items notRemoved;
    Items restored;
    Items guarded;                 // what was being copied when an exception came
    Items passedBy;                // all items of such a payload
    bool passesShortcuts = false;  // such a payload has some
    bool missesShortcut = false;
};

/// What an exception in the copy loop, told at `at` in the log, has kept from being placed.
void AddGuarded(const Release& release, const std::string& log, std::size_t at, Evidence& evidence) {
    if (const std::size_t copying = log.rfind(kCopying, at); copying != std::string::npos) {
        const std::size_t begin = copying + std::string(kCopying).size();
        evidence.guarded.push_back(PathInMachine(log.substr(begin, log.find_first_of("\r\n", begin) - begin)));
    }
    const std::size_t name = at + std::string(kGuard).size();
    const std::string payload = log.substr(name, log.find(": ", name) - name);
    if (const auto items = release.items.find(payload); items != release.items.end()) {
        evidence.passedBy.insert(evidence.passedBy.end(), items->second.begin(), items->second.end());
    }
    evidence.passesShortcuts |= release.withShortcuts.count(payload) != 0;
}

/// Nothing tells of a move back that fails, so it has to be one that the fault can have hit.
void KeepWhatTheFaultCanHit(const Fault& fault, Items& restored) {
    const std::string lock = "lock=";
    if (const std::size_t at = fault.orders.find(lock); at != std::string::npos) {
        const std::string held = PathInMachine(fault.orders.substr(at + lock.size()));
        std::erase_if(restored, [&](const std::string& item) { return !IsBelow(held, {item}); });
    } else if (fault.orders.find("rename=") == std::string::npos) {
        restored.clear();
    }
}

Evidence EvidenceOf(const Release& release, const Fault& fault, const Outcome& outcome) {
    const std::string& log = outcome.log;
    Evidence evidence;
    evidence.notStashed = ItemsNamed(log, kNotStashed);
    evidence.notRemoved = ItemsNamed(log, kNotRemoved);
    evidence.restored = ItemsNamed(log, kRestoring);
    for (std::size_t at = log.find(kGuard); at != std::string::npos; at = log.find(kGuard, at + 1)) {
        AddGuarded(release, log, at, evidence);
    }
    evidence.missesShortcut = outcome.Says(kNotLinked) || outcome.Says(kNoLinkFolder);
    KeepWhatTheFaultCanHit(fault, evidence.restored);
    return evidence;
}

/// The rule by which `file` may be in a state other than the one that the run was to bring; null when there is none.
const char* RuleFor(const File& file, State state, const Evidence& evidence) {
    if (state == State::Strange) {
        return nullptr;
    }
    if (state == State::Old && IsBelow(file.path, evidence.notStashed)) {
        return kKeptItem;
    }
    if (IsBelow(file.path, evidence.guarded)) {
        return kGuardedItem;
    }
    if (state == State::New && file.path.ends_with(".lnk")) {
        return kShortcut;
    }
    if (state == State::Old && evidence.missesShortcut && file.path.ends_with(".lnk")) {
        return kNoShortcut;
    }
    if (IsBelow(file.path, evidence.notRemoved)) {
        return kLeftItem;
    }
    if (state == State::Missing && IsBelow(file.path, evidence.restored)) {
        return kLostItem;
    }
    const bool isPassedBy =
        IsBelow(file.path, evidence.passedBy) || (evidence.passesShortcuts && file.path.ends_with(".lnk"));
    return state == State::Old && isPassedBy ? kGuardedItem : nullptr;
}

bool HasNoWayBack(const Outcome& outcome) {
    return outcome.status != 0 && !outcome.Says(kRollback) &&
           (outcome.Says(kNotExtracted) || outcome.Says(kNoDependency));
}

std::string Described(const File& file, State state) {
    static const std::map<State, std::string> words = {{State::Old, "is the old one"},
                                                       {State::New, "is the new one"},
                                                       {State::Missing, "is missing"},
                                                       {State::Cut, "is cut"},
                                                       {State::Strange, "is neither"}};
    return words.at(state) + ": " + file.path;
}

void Explain(const char* rule, const std::string& detail, Verdict& verdict) {
    if (rule == nullptr) {
        verdict.details.push_back(detail);
    } else if (std::ranges::find(verdict.rules, rule) == verdict.rules.end()) {
        verdict.rules.emplace_back(rule);
    }
}

/// A file that is not whole after a kill: what was there before waits in the stash.
const char* RuleAfterKill(const File& file, State state, const Outcome& outcome) {
    const bool isSafe = file.older == nullptr || outcome.temporary.count(*file.older) != 0;
    const bool isKnown = state == State::Old || state == State::New;
    return isKnown || (state != State::Strange && isSafe) ? kKilled : nullptr;
}

void JudgeKilled(const std::vector<File>& files, const Outcome& outcome, Verdict& verdict) {
    for (const File& file : files) {
        const State state = StateOf(file);
        Explain(RuleAfterKill(file, state, outcome), Described(file, state), verdict);
    }
}

/// How many items were not put back. One fault hits one move.
std::size_t CountLost(const std::vector<File>& files, const Evidence& evidence) {
    std::set<std::string> lost;
    for (const File& file : files) {
        const State state = StateOf(file);
        if (state == State::Missing && RuleFor(file, state, evidence) == kLostItem) {
            lost.insert(*std::ranges::find_if(evidence.restored,
                                              [&](const std::string& item) { return IsBelow(file.path, {item}); }));
        }
    }
    return lost.size();
}

void JudgeEnded(const Release& release, const Fault& fault, const std::vector<File>& files, const Outcome& outcome,
                Verdict& verdict) {
    const Evidence evidence = EvidenceOf(release, fault, outcome);
    const State expected = outcome.status == 0 ? State::New : State::Old;
    for (const File& file : files) {
        const State state = StateOf(file);
        const bool isAsWanted = expected == State::New ? Same(file.now, file.newer) : state == State::Old;
        if (state == State::New && HasNoWayBack(outcome)) {
            Explain(kNoWayBack, {}, verdict);
        } else if (!isAsWanted) {
            Explain(RuleFor(file, state, evidence), Described(file, state), verdict);
        }
    }
    if (CountLost(files, evidence) > 1) {
        verdict.details.emplace_back("more than one item was not put back");
    }
    if (!outcome.temporary.empty()) {
        const bool mayStay = fault.orders.find("delete=") != std::string::npos;
        Explain(mayStay ? kLeftInTemp : nullptr, "there are temporary files left", verdict);
    }
    if (outcome.said.find("nothing was installed") != std::string::npos && outcome.files != release.older) {
        verdict.details.emplace_back("the program says that nothing was installed");
    }
}

}  // namespace

bool IsQuiet(const Outcome& outcome) {
    return outcome.status == 0 && !outcome.Says("[ERROR]") && !outcome.Says("[WARN]");
}

Verdict Judge(const Release& release, const Fault& fault, const Outcome& outcome) {
    Verdict verdict;
    const std::vector<File> files = AllFiles(release, outcome);
    const bool isAsBefore = outcome.files == release.older;
    const bool isWhole = outcome.files == release.newer;
    if (!outcome.isKilled) {
        JudgeEnded(release, fault, files, outcome, verdict);
    } else if (!isAsBefore && !isWhole) {
        JudgeKilled(files, outcome, verdict);
    }
    if (!verdict.details.empty()) {
        verdict.kind = Kind::Violation;
    } else if (!verdict.rules.empty()) {
        verdict.kind = Kind::ByRule;
    } else {
        verdict.kind = isWhole ? Kind::Whole : Kind::AsBefore;
    }
    return verdict;
}

}  // namespace Prove
