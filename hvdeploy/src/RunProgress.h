#pragma once

#include <cstdint>

#include "hvdeploy/src/ProgressListener.h"
#include "platform/filesystem.h"

namespace HV {

/// How far one run has come, in percent, and who is told.
///
/// Packages share 90 points by the sizes of their files. Not thread-safe: the deployment's thread owns it.
class RunProgress {
public:
    /// `listener` may be null, is not owned and must outlive this object.
    explicit RunProgress(ProgressListenerInterface* listener) : listener_(listener) {}

    void SetListener(ProgressListenerInterface* listener) { listener_ = listener; }
    [[nodiscard]] bool HasListener() const { return listener_ != nullptr; }

    /// What the packages of this run weigh together, in bytes; 0 gives none of them any points.
    void SetPackageBytes(std::uint64_t bytes) { packageBytes_ = bytes; }

    /// The share of the package at `path` in the 90 points. 0 where its size is 0 or cannot be asked for.
    [[nodiscard]] float PointsOf(const fs::path& path) const;

    /// Adds to the percentage, which this way never passes 97.
    void Add(float points);

    /// Sets the percentage and reports `message`.
    void SetTo(float percent, const char* message);

    /// Tells the listener and the log. `message` may be null.
    void Report(const char* message, std::int32_t error) const;

private:
    ProgressListenerInterface* listener_;
    std::uint64_t packageBytes_ = 0;
    float percent_ = 0.0F;
};

}  // namespace HV
