#pragma once

#include <cstddef>
#include <string>

/// What the names of an archive's entries mean to Windows, asked on either target.
namespace HV {

/// Room for an entry's name, with the zero that ends it. Longer names cannot be unpacked.
inline constexpr std::size_t kEntryNameRoom = 260;

/// Whether an entry of this name lands below the directory that it is unpacked to, under a name that Windows can give a
/// file: no step up, no drive or stream, no leading separator, no device, no character that names cannot have, no
/// component beyond 255 characters, and none with an end that the system drops.
[[nodiscard]] bool IsSafeEntryName(const std::string& name);

/// The path of the file or folder that an entry becomes: separated by `/`, without a separator at the end and without
/// components that mean nothing.
[[nodiscard]] std::string EntryPath(const std::string& name);

/// The same path as Windows knows it, with one spelling for all that it takes for one: in upper case.
[[nodiscard]] std::string EntryNameOnWindows(const std::string& name);

}  // namespace HV
