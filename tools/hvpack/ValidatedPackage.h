#pragma once

#include <string>

#include "package/Package.h"

namespace HVPack {

/// Whether the engine would take the package and every entry of it: what it asks before it unpacks, and unpacking,
/// which writes nothing here. The reasons are in the log. Fills in what the engine reads.
[[nodiscard]] bool IsSound(HV::Package& package);

/// The package in `file`, found sound by the engine's own check, and with names that a release may have. Throws
/// PackageError, or the std::runtime_error of the package for a file that is not there; the engine's reasons are in the
/// log.
[[nodiscard]] HV::Package ValidatedPackage(const std::string& file);

}  // namespace HVPack
