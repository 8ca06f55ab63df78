#include "hvdeploy/src/ProgressListener.h"

#include <cstdio>
#include <cstring>
#include <mutex>

namespace HV {
namespace {

constexpr std::size_t kLongestMessage = 4096;

// The last report of the process as one text. No code reads it: it is there for whoever looks at a memory dump.
struct LastReport {
    std::mutex mutex;
    char text[kLongestMessage + 128] = {};
};

void NoteLastReport(std::uint32_t percent, const char* message, std::int32_t error) {
    static LastReport last;
    const std::lock_guard<std::mutex> guard(last.mutex);
    std::snprintf(last.text, sizeof last.text, "- in update, percent %d message %s error %d",
                  static_cast<std::int32_t>(percent), message, error);
}

}  // namespace

void ProgressListener::update(std::uint32_t newPercent, const char* message, std::int32_t newError) {
    const boost::mutex::scoped_lock guard(lock);
    const char* const given = message != nullptr ? message : "";
    // A message that is too long is passed over and not cut: half a sentence would be shown as if it were whole.
    if (std::strlen(given) <= kLongestMessage) {
        text = given;
    }
    NoteLastReport(newPercent, given, newError);
    percent = newPercent;
    error = newError;
}

}  // namespace HV
