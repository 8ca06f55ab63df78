#include "platform/shared_directory.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/xattr.h>

#include <cstdint>
#include <string_view>

#include "platform/hosted/host_file.h"
#include "platform/hosted/machine.h"

namespace platform {
namespace {

using hosted::Machine;

constexpr mode_t kEverything = 0777;

/// The rights that the host gives to whatever is made in a folder, in the form in which its file systems take them:
/// a version, and an entry each for the owner, the group and the others.
constexpr const char* kDefaultRights = "system.posix_acl_default";
struct RightsEntry {
    std::uint16_t tag;
    std::uint16_t rights;
    std::uint32_t id;
};
struct Rights {
    std::uint32_t version;
    RightsEntry entries[3];
};
constexpr std::uint32_t kNobodyInParticular = 0xFFFFFFFF;
constexpr Rights kEverythingToEverybody{
    2, {{0x01, 7, kNobodyInParticular}, {0x04, 7, kNobodyInParticular}, {0x20, 7, kNobodyInParticular}}};

}  // namespace

void CreateSharedDirectory(const std::string& path) {
    const std::string hostPath = Machine::Current().HostPath(std::string_view(path));
    if (Machine::Current().GetFaults().Check(hosted::Operation::Create, hostPath) != 0 ||
        mkdir(hostPath.c_str(), kEverything) != 0) {
        return;
    }
    const hosted::Descriptor folder(open(hostPath.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (folder.IsOpen() && fchmod(folder.Get(), kEverything) == 0) {
        // A file system without default rights refuses; the folder itself is open all the same.
        fsetxattr(folder.Get(), kDefaultRights, &kEverythingToEverybody, sizeof kEverythingToEverybody, 0);
    }
}

}  // namespace platform
