#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace HV {

/// What the wizard wants of the engine.
struct InstallRequest {
    std::vector<std::string> skippedIdentifiers;
    std::string logPathPrefix;  // the path of the log file up to the time
    std::int64_t time = 0;      // in seconds since 1970
    std::string packagesDirectory;
};

/// The argument line that says so. Values stand in double quotes and are not escaped: a text with a double quote, or
/// two texts with one apostrophe each, make a line that the engine reads otherwise or refuses.
[[nodiscard]] std::string InstallLine(const InstallRequest& request);

}  // namespace HV
