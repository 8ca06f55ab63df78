#include "tools/hvpack/ValidatedPackage.h"

#include "package/ZipEntries.h"
#include "tools/hvpack/PackageError.h"
#include "tools/hvpack/ReleaseNames.h"

namespace HVPack {

bool IsSound(HV::Package& package) {
    return package.Validate(false) && HV::CheckZip(package.zipPath.string()) == 0;
}

HV::Package ValidatedPackage(const std::string& file) {
    HV::Package package{fs::path(file)};
    if (package.zipPath.empty()) {
        throw PackageError(file + " is not named .hvpkg or .zip");
    }
    if (!IsSound(package)) {
        throw PackageError(file + " is not a sound package");
    }
    RefuseUnsafeNames(package.zipPath.filename().string(), package.manifest);
    return package;
}

}  // namespace HVPack
