#include "platform/held_folder.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>

#include "platform/hosted/host_folder.h"
#include "platform/hosted/machine.h"
#include "platform/utf8.h"

namespace platform {
namespace {

using hosted::Descriptor;
using hosted::HeldFolders;
using hosted::Machine;

/// Goes down from one folder to the next, each opened in the one before: what is looked at is what is entered.
class WayDown {
public:
    explicit WayDown(const char* start) : folder_(open(start, O_PATH | O_DIRECTORY | O_CLOEXEC)) {}

    enum class Step { Entered, Planted, Nothing };
    Step Enter(const std::string& name) {
        struct stat found {};
        if (fstatat(folder_.Get(), name.c_str(), &found, AT_SYMLINK_NOFOLLOW) != 0) {
            return Step::Nothing;
        }
        const bool link = S_ISLNK(found.st_mode);
        if (link && found.st_uid != 0 && found.st_uid != geteuid()) {
            return Step::Planted;
        }
        const int flags = O_PATH | O_DIRECTORY | O_CLOEXEC | (link ? 0 : O_NOFOLLOW);
        folder_ = Descriptor(openat(folder_.Get(), name.c_str(), flags));
        return folder_.IsOpen() ? Step::Entered : Step::Nothing;
    }

    /// The folder for whoever wants to look into it.
    [[nodiscard]] Descriptor Open() const {
        return Descriptor(openat(folder_.Get(), ".", O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    }

private:
    Descriptor folder_;
};

/// Whoever may rename in the parent can have put a folder of his own there since.
bool IsPrivate(int descriptor) {
    struct stat found {};
    return fstat(descriptor, &found) == 0 && found.st_uid == geteuid() && (found.st_mode & (S_IRWXG | S_IRWXO)) == 0;
}

}  // namespace

std::unique_ptr<HeldFolder> MakePrivateFolder(const std::string& path, NoFolder& reason) {
    const std::string hostPath = Machine::Current().HostPath(path);
    reason = NoFolder::Failed;
    if (Machine::Current().GetFaults().Check(hosted::Operation::Create, hostPath) != 0) {
        return nullptr;
    }
    if (mkdir(hostPath.c_str(), S_IRWXU) != 0) {
        reason = errno == EEXIST ? NoFolder::Taken : NoFolder::Failed;
        return nullptr;
    }
    Descriptor folder(open(hostPath.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
    if (!folder.IsOpen() || !IsPrivate(folder.Get())) {
        // Somebody was quicker, and has taken the name since.
        reason = NoFolder::Taken;
        return nullptr;
    }
    return std::make_unique<hosted::HostFolder>(path, hostPath, std::move(folder));
}

std::unique_ptr<HeldFolder> HoldFolder(const std::string& path, std::string& planted) {
    const Machine& machine = Machine::Current();
    const std::string hostPath = HeldFolders::All().Back(machine.HostPath(path));
    planted.clear();
    // Links above the machine's own drive are the host's business.
    const std::string drive = machine.Folder() + "/drive_c";
    const bool onDrive = hostPath.compare(0, drive.size(), drive) == 0;
    const std::size_t start = onDrive ? drive.size() : 0;
    WayDown way(onDrive ? drive.c_str() : hostPath.starts_with('/') ? "/" : ".");
    for (std::size_t at = start; at < hostPath.size();) {
        const std::size_t from = hostPath[at] == '/' ? at + 1 : at;
        const std::size_t end = std::min(hostPath.find('/', from), hostPath.size());
        const auto step = end == from ? WayDown::Step::Entered : way.Enter(hostPath.substr(from, end - from));
        if (step == WayDown::Step::Planted) {
            planted = Utf8FromWide(machine.WindowsPath(hostPath.substr(0, end)));
        }
        if (step != WayDown::Step::Entered) {
            return nullptr;
        }
        at = end;
    }
    Descriptor folder = way.Open();
    return folder.IsOpen() ? std::make_unique<hosted::HostFolder>(path, hostPath, std::move(folder)) : nullptr;
}

std::unique_ptr<HeldFolder> HoldOwnFolder(const std::string& path, bool& isLink) {
    const std::string hostPath = Machine::Current().HostPath(path);
    Descriptor folder(open(hostPath.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
    struct stat found {};
    isLink = !folder.IsOpen() && lstat(hostPath.c_str(), &found) == 0 && S_ISLNK(found.st_mode);
    return folder.IsOpen()
               ? std::make_unique<hosted::HostFolder>(path, HeldFolders::All().Back(hostPath), std::move(folder))
               : nullptr;
}

}  // namespace platform
