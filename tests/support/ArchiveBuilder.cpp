#include "tests/support/ArchiveBuilder.h"

#include <zlib.h>

#include <stdexcept>
#include <utility>

namespace {

/// Collects fields of a header, lowest byte first.
class Fields {
public:
    Fields& Two(std::size_t value) { return Number(value, 2); }
    Fields& Four(std::size_t value) { return Number(value, 4); }
    Fields& Text(const std::string& text) {
        bytes_ += text;
        return *this;
    }
    [[nodiscard]] const std::string& Bytes() const { return bytes_; }

private:
    Fields& Number(std::size_t value, int length) {
        for (int byte = 0; byte < length; ++byte) {
            bytes_ += static_cast<char>((value >> (8 * byte)) & 0xFF);
        }
        return *this;
    }

    std::string bytes_;
};

std::string Deflated(const std::string& bytes) {
    z_stream stream{};
    if (deflateInit2(&stream, Z_BEST_SPEED, Z_DEFLATED, -MAX_WBITS, 8, Z_DEFAULT_STRATEGY) != Z_OK) {
        throw std::runtime_error("no deflate");
    }
    std::string packed(deflateBound(&stream, static_cast<uLong>(bytes.size())), '\0');
    std::string input = bytes;
    stream.next_in = reinterpret_cast<Bytef*>(input.data());
    stream.avail_in = static_cast<uInt>(input.size());
    stream.next_out = reinterpret_cast<Bytef*>(packed.data());
    stream.avail_out = static_cast<uInt>(packed.size());
    const int result = deflate(&stream, Z_FINISH);
    packed.resize(stream.total_out);
    deflateEnd(&stream);
    if (result != Z_STREAM_END) {
        throw std::runtime_error("deflate did not finish");
    }
    return packed;
}

std::uint32_t Checksum(const std::string& bytes) {
    return static_cast<std::uint32_t>(
        crc32(0, reinterpret_cast<const Bytef*>(bytes.data()), static_cast<uInt>(bytes.size())));
}

/// What both headers of an entry have in common, from the flags to the unpacked size.
std::string SharedFields(const ArchiveEntry& entry, std::size_t packedSize, std::size_t size) {
    constexpr std::size_t kNewYear1980 = 0x00210000;
    return Fields()
        .Two(entry.flags)
        .Two(entry.method)
        .Four(kNewYear1980)
        .Four(entry.claimedChecksum.value_or(Checksum(entry.bytes)))
        .Four(entry.claimedCompressedSize.value_or(static_cast<std::uint32_t>(packedSize)))
        .Four(size)
        .Two(entry.name.size())
        .Bytes();
}

std::string LocalHeader(const ArchiveEntry& entry, std::size_t packedSize, std::size_t claimedSize) {
    return Fields()
        .Four(0x04034b50)
        .Two(20)
        .Text(SharedFields(entry, packedSize, entry.localSize.value_or(static_cast<std::uint32_t>(claimedSize))))
        .Two(0)
        .Text(entry.name)
        .Bytes();
}

std::string DirectoryHeader(const ArchiveEntry& entry, std::size_t packedSize, std::size_t claimedSize,
                            std::size_t offset) {
    return Fields()
        .Four(0x02014b50)
        .Two(20)
        .Two(20)
        .Text(SharedFields(entry, packedSize, claimedSize))
        .Two(0)
        .Two(0)
        .Two(0)
        .Two(0)
        .Four(0)
        .Four(offset)
        .Text(entry.name)
        .Bytes();
}

std::string EndOfDirectory(std::size_t count, std::size_t size, std::size_t offset) {
    return Fields().Four(0x06054b50).Two(0).Two(0).Two(count).Two(count).Four(size).Four(offset).Two(0).Bytes();
}

}  // namespace

ArchiveBuilder& ArchiveBuilder::Add(ArchiveEntry entry) {
    entries_.push_back(std::move(entry));
    return *this;
}

std::string ArchiveBuilder::Bytes() const {
    if (entries_.size() >= 0xFFFF) {
        throw std::runtime_error("too many entries for an archive of this form");
    }
    std::string archive;
    std::string directory;
    for (const ArchiveEntry& entry : entries_) {
        const std::string packed = entry.method == 8 ? Deflated(entry.bytes) : entry.bytes;
        const std::size_t size = entry.claimedSize.value_or(static_cast<std::uint32_t>(entry.bytes.size()));
        directory += DirectoryHeader(entry, packed.size(), size, archive.size());
        archive += LocalHeader(entry, packed.size(), size) + packed;
    }
    return archive + directory + EndOfDirectory(entries_.size(), directory.size(), archive.size());
}
