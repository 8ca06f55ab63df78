#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

/// One entry of an archive, true or lying. What is not set is told as it is.
struct ArchiveEntry {
    std::string name = {};
    std::string bytes = {};
    std::uint16_t method = 8;  // deflate; 0 stores; anything else stores under a false name
    std::uint16_t flags = 0;
    std::optional<std::uint64_t> claimedSize = std::nullopt;            // unpacked, in both headers
    std::optional<std::uint64_t> claimedCompressedSize = std::nullopt;  // in both headers
    std::optional<std::uint32_t> claimedChecksum = std::nullopt;        // in both headers
    std::optional<std::uint32_t> localSize = std::nullopt;              // unpacked, in the entry's own header alone
    std::optional<std::string> localName = std::nullopt;                // in the entry's own header alone
    std::string localExtra = {};                                        // between the own header and the bytes
    std::optional<std::string> packed = std::nullopt;                   // in place of the packed bytes
    std::optional<std::size_t> headerAt = std::nullopt;  // has no header and bytes of its own, but those at this place
    bool wide = false;                                   // sizes and place in the fields for large archives
};

/// Makes the bytes of a zip archive, entry by entry, without the libraries that read and write archives in the product:
/// a test can claim anything in it.
class ArchiveBuilder {
public:
    ArchiveBuilder& Add(ArchiveEntry entry);

    /// What the end of the directory says, in place of the number of entries.
    ArchiveBuilder& ClaimCount(std::uint16_t count);

    /// The archive with its directory. The same entries give the same bytes.
    [[nodiscard]] std::string Bytes() const;

private:
    std::vector<ArchiveEntry> entries_;
    std::optional<std::uint16_t> claimedCount_;
};

/// The bytes as an entry holds them that is deflated.
std::string PackedBytes(const std::string& bytes);
