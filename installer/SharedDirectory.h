#pragma once

#include <string>

namespace HV {

/// Makes a folder that every user of the machine may write into, with what is later made in it. A folder that is there
/// keeps its access as it is. Failures are not reported.
void CreateSharedDirectory(const std::string& path);

}  // namespace HV
