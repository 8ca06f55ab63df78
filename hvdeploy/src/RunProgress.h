#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

#include "hvdeploy/src/ProgressListener.h"
#include "platform/filesystem.h"

namespace HV {

/// How far a run has come, in percent, and who is told of it.
///
/// Adding never passes 97; only the last two steps of a run over a folder go beyond, by setting the percentage itself.
/// Used by the thread of the run alone.
class RunProgress {
public:
    /// `listener` may be null, is not owned and must outlive this object.
    explicit RunProgress(ProgressListenerInterface* listener) : listener_(listener) {}

    void SetListener(ProgressListenerInterface* listener) { listener_ = listener; }

    /// Adds to the percentage, up to 97.
    void Add(float points);

    /// Sets the percentage and reports it with `message`.
    void SetTo(float percent, const char* message);

    /// Tells the listener and the log how far the run has come. `message` may be null.
    void Report(const char* message, std::int32_t error) const;

    /// Divides 90 points among packages of so many bytes in all. Before this packages have none.
    void DivideAmong(std::uint64_t packageBytes) { packageBytes_ = packageBytes; }

    /// The share of one package in these points, by the size of its file; 0 for one that is empty or not there.
    [[nodiscard]] float PointsOf(const fs::path& package) const;

private:
    ProgressListenerInterface* listener_;
    float percent_ = 0.0F;
    std::uint64_t packageBytes_ = 0;
};

/// The points of one package while its payloads spend them. Whatever is left goes to the progress in the end, on every
/// way out.
class PackagePoints {
public:
    /// `payloads` is the number of those that spend an equal share each.
    PackagePoints(RunProgress& progress, float points, std::size_t payloads);
    ~PackagePoints();
    PackagePoints(const PackagePoints&) = delete;
    PackagePoints& operator=(const PackagePoints&) = delete;

    /// Spends one share and reports `message`; does nothing when no points are left.
    void SpendShare(const std::string& message);

private:
    RunProgress& progress_;
    float remaining_;
    float share_;
};

}  // namespace HV
