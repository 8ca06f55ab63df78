#pragma once

#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <mutex>
#include <string>
#include <string_view>
#include <vector>

namespace hosted {

/// What can be made to fail. Create is the opening of a file for writing and the making of a folder; Write is bytes
/// into a file; RegistrySet is the making of a key, the setting of a value and the deleting of either.
enum class Operation { Write, Create, Rename, Delete, RegistrySet };
inline constexpr std::size_t OperationCount = 5;

/// The machine's breaking points: every operation that changes the machine asks Check() before it does so.
///
/// Nothing armed costs one atomic load. A failure is an errno that the caller reports as its own; the operation must
/// then leave the machine untouched. Thread-safe.
class Faults {
public:
    /// 0, or the errno with which the operation on `hostPath` has to fail. `bytes` is what a Write wants to write.
    /// Both names of a rename count: CheckRename() asks for them as one operation.
    int Check(Operation operation, const std::string& hostPath, std::uint64_t bytes = 0) {
        return armed_.load(std::memory_order_relaxed) ? CheckArmed(operation, hostPath, bytes) : 0;
    }
    int CheckRename(const std::string& from, const std::string& to) { return Armed() ? CheckRenameArmed(from, to) : 0; }
    [[nodiscard]] bool Armed() const { return armed_.load(std::memory_order_relaxed); }

    /// Fails the `n`-th operation of this kind from now on, counted from 1, and only that one.
    void FailNth(Operation operation, std::uint64_t n);
    /// Refuses (ENOSPC) every write that would bring the bytes written from now on above `bytes`.
    void LimitSpace(std::uint64_t bytes);
    /// Holds the item at `hostPath` as a program would that lets others only read: it, and all below a folder,
    /// refuses to be written, renamed and deleted, and no folder above it can be renamed (EACCES).
    void Lock(std::string hostPath);
    void Unlock(const std::string& hostPath);
    /// Starts counting from zero without failing anything.
    void StartCounting();
    /// Operations of this kind since the last arming or StartCounting(), failed ones included.
    [[nodiscard]] std::uint64_t Count(Operation operation) const;
    /// Takes back everything that was armed and counted.
    void Disarm();

    /// Arms from text such as `write=3;space=1000000;lock=C:\x\y`: `write`, `create`, `rename`, `delete` and
    /// `registry` take the number of the operation to fail, `space` bytes, `lock` a Windows path that `toHost` turns
    /// into the host's. Throws std::invalid_argument that names the part it cannot read; nothing is armed then.
    template <class ToHost>
    void Arm(std::string_view text, ToHost toHost);

private:
    struct Kind {
        std::uint64_t count = 0;
        std::uint64_t failAt = 0;
    };
    struct Order {
        std::string word;
        std::uint64_t number = 0;
        std::string path;
    };

    static std::vector<Order> ParseOrders(std::string_view text);
    void Obey(const Order& order);
    int CheckArmed(Operation operation, const std::string& hostPath, std::uint64_t bytes);
    int CheckRenameArmed(const std::string& from, const std::string& to);
    bool CountAndFail(Operation operation);
    bool IsHeld(Operation operation, const std::string& hostPath) const;
    bool HasSpaceFor(std::uint64_t bytes);

    std::atomic<bool> armed_{false};
    mutable std::mutex mutex_;
    std::array<Kind, OperationCount> kinds_{};
    bool spaceLimited_ = false;
    std::uint64_t spaceLeft_ = 0;
    std::vector<std::string> locked_;
};

template <class ToHost>
void Faults::Arm(std::string_view text, ToHost toHost) {
    for (Order& order : ParseOrders(text)) {
        if (!order.path.empty()) {
            order.path = toHost(order.path);
        }
        Obey(order);
    }
}

}  // namespace hosted
