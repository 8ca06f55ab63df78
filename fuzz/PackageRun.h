#pragma once

#include <string>

namespace fuzzing {

/// Opens, validates and extracts a package of these bytes on the throw-away machine, and works out its payloads' paths.
/// Ends the program when anything comes to lie outside the folder that it is extracted to.
void UsePackage(const std::string& bytes);

}  // namespace fuzzing
