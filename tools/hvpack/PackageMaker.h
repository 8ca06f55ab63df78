#pragma once

#include "package/Manifest.h"
#include "platform/filesystem.h"

namespace HVPack {

/// Makes a package of all that is in `folder`, and puts it at `output` when the engine's own check has found it sound
/// and its names are those that a release may have.
///
/// The same folder gives the same bytes, whenever and wherever: entries are sorted by name, carry one fixed time and no
/// attributes of their files, and every folder has an entry. The package is written into a folder of its own beside
/// `output` and moved over it in the end, so that `output` is either what it was or complete. Gives the manifest that
/// the engine has read. Throws PackageError; the engine's reasons for refusing a package are in the log.
[[nodiscard]] HV::Manifest MakePackage(const fs::path& folder, const fs::path& output);

}  // namespace HVPack
