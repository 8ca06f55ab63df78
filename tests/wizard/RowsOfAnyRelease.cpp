// A validation table that trusts whatever lies in the folder `packages` beside the program, so that a test can write
// its own release. Nothing else of such a wizard differs from the one that ships.
#include <deque>
#include <vector>

#include "hvframework/FileUtils.h"
#include "installer/StartUp.h"
#include "package/ValidationTable.h"
#include "platform/filesystem.h"

namespace {

using namespace HVL;

struct Release {
    Release() {
        for (const fs::directory_entry& entry : fs::directory_iterator(fs::path(HV::PackagesDirectoryPath()))) {
            const std::string& name = texts.emplace_back(entry.path().filename().string());
            const std::string& md5 = texts.emplace_back(FileUtils::GetFileMD5(entry.path().string()));
            rows.push_back({name, "None", "", "", md5});
        }
    }

    std::deque<std::string> texts;
    std::vector<HV::ValidationRow> rows;
};

}  // namespace

std::span<const HV::ValidationRow> HV::ValidationRows() {
    static const Release release;
    return release.rows;
}
