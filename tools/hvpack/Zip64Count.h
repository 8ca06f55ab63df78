#pragma once

#include <cstdint>

#include "platform/filesystem.h"

namespace HVPack {

/// Adds, before the end of a finished archive, the Zip64 records, whose field for the number of entries is wider.
///
/// The library writes them only for archives beyond 4 GB; without them other programs take the directory for damaged.
/// The archive ends in the plain end of a directory, without a comment. False when the file cannot be changed.
[[nodiscard]] bool AddZip64Count(const fs::path& archive, std::uint64_t count);

}  // namespace HVPack
