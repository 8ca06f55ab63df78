#pragma once

#include <string>

namespace HVL::FileUtils {

/// Writes the shell link `linkPath` onto `target`, replacing one that is there; the link of a program shows the
/// program's own icon. The target need not exist. Returns 0, or -1 when the shell refuses, and also when a path does
/// not fit the shell's buffers of 260 characters, terminator included: a path that is cut would name something else.
/// A link that cannot be saved also gets a line on the standard error stream. A failure leaves no new link.
[[nodiscard]] int MakeShortcut(const std::string& target, const std::string& linkPath);

}  // namespace HVL::FileUtils
