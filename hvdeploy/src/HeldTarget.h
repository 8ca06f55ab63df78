#pragma once

#include <memory>

#include "platform/filesystem.h"
#include "platform/held_folder.h"

namespace HV {

/// The folder that something is placed into or taken out of, kept where it is meanwhile.
///
/// Folders for everybody are among the targets, and whoever may write there may leave a link that leads elsewhere. What
/// is placed never goes through a link of somebody who has no say over that other place.
class HeldTarget {
public:
    /// Holds `folder`, or the nearest one above it that is there, in place of what was held before. Nothing is done
    /// where that is held already. False, with a line in the log, when a link on the way there is not to be trusted.
    bool HoldNearest(const fs::path& folder);

private:
    fs::path path_;
    std::unique_ptr<platform::HeldFolder> held_;
};

}  // namespace HV
