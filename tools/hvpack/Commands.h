#pragma once

#include <ostream>
#include <string>
#include <vector>

namespace HVPack {

/// The program hvpack without its process: makes, checks and lists packages, and writes the table of a release.
///
/// `arguments` are those after the program's name. Results go to `out`, one line each; everything that went wrong, the
/// engine's own lines included, and warnings go to `err`. Returns the exit status: 0, or 1 when anything went
/// wrong or the arguments are not understood; a warning is nothing wrong. Logging of the category "hvdeploy-detail" is
/// redirected to `err` while it runs.
[[nodiscard]] int RunCommand(const std::vector<std::string>& arguments, std::ostream& out, std::ostream& err);

}  // namespace HVPack
