#include "platform/removal.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "platform/hosted/host_file.h"
#include "platform/hosted/ignoring_case.h"
#include "platform/hosted/machine.h"

namespace platform {
namespace {

using hosted::Machine;
using hosted::Operation;

bool Fails(const std::string& hostPath) {
    return Machine::Current().GetFaults().Check(Operation::Delete, hostPath) != 0;
}

/// Windows deletes no read-only file and none that is open, whoever asks; the host would. `hostPath` is for the
/// machine's faults, which are asked between.
bool MayDelete(int parent, const char* name, const struct stat& found, const std::string& hostPath) {
    const bool isFile = S_ISREG(found.st_mode);
    if ((isFile && hosted::IsReadOnly(found)) || Fails(hostPath)) {
        return false;
    }
    const std::string open = parent == AT_FDCWD ? name : "/proc/self/fd/" + std::to_string(parent) + "/" + name;
    return !isFile || !hosted::IsOpenSomewhere(open);
}

struct StreamCloser {
    void operator()(DIR* stream) const { closedir(stream); }
};
using Stream = std::unique_ptr<DIR, StreamCloser>;

/// Null where `name` in the folder `parent` is no folder, or has become a link.
Stream OpenFolder(int parent, const char* name) {
    const int descriptor = openat(parent, name, O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC);
    Stream stream(descriptor < 0 ? nullptr : fdopendir(descriptor));
    if (stream == nullptr && descriptor >= 0) {
        close(descriptor);
    }
    return stream;
}

/// What lies in the folder, in the order in which Windows lists it: a deletion that stops half-way leaves the same
/// there.
std::vector<std::string> NamesIn(DIR* folder) {
    std::vector<std::string> names;
    while (const dirent* entry = readdir(folder)) {
        const std::string_view name(entry->d_name);
        if (name != "." && name != "..") {
            names.emplace_back(name);
        }
    }
    std::sort(names.begin(), names.end(), hosted::LessIgnoringCase());
    return names;
}

/// Removes `name` from the open folder `parent`. `hostPath` is what it is called, for the machine's faults.
bool RemoveIn(int parent, const char* name, const std::string& hostPath);

bool EmptyFolder(int parent, const char* name, const std::string& hostPath) {
    const Stream folder = OpenFolder(parent, name);
    if (folder == nullptr) {
        return false;
    }
    const std::vector<std::string> names = NamesIn(folder.get());
    return std::all_of(names.begin(), names.end(), [&](const std::string& item) {
        return RemoveIn(dirfd(folder.get()), item.c_str(), hostPath + "/" + item);
    });
}

bool RemoveIn(int parent, const char* name, const std::string& hostPath) {
    struct stat found {};
    if (fstatat(parent, name, &found, AT_SYMLINK_NOFOLLOW) != 0) {
        return false;
    }
    if (!S_ISDIR(found.st_mode)) {
        return MayDelete(parent, name, found, hostPath) && unlinkat(parent, name, 0) == 0;
    }
    return EmptyFolder(parent, name, hostPath) && !Fails(hostPath) && unlinkat(parent, name, AT_REMOVEDIR) == 0;
}

}  // namespace

int RemoveTree(const std::string& path) {
    const std::string hostPath = Machine::Current().HostPath(path);
    struct stat found {};
    if (lstat(hostPath.c_str(), &found) != 0) {
        return 0;
    }
    return RemoveIn(AT_FDCWD, hostPath.c_str(), hostPath) ? 0 : -1;
}

}  // namespace platform
