#pragma once

#include <string>
#include <vector>

#include "system/Processes.h"

namespace HV {

/// The text that asks the user to quit these hosts, each named as often as it runs. Throws std::out_of_range for a
/// process whose name has fewer than four characters: see HostDisplayName().
[[nodiscard]] std::string RunningHostsText(const std::vector<ProcessRecord>& running);

}  // namespace HV
