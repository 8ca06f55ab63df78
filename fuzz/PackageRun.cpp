#include "fuzz/PackageRun.h"

#include <vector>

#include "fuzz/Fuzzing.h"
#include "package/Package.h"

namespace fuzzing {
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
    Demand(CountItems(kOutside) <= 1, "nothing is extracted two folders up");
    Demand(CountItems(R"(C:\outside\in)") <= 1, "nothing is extracted one folder up");
    RemoveFolder(kOutside);
    Demand(CountItems(R"(C:\)") == itemsOfDrive, "nothing is extracted into the drive's root");
}

}  // namespace

void UsePackage(const std::string& bytes) {
    UseThrowAwayMachine();
    WriteFile(kPackage, bytes);
    const std::size_t itemsOfDrive = CountItems(R"(C:\)");
    HV::Package package{fs::path(kPackage)};
    // An unsound package is extracted all the same: extraction must not lean on what validation has seen.
    static_cast<void>(package.Validate(false));
    if (package.ExtractTo(kDestination)) {
        FindPayloads(package);
    }
    LookForEscapes(itemsOfDrive);
}

}  // namespace fuzzing
