#include "hvdeploy/src/HeldTarget.h"

#include "hvframework/Log.h"

namespace HV {
namespace {

fs::path Nearest(fs::path folder) {
    boost::system::error_code error;
    while (!fs::is_directory(folder, error) && folder.has_parent_path() && folder.parent_path() != folder) {
        folder = folder.parent_path();
    }
    return folder;
}

}  // namespace

bool HeldTarget::HoldNearest(const fs::path& folder) {
    if (held_ && folder == path_) {
        // It is there as long as it is held: a folder of many files is asked for once.
        return true;
    }
    const fs::path nearest = Nearest(folder);
    if (held_ && nearest == path_) {
        return true;
    }
    std::string planted;
    // A folder that cannot be held, as a drive that somebody shares, is used all the same.
    held_ = platform::HoldFolder(nearest.string(), planted);
    path_ = nearest;
    if (!planted.empty()) {
        HVL_LOG(Error, "refusing to go through the link at " << planted << " to " << folder
                                                             << ": whoever made it is no administrator");
        return false;
    }
    return true;
}

}  // namespace HV
