#pragma once

#include <atomic>
#include <mutex>
#include <string>
#include <vector>

namespace hosted {

/// The folders that this process holds (platform/held_folder.h). A name below one of them is reached through the open
/// folder, in a form that the scripts which this process starts can use as well. Thread-safe.
class HeldFolders {
public:
    static HeldFolders& All();

    /// `hostPath` is the folder's name, `descriptor` the folder. The descriptor stays the caller's.
    void Add(std::string hostPath, int descriptor);
    void Remove(int descriptor);

    /// The name by which `hostPath` is to be reached: another one only where it lies below a folder that is held.
    [[nodiscard]] std::string Through(std::string hostPath) const;
    /// The folder's own name for what Through() gave; any other name as it stands.
    [[nodiscard]] std::string Back(std::string hostPath) const;

private:
    struct Held {
        std::string hostPath;
        int descriptor;
        std::string openName;  // by which everybody reaches what lies in the folder
    };

    std::atomic<int> count_{0};
    mutable std::mutex mutex_;
    std::vector<Held> folders_;
};

}  // namespace hosted
