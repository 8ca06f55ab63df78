#include "platform/guarded_folder.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <cerrno>

#include "platform/hosted/host_folder.h"
#include "platform/hosted/machine.h"

namespace platform {
namespace {

using hosted::Descriptor;
using hosted::HeldFolders;
using hosted::Machine;
using Stat = struct stat;

constexpr mode_t kForAllToRead = 0755;

Descriptor OpenFolder(const std::string& hostPath) {
    return Descriptor(open(hostPath.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
}

bool IsOwn(const Stat& found) {
    return found.st_uid == 0 || found.st_uid == geteuid();
}

/// Rights that the host hands on to what is made in a folder, and those of single accounts, go too.
bool TakeOver(int folder) {
    fremovexattr(folder, "system.posix_acl_default");
    fremovexattr(folder, "system.posix_acl_access");
    return fchown(folder, geteuid(), getegid()) == 0 && fchmod(folder, kForAllToRead) == 0;
}

Guarding NoFolderAt(const std::string& hostPath) {
    Stat found{};
    if (lstat(hostPath.c_str(), &found) != 0) {
        return errno == ENOENT || errno == ENOTDIR ? Guarding::Missing : Guarding::Failed;
    }
    if (!S_ISLNK(found.st_mode)) {
        return Guarding::Failed;
    }
    return IsOwn(found) ? Guarding::Linked : Guarding::Planted;
}

std::unique_ptr<HeldFolder> Held(const std::string& path, const std::string& hostPath, Descriptor folder) {
    return std::make_unique<hosted::HostFolder>(path, HeldFolders::All().Back(hostPath), std::move(folder));
}

}  // namespace

bool CanGuardFolders() {
    return geteuid() == 0;
}

std::unique_ptr<HeldFolder> GuardFolder(const std::string& path, Guarding& outcome) {
    const std::string hostPath = Machine::Current().HostPath(path);
    Descriptor folder = OpenFolder(hostPath);
    if (!folder.IsOpen()) {
        outcome = NoFolderAt(hostPath);
        return nullptr;
    }
    outcome = TakeOver(folder.Get()) ? Guarding::Done : Guarding::Failed;
    return outcome == Guarding::Done ? Held(path, hostPath, std::move(folder)) : nullptr;
}

std::unique_ptr<HeldFolder> MakeGuardedFolder(const std::string& path, NoFolder& reason) {
    const std::string hostPath = Machine::Current().HostPath(path);
    reason = NoFolder::Failed;
    if (Machine::Current().GetFaults().Check(hosted::Operation::Create, hostPath) != 0) {
        return nullptr;
    }
    if (mkdir(hostPath.c_str(), kForAllToRead) != 0) {
        reason = errno == EEXIST ? NoFolder::Taken : NoFolder::Failed;
        return nullptr;
    }
    Descriptor folder = OpenFolder(hostPath);
    Stat found{};
    if (!folder.IsOpen() || fstat(folder.Get(), &found) != 0 || !IsOwn(found) || !TakeOver(folder.Get())) {
        // Somebody was quicker, and has taken the name since.
        reason = NoFolder::Taken;
        return nullptr;
    }
    return Held(path, hostPath, std::move(folder));
}

bool IsPlanted(const std::string& path) {
    Stat found{};
    if (lstat(Machine::Current().HostPath(path).c_str(), &found) != 0) {
        return errno != ENOENT && errno != ENOTDIR;
    }
    // A link's own mode says nothing: it cannot be written.
    const bool isLink = S_ISLNK(found.st_mode);
    return !IsOwn(found) || found.st_nlink > 1 || (!isLink && (found.st_mode & S_IWOTH) != 0);
}

}  // namespace platform
