// How far the run has come, and the switch that ends it early.
#include <algorithm>

#include "hvdeploy/src/Deploy.h"
#include "hvdeploy/src/EntryTrace.h"
#include "hvframework/Log.h"

namespace HV {
namespace {

// Adding never passes this; only the two last steps of a folder run, which set the percentage, do.
constexpr float kProgressCeiling = 97.0F;
constexpr double kPointsOfAllPackages = 90.0;

}  // namespace

void Deploy::AddProgress(float points) {
    progress = std::min(progress + points, kProgressCeiling);
}

void Deploy::SetProgress(float percent, const char* message) {
    progress = percent;
    ReportProgress(message, 0);
}

float Deploy::PackageProgressPoints(const fs::path& path) const {
    boost::system::error_code error;
    const auto bytes = fs::file_size(path, error);
    if (error || bytes == 0 || totalPackageBytes == 0) {
        return 0.0F;
    }
    const float share = static_cast<float>(bytes) / static_cast<float>(totalPackageBytes);
    return static_cast<float>(static_cast<double>(share) * kPointsOfAllPackages);
}

void Deploy::ReportProgress(const char* message, std::int32_t error) {
    const char* const text = message != nullptr ? message : "";
    HVL_LOG(Debug, "Reporting progress: " << progress << " msg: " << text << " error: " << error);
    if (listener != nullptr) {
        listener->update(static_cast<std::uint32_t>(progress), message, error);
    }
    if (message != nullptr && error != 0) {
        HVL_LOG(Error, message << " - error: " << error);
    } else if (message != nullptr) {
        HVL_LOG(Info, message);
    } else if (error != 0) {
        HVL_LOG(Error, error);
    }
}

void Deploy::Cancel() {
    TraceEntry(kDeployClass, "Cancel");
    const boost::mutex::scoped_lock guard(cancelMutex);
    cancelled = true;
}

bool Deploy::IsCancelled() {
    const boost::mutex::scoped_lock guard(cancelMutex);
    return cancelled;
}

}  // namespace HV
