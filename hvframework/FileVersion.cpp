#include "hvframework/FileVersion.h"

#include "platform/program_versions.h"

namespace HVL {

bool GetFileVersion(const std::string& path, Version& version) {
    version.text.clear();
    const auto versions = platform::VersionsOfProgram(path);
    if (!versions) {
        return false;
    }
    const bool hasProductVersion = versions->product != platform::ProgramVersions::Numbers{};
    const auto& numbers = hasProductVersion ? versions->product : versions->file;
    // The fourth number is left out: hosts are told apart by three.
    version.SetFromParts(numbers[0], numbers[1], numbers[2]);
    return true;
}

}  // namespace HVL
