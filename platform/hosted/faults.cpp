#include "platform/hosted/faults.h"

#include <algorithm>
#include <cerrno>
#include <charconv>
#include <optional>
#include <stdexcept>

#include "platform/hosted/held_folders.h"

namespace hosted {
namespace {

struct Word {
    std::string_view text;
    Operation operation;
};

constexpr Word OperationWords[] = {{"write", Operation::Write},
                                   {"create", Operation::Create},
                                   {"rename", Operation::Rename},
                                   {"delete", Operation::Delete},
                                   {"registry", Operation::RegistrySet}};
constexpr std::string_view SpaceWord = "space";
constexpr std::string_view LockWord = "lock";

std::optional<Operation> OperationOfWord(std::string_view text) {
    for (const Word& word : OperationWords) {
        if (word.text == text) {
            return word.operation;
        }
    }
    return std::nullopt;
}

std::optional<std::uint64_t> ParseNumber(std::string_view text) {
    std::uint64_t number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (error != std::errc() || end != text.data() + text.size()) {
        return std::nullopt;
    }
    return number;
}

bool IsBelow(const std::string& path, const std::string& folder) {
    return path.size() > folder.size() && path.compare(0, folder.size(), folder) == 0 && path[folder.size()] == '/';
}

/// What a broken device or a missing right looks like to the program.
int ErrorOf(Operation operation) {
    return operation == Operation::Write ? EIO : EACCES;
}

}  // namespace

int Faults::CheckArmed(Operation operation, const std::string& hostPath, std::uint64_t bytes) {
    const std::lock_guard guard(mutex_);
    if (CountAndFail(operation)) {
        return ErrorOf(operation);
    }
    if (IsHeld(operation, HeldFolders::All().Back(hostPath))) {
        return EACCES;
    }
    return operation == Operation::Write && !HasSpaceFor(bytes) ? ENOSPC : 0;
}

int Faults::CheckRenameArmed(const std::string& from, const std::string& to) {
    const std::lock_guard guard(mutex_);
    const bool fails = CountAndFail(Operation::Rename);
    const HeldFolders& folders = HeldFolders::All();
    const bool held = IsHeld(Operation::Rename, folders.Back(from)) || IsHeld(Operation::Rename, folders.Back(to));
    return fails || held ? EACCES : 0;
}

bool Faults::CountAndFail(Operation operation) {
    Kind& kind = kinds_[static_cast<std::size_t>(operation)];
    return ++kind.count == kind.failAt;
}

bool Faults::IsHeld(Operation operation, const std::string& hostPath) const {
    return std::any_of(locked_.begin(), locked_.end(), [&](const std::string& locked) {
        return hostPath == locked || IsBelow(hostPath, locked) ||
               (operation == Operation::Rename && IsBelow(locked, hostPath));
    });
}

bool Faults::HasSpaceFor(std::uint64_t bytes) {
    if (!spaceLimited_) {
        return true;
    }
    if (bytes > spaceLeft_) {
        return false;
    }
    spaceLeft_ -= bytes;
    return true;
}

void Faults::FailNth(Operation operation, std::uint64_t n) {
    const std::lock_guard guard(mutex_);
    kinds_[static_cast<std::size_t>(operation)] = {0, n};
    armed_ = true;
}

void Faults::LimitSpace(std::uint64_t bytes) {
    const std::lock_guard guard(mutex_);
    spaceLimited_ = true;
    spaceLeft_ = bytes;
    armed_ = true;
}

void Faults::Lock(std::string hostPath) {
    const std::lock_guard guard(mutex_);
    locked_.push_back(std::move(hostPath));
    armed_ = true;
}

void Faults::Unlock(const std::string& hostPath) {
    const std::lock_guard guard(mutex_);
    std::erase(locked_, hostPath);
}

void Faults::StartCounting() {
    const std::lock_guard guard(mutex_);
    for (Kind& kind : kinds_) {
        kind.count = 0;
    }
    armed_ = true;
}

std::uint64_t Faults::Count(Operation operation) const {
    const std::lock_guard guard(mutex_);
    return kinds_[static_cast<std::size_t>(operation)].count;
}

void Faults::Disarm() {
    const std::lock_guard guard(mutex_);
    kinds_ = {};
    spaceLimited_ = false;
    locked_.clear();
    armed_ = false;
}

std::vector<Faults::Order> Faults::ParseOrders(std::string_view text) {
    std::vector<Order> orders;
    while (!text.empty()) {
        const std::string_view part = text.substr(0, text.find(';'));
        text.remove_prefix(std::min(text.size(), part.size() + 1));
        const std::size_t equals = std::min(part.find('='), part.size());
        const std::string_view word = part.substr(0, equals);
        const std::string_view value = part.substr(std::min(part.size(), equals + 1));
        const std::optional<std::uint64_t> number = ParseNumber(value);
        if (word == LockWord && !value.empty()) {
            orders.push_back({std::string(word), 0, std::string(value)});
        } else if (number && (word == SpaceWord || (OperationOfWord(word) && *number > 0))) {
            orders.push_back({std::string(word), *number, {}});
        } else {
            throw std::invalid_argument("cannot read \"" + std::string(part) + "\"");
        }
    }
    return orders;
}

void Faults::Obey(const Order& order) {
    if (order.word == LockWord) {
        Lock(order.path);
    } else if (order.word == SpaceWord) {
        LimitSpace(order.number);
    } else {
        FailNth(*OperationOfWord(order.word), order.number);
    }
}

}  // namespace hosted
