#pragma once

#include <string>
#include <utility>

#include "platform/held_folder.h"
#include "platform/hosted/held_folders.h"
#include "platform/hosted/host_file.h"

namespace hosted {

/// A folder that is held by being open: what lies below it is reached through its descriptor.
class HostFolder : public platform::HeldFolder {
public:
    /// `hostPath` is the folder's own name on the host.
    HostFolder(std::string path, const std::string& hostPath, Descriptor folder)
        : path_(std::move(path)), folder_(std::move(folder)) {
        HeldFolders::All().Add(hostPath, folder_.Get());
    }
    ~HostFolder() override { HeldFolders::All().Remove(folder_.Get()); }

    [[nodiscard]] const std::string& Path() const override { return path_; }

private:
    std::string path_;
    Descriptor folder_;
};

}  // namespace hosted
