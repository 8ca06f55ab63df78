#include "package/PackageNames.h"

#include "hvframework/StringUtils.h"

namespace HV {

bool IsPackageExtension(std::string_view extension) {
    return extension == ".zip" || extension == ".hvpkg";
}

bool IsNamedAsPackage(const fs::path& file) {
    return IsPackageExtension(file.extension().string());
}

bool IsRootManifest(const std::string& entry) {
    return HVL::StringUtils::EndsWith(entry, kManifestEnding) && entry.find('/') == std::string::npos;
}

}  // namespace HV
