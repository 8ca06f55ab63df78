#pragma once

#include <cstdint>
#include <string>

namespace hosted {

/// What a shell link says of its target. Paths are Windows paths.
struct LinkFile {
    std::wstring target;
    std::wstring description;
    std::wstring icon;             ///< The file whose first icon is shown; empty: the target's own.
    std::uint32_t attributes = 0;  ///< Of the target, as Windows numbers them; 0 when it does not exist.
    std::uint32_t size = 0;        ///< Of the target, its lower 32 bits.
};

inline constexpr std::uint32_t AttributeDirectory = 0x10;
inline constexpr std::uint32_t AttributeArchive = 0x20;

/// The bytes of the link file, in Microsoft's published format for shell links ([MS-SHLLINK]): the target once as a
/// list of shell items (for an absolute path on a drive only) and once as a local path, the texts in UTF-16. All times
/// in it are "not set", so that equal links are equal files. Texts of more than some 16,000 characters do not fit the
/// format; the caller keeps them shorter.
std::string LinkFileBytes(const LinkFile& link);

}  // namespace hosted
