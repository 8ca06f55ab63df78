#pragma once

#include <stdexcept>

namespace HVPack {

/// Why something could not be made of packages, or of a folder, as a line for the person who asked for it.
class PackageError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

}  // namespace HVPack
