// A validation table that trusts whatever lies in the folder `packages` beside the program, so that a test can write
// its own release. Nothing else of such a wizard differs from the one that ships.
#include <deque>
#include <vector>

#include "installer/StartUp.h"
#include "package/HeldFile.h"
#include "package/ValidationTable.h"
#include "platform/filesystem.h"

namespace {

struct Release {
    Release() {
        for (const fs::directory_entry& entry : fs::directory_iterator(fs::path(HV::PackagesDirectoryPath()))) {
            const std::string& name = texts.emplace_back(entry.path().filename().string());
            const HV::FileDigests found = HV::HeldFile(entry.path()).Digests();
            rows.push_back({name, "None", "", "", texts.emplace_back(found.md5)});
            digests.push_back({name, texts.emplace_back(found.sha256)});
        }
    }

    std::deque<std::string> texts;
    std::vector<HV::ValidationRow> rows;
    std::vector<HV::ReleaseDigest> digests;
};

const Release& TheRelease() {
    static const Release release;
    return release;
}

}  // namespace

std::span<const HV::ValidationRow> HV::ValidationRows() {
    return TheRelease().rows;
}

std::span<const HV::ReleaseDigest> HV::ReleaseDigests() {
    return TheRelease().digests;
}
