#pragma once

#include <string>

#include "hvframework/Version.h"

namespace HVL {

/// Fills `version` with the first three numbers of the product version that the executable `path` carries, or of its
/// file version when the product version is all zero. Returns false, with an empty text, when the file cannot be read
/// or carries no version block.
[[nodiscard]] bool GetFileVersion(const std::string& path, Version& version);

}  // namespace HVL
