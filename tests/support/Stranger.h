#pragma once

#include <functional>
#include <memory>
#include <string>

/// Another account of this computer, that does what a test has it do, again and again, until the object ends. Hosted
/// only: accounts are the host's.
///
/// Only root can take another account. Who uses this asks CanBe() first, and skips where nobody else can be played.
class Stranger {
public:
    static bool CanBe();

    /// Calls `attack` in a process of its own, as nobody, over and over. Returns when that process is at work.
    explicit Stranger(std::function<void()> attack);
    ~Stranger();
    Stranger(const Stranger&) = delete;
    Stranger& operator=(const Stranger&) = delete;

    /// Hands the item at this host path over to the stranger's account, as somebody's own folder is his.
    static void Owns(const std::string& hostPath);

private:
    struct Process;
    std::unique_ptr<Process> process_;
};
