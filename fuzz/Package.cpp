// A package from anywhere: opened, validated, extracted, and its payloads' paths worked out.
#include "package/Package.h"

#include <vector>

#include "fuzz/Fuzzing.h"

namespace {

constexpr const char* kPackage = R"(C:\package.zip)";
constexpr const char* kOutside = R"(C:\outside)";
constexpr const char* kDestination = R"(C:\outside\in\here)";

void FindPayloads(const HV::Package& package) {
    for (const HV::Payload& payload : package.manifest.payloads) {
        std::vector<HV::PayloadPathPair> pairs;
        try {
            package.GetPayloadPaths(R"(C:\destination)", payload, pairs);
        } catch (const fs::filesystem_error&) {
            // The folder of a wildcard is not there.
        }
    }
}

/// Only what is below the destination may have come into being.
void LookForEscapes(std::size_t itemsOfDrive) {
    fuzzing::Demand(fuzzing::CountItems(kOutside) <= 1, "nothing is extracted two folders up");
    fuzzing::Demand(fuzzing::CountItems(R"(C:\outside\in)") <= 1, "nothing is extracted one folder up");
    fuzzing::RemoveFolder(kOutside);
    fuzzing::Demand(fuzzing::CountItems(R"(C:\)") == itemsOfDrive, "nothing is extracted into the drive's root");
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzzing::UseThrowAwayMachine();
    fuzzing::WriteFile(kPackage, fuzzing::Text(data, size));
    const std::size_t itemsOfDrive = fuzzing::CountItems(R"(C:\)");
    HV::Package package{fs::path(kPackage)};
    // An unsound package is extracted all the same: extraction must not lean on what validation has seen.
    static_cast<void>(package.Validate(false));
    if (package.ExtractTo(kDestination)) {
        FindPayloads(package);
    }
    LookForEscapes(itemsOfDrive);
    return 0;
}
