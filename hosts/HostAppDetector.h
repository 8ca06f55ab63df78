#pragma once

#include <vector>

#include "hosts/HostRecord.h"

namespace HV {

/// Finds the installed versions of one family of hosts. Holds no data; runs on the thread that asks for hosts.
class HostAppDetector {
public:
    virtual ~HostAppDetector() = default;

    /// Clears `hosts` and fills it with one record for each installed version. Returns true if it found a host; after
    /// false the content of `hosts` means nothing.
    virtual bool Run(std::vector<HostRecord>& hosts) = 0;
};

}  // namespace HV
