#pragma once

#include <string>

namespace platform {

/// Makes a folder that every user of the machine may write into, with what is later made in it. A folder that is there
/// keeps its access as it is. Failures are not reported.
///
/// On Windows the group of users gets an entry in the folder's access list. Hosted, everybody on the host gets every
/// right to the folder, and to what is made in it where the host's file system knows default rights; on one that does
/// not, later files have the rights that their makers give them.
void CreateSharedDirectory(const std::string& path);

}  // namespace platform
