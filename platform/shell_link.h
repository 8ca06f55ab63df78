#pragma once

#include <string>

namespace platform {

/// A link of the shell onto a file or a folder, which need not exist.
struct ShellLink {
    std::string target;
    std::string description;
    bool showsIconOfTarget = false;  ///< The first one in the target's file.
};

/// How far the saving of a link has come.
enum class ShellLinkResult { Saved, NoLink, NoFile, NotSaved };

/// Writes the link as the file `path`, in place of one that is there.
///
/// NoLink when the shell makes none, or the target does not fit its buffer of 260 characters, terminator included;
/// NoFile when the shell has no way to save it; NotSaved when it cannot be written, or `path` does not fit such a
/// buffer. A failure leaves no new file. Hosted the file is our own writing, in the form that the shell reads.
[[nodiscard]] ShellLinkResult SaveShellLink(const ShellLink& link, const std::string& path);

}  // namespace platform
