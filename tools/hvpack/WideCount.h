#pragma once

#include <cstdint>

#include "platform/filesystem.h"

namespace HVPack {

/// The number of entries from which on the end of an archive's directory cannot tell it.
inline constexpr std::uint64_t kCountThatDoesNotFit = 0xFFFF;

/// Adds, before the end of a finished archive, the records that hold the number of entries in a wider field.
///
/// The library writes them only for archives beyond 4 GB; without them other programs take the directory for damaged.
/// The archive ends in the plain end of a directory, without a comment. False when the file cannot be changed.
[[nodiscard]] bool AddWideCount(const fs::path& archive, std::uint64_t count);

}  // namespace HVPack
