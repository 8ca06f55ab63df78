#pragma once

#include <string>
#include <string_view>

#include "platform/filesystem.h"

/// How packages and their manifests are called. Names are compared exactly: upper and lower case differ.
namespace HV {

/// What the name of a manifest ends in, and that of the record of an installed product.
inline constexpr std::string_view kManifestEnding = "_hvmanifest.xml";

/// Whether `extension` is that of packages: ".zip" or ".hvpkg".
[[nodiscard]] bool IsPackageExtension(std::string_view extension);

/// Whether a file has the extension of packages.
[[nodiscard]] bool IsNamedAsPackage(const fs::path& file);

/// Whether an entry of an archive is a manifest at its root. Its ending is compared, and not the name.
[[nodiscard]] bool IsRootManifest(const std::string& entry);

}  // namespace HV
