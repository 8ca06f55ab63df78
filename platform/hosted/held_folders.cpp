#include "platform/hosted/held_folders.h"

#include <unistd.h>

namespace hosted {
namespace {

bool IsBelow(const std::string& path, const std::string& folder) {
    return path.size() > folder.size() && path[folder.size()] == '/' && path.compare(0, folder.size(), folder) == 0;
}

}  // namespace

HeldFolders& HeldFolders::All() {
    static HeldFolders all;
    return all;
}

void HeldFolders::Add(std::string hostPath, int descriptor) {
    const std::lock_guard guard(mutex_);
    // By the number of the process and not as "self": a script is another process.
    folders_.push_back(
        {std::move(hostPath), descriptor, "/proc/" + std::to_string(getpid()) + "/fd/" + std::to_string(descriptor)});
    ++count_;
}

void HeldFolders::Remove(int descriptor) {
    const std::lock_guard guard(mutex_);
    std::erase_if(folders_, [&](const Held& held) { return held.descriptor == descriptor; });
    count_ = static_cast<int>(folders_.size());
}

std::string HeldFolders::Through(std::string hostPath) const {
    if (count_ == 0) {
        return hostPath;
    }
    const std::lock_guard guard(mutex_);
    const Held* nearest = nullptr;
    for (const Held& held : folders_) {
        if (IsBelow(hostPath, held.hostPath) &&
            (nearest == nullptr || held.hostPath.size() > nearest->hostPath.size())) {
            nearest = &held;
        }
    }
    if (nearest == nullptr) {
        return hostPath;
    }
    return nearest->openName + hostPath.substr(nearest->hostPath.size());
}

std::string HeldFolders::Back(std::string hostPath) const {
    const std::lock_guard guard(mutex_);
    for (const Held& held : folders_) {
        if (IsBelow(hostPath, held.openName)) {
            return held.hostPath + hostPath.substr(held.openName.size());
        }
    }
    return hostPath;
}

}  // namespace hosted
