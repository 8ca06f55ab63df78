#pragma once

#include <string>

namespace platform {

/// Removes the item at `path`: a file, a link (and not what it names), or a folder with all that is in it.
///
/// A folder is opened as itself, looked at once more, and what is in it is reached through that opening alone: one that
/// becomes a link meanwhile, or changes places with one, leads nowhere else. Entries go in the listing's order. Returns
/// 0, also when there is nothing at `path`, and -1 at the first item that cannot be removed, which ends it. A read-only
/// file cannot.
int RemoveTree(const std::string& path);

}  // namespace platform
