#pragma once

#include <boost/thread/mutex.hpp>
#include <cstdint>
#include <string>

/// How a run tells the outside world how far it has come.
namespace HV {

/// The percentage that marks a failed run; the error beside it is then not 0.
constexpr std::uint32_t kFailedPercent = 0xFFFFFFFF;

/// The one channel for reports. Called on the thread that runs the engine, and once on the thread that constructs it.
class ProgressListenerInterface {
public:
    /// `percent` is 0 to 100, or kFailedPercent. `message` may be null and is valid for the call alone.
    virtual void update(std::uint32_t percent, const char* message, std::int32_t error) = 0;
    virtual ~ProgressListenerInterface() = default;
};

/// Keeps the latest report for a reader that polls. Any thread may read the three fields while it holds `lock`; the
/// lock is never held across a call into other code.
class ProgressListener : public ProgressListenerInterface {
public:
    /// Takes the report over. An empty message clears the text; one of more than 4096 characters leaves it alone.
    void update(std::uint32_t percent, const char* message, std::int32_t error) override;

    std::string text;
    std::uint32_t percent = 0;
    std::int32_t error = 0;
    boost::mutex lock;
};

}  // namespace HV
