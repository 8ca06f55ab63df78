#include "hosts/HostAppCheck.h"

#include <algorithm>
#include <iostream>
#include <iterator>

#include "hosts/PlatformDetectors.h"

namespace HV {
namespace {

// A reference holds no version: it means every detected version of its host. The combined references look at the type,
// since no record carries them as its abbreviation.
bool Matches(const HostRecord& host, const std::string& hostRef) {
    if (host.hostAbbreviation == hostRef) {
        return true;
    }
    switch (HostTypeFromAbbreviation(hostRef)) {
        case HostType::AfterEffectsMediaCore:
            return host.hostType == HostType::AfterEffects;
        case HostType::AfterEffectsAndPremiere:
            return host.hostType == HostType::AfterEffects || host.hostType == HostType::Premiere;
        default:
            return false;
    }
}

}  // namespace

HostAppCheck::HostAppCheck() {
    AddPlatformDetectors(*this);
}

void HostAppCheck::AddDetector(const boost::shared_ptr<HostAppDetector>& detector) {
    detectors.push_back(detector);
}

bool HostAppCheck::DetectHosts() {
    if (detectionDone) {
        return !hosts.empty();
    }
    if (verbose) {
        std::cout << "Running host detectors...";
    }
    for (const auto& detector : detectors) {
        std::vector<HostRecord> found;
        if (detector->Run(found)) {
            hosts.insert(hosts.end(), std::make_move_iterator(found.begin()), std::make_move_iterator(found.end()));
        }
    }
    detectionDone = true;
    return !hosts.empty();
}

bool HostAppCheck::FindHosts(const std::string& hostRef, std::vector<HostRecord>& matches) const {
    matches.clear();
    std::copy_if(hosts.begin(), hosts.end(), std::back_inserter(matches),
                 [&](const HostRecord& host) { return Matches(host, hostRef); });
    return !matches.empty();
}

bool HostAppCheck::HasHost(const std::string& hostRef) const {
    return std::any_of(hosts.begin(), hosts.end(), [&](const HostRecord& host) { return Matches(host, hostRef); });
}

}  // namespace HV
