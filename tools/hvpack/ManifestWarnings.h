#pragma once

#include <string>
#include <vector>

#include "package/Manifest.h"

namespace HVPack {

/// What a manifest says that its author can hardly mean, though the engine takes it: a line for each, in the order of
/// the payloads. Payloads for other systems are passed over. A package with warnings is a good one all the same.
[[nodiscard]] std::vector<std::string> WarningsAbout(const HV::Manifest& manifest);

}  // namespace HVPack
