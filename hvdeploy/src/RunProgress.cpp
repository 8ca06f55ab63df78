#include "hvdeploy/src/RunProgress.h"

#include <algorithm>

#include "hvframework/Log.h"

namespace HV {
namespace {

constexpr float kProgressCeiling = 97.0F;
constexpr double kPointsOfAllPackages = 90.0;

}  // namespace

void RunProgress::Add(float points) {
    percent_ = std::min(percent_ + points, kProgressCeiling);
}

void RunProgress::SetTo(float percent, const char* message) {
    percent_ = percent;
    Report(message, 0);
}

void RunProgress::Report(const char* message, std::int32_t error) const {
    const char* const text = message != nullptr ? message : "";
    HVL_LOG(Debug, "Reporting progress: " << percent_ << " msg: " << text << " error: " << error);
    if (listener_ != nullptr) {
        listener_->update(static_cast<std::uint32_t>(percent_), message, error);
    }
    if (message != nullptr && error != 0) {
        HVL_LOG(Error, message << " - error: " << error);
    } else if (message != nullptr) {
        HVL_LOG(Info, message);
    } else if (error != 0) {
        HVL_LOG(Error, error);
    }
}

float RunProgress::PointsOf(const fs::path& package) const {
    boost::system::error_code error;
    const auto bytes = fs::file_size(package, error);
    if (error || bytes == 0 || packageBytes_ == 0) {
        return 0.0F;
    }
    const float share = static_cast<float>(bytes) / static_cast<float>(packageBytes_);
    return static_cast<float>(static_cast<double>(share) * kPointsOfAllPackages);
}

PackagePoints::PackagePoints(RunProgress& progress, float points, std::size_t payloads)
    : progress_(progress), remaining_(points), share_(payloads == 0 ? 0.0F : points / static_cast<float>(payloads)) {}

PackagePoints::~PackagePoints() {
    if (remaining_ > 0.0F) {
        progress_.Add(remaining_);
    }
}

void PackagePoints::SpendShare(const std::string& message) {
    if (remaining_ > 0.0F && share_ > 0.0F) {
        progress_.Add(share_);
        remaining_ -= share_;
        progress_.Report(message.c_str(), 0);
    }
}

}  // namespace HV
