#pragma once

#include <chrono>
#include <condition_variable>
#include <mutex>
#include <string>

/// Holds a thread at a chosen place of what it says, so that a test can look at a run that stands still.
///
/// The thread passes every text through; the test that chose one waits until the thread is there, and lets it go on.
/// Nobody waits longer than a minute.
class Gate {
public:
    void HoldAt(const std::string& text) {
        const std::lock_guard guard(mutex_);
        place_ = text;
        isHeld_ = false;
    }

    /// The thread's side.
    void Pass(const std::string& text) {
        std::unique_lock guard(mutex_);
        if (place_.empty() || text.find(place_) == std::string::npos) {
            return;
        }
        isHeld_ = true;
        changed_.notify_all();
        changed_.wait_for(guard, std::chrono::minutes(1), [this] { return place_.empty(); });
    }

    /// Whether the thread has come to the place.
    [[nodiscard]] bool WaitUntilHeld() {
        std::unique_lock guard(mutex_);
        return changed_.wait_for(guard, std::chrono::minutes(1), [this] { return isHeld_; });
    }

    void LetGo() {
        const std::lock_guard guard(mutex_);
        place_.clear();
        changed_.notify_all();
    }

private:
    std::mutex mutex_;
    std::condition_variable changed_;
    std::string place_;
    bool isHeld_ = false;
};
