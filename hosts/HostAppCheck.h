#pragma once

#include <boost/shared_ptr.hpp>
#include <string>
#include <vector>

#include "hosts/HostAppDetector.h"
#include "hosts/HostRecord.h"

namespace HV {

/// The hosts of this machine: runs every detector once and answers which records a manifest's host-ref means.
///
/// The records do not change once detection has run; a host that is installed later is not seen by this object.
/// Not thread-safe until DetectHosts() has returned; read-only from then on.
class HostAppCheck {
public:
    /// Takes the detectors of this platform: After Effects, Premiere, Edius, HitFilm, Media Composer, Resolve, Vegas.
    /// Their order is the order of the records.
    HostAppCheck();

    /// Appends a detector, which must come before the first DetectHosts() to be asked.
    void AddDetector(const boost::shared_ptr<HostAppDetector>& detector);

    /// Says on standard output when detection runs.
    void SetVerbose(bool on) { verbose = on; }

    /// Runs detection if it has not run. Returns whether this machine has any host.
    bool DetectHosts();

    /// Fills `matches` with copies of the records that `hostRef` means, in detection order, and returns whether there
    /// are any. Does not run detection.
    bool FindHosts(const std::string& hostRef, std::vector<HostRecord>& matches) const;

    /// Whether any record matches `hostRef`. Does not run detection.
    bool HasHost(const std::string& hostRef) const;

    /// All records, in detection order.
    const std::vector<HostRecord>& Hosts() const { return hosts; }

private:
    std::vector<HostRecord> hosts;
    bool detectionDone = false;
    std::vector<boost::shared_ptr<HostAppDetector>> detectors;
    bool verbose = false;
};

}  // namespace HV
