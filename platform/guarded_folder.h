#pragma once

#include <memory>
#include <string>

#include "platform/held_folder.h"

/// Folders that every account of the computer may read, and administrators alone may change.
///
/// On Windows such a folder is the administrators', and its access list, which takes nothing over from the folder
/// above, has everything for them and the system, and reading for the users; hosted it is root's, of mode 0755. What is
/// made in it later is for the same. What is in it already keeps its own list: to change that would mean to go by names
/// that somebody else may have made, second names of the system's own files among them.
namespace platform {

/// Whether this program may have such folders: on Windows with an administrator's rights, hosted as root.
[[nodiscard]] bool CanGuardFolders();

/// What became of a folder that was to be taken over.
enum class Guarding {
    Done,
    Missing,
    Planted,  ///< There is a link in its place that an administrator has not made. It is not followed.
    Linked,   ///< There is an administrator's link. Where that leads is as he has left it.
    Failed    ///< There is no folder of that name, or its volume keeps no owners.
};

/// Takes the folder at `path` over, whoever has made it, and holds it. Null unless `outcome` is Done.
std::unique_ptr<HeldFolder> GuardFolder(const std::string& path, Guarding& outcome);

/// Makes such a folder, and holds it. It is one from its first moment on. Null as with MakePrivateFolder().
std::unique_ptr<HeldFolder> MakeGuardedFolder(const std::string& path, NoFolder& reason);

/// Whether the file or link at `path` may be the work of somebody with fewer rights: its owner is neither an
/// administrator, the system, TrustedInstaller nor this account (hosted: root nor this account), it has a second name
/// somewhere, or everybody may write it. So it is where that cannot be told. False when nothing is there.
[[nodiscard]] bool IsPlanted(const std::string& path);

}  // namespace platform
