#pragma once

#include <vector>

#include "hosts/HostAppDetector.h"

/// After Effects and Premiere Pro. Adobe keeps one registry key per installed version; each that is new enough and
/// names both of its plug-in folders becomes a record, in the registry's order. Any other is passed over, with a WARN
/// line in "hvdeploy-detail" when something is missing and none when the version is too low.
namespace HV {

/// After Effects 13.0 and later. Where a version does not say where it is installed, the places of the versions up to
/// 2020 are known.
class AdobeAEDetector_Win : public HostAppDetector {
public:
    bool Run(std::vector<HostRecord>& hosts) override;
};

/// Premiere Pro 8 and later. The record has no folders for presets, scripts and documentation.
class AdobePremiereDetector_Win : public HostAppDetector {
public:
    bool Run(std::vector<HostRecord>& hosts) override;
};

}  // namespace HV
