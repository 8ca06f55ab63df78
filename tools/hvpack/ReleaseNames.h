#pragma once

#include <string>

#include "package/Manifest.h"

/// The names of a release that end in file names, registry keys, the removal script or a browser.
///
/// The engine takes them as they are, and the removal script runs as administrator: a suite that is called
/// `Glow & shutdown` would shut the machine down. So nothing is packed, or compiled into a table, whose names a command
/// processor or a path gives a meaning of its own. Names that are only shown may hold what they like.
namespace HVPack {

/// Throws PackageError, which names file, field, value and character, when the package `fileName` has a name that no
/// release may have.
void RefuseUnsafeNames(const std::string& fileName, const HV::Manifest& manifest);

/// Reads the suite file at `path` as the engine does. Throws PackageError when the engine would not take it for a
/// suite, when it lacks what a release is named by, or when it has a name or an address that no release may have.
void RefuseUnlessSuite(const std::string& path);

}  // namespace HVPack
