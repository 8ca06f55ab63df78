#pragma once

#include <string>

namespace HVL::FileUtils {

/// Writes the shell link `linkPath` onto `target`, replacing one that is there; the link of a program shows the
/// program's own icon. Both paths are cut to what the shell's buffers of 260 characters hold. Returns 0, or -1 when the
/// shell refuses; a link that cannot be saved also gets a line on the standard error stream.
[[nodiscard]] int MakeShortcut(const std::string& target, const std::string& linkPath);

}  // namespace HVL::FileUtils
