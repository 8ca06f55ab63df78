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
    Fields& Eight(std::size_t value) { return Number(value, 8); }
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

std::uint32_t Checksum(const std::string& bytes) {
    return static_cast<std::uint32_t>(
        crc32(0, reinterpret_cast<const Bytef*>(bytes.data()), static_cast<uInt>(bytes.size())));
}

constexpr std::size_t kInWideField = 0xFFFFFFFF;

/// What the directory tells of an entry.
struct Told {
    std::size_t packedSize;
    std::size_t size;
    std::size_t offset;
};

/// What both headers of an entry have in common, from the flags to the length of its name.
std::string SharedFields(const ArchiveEntry& entry, const std::string& name, std::size_t packedSize, std::size_t size) {
    constexpr std::size_t kNewYear1980 = 0x00210000;
    return Fields()
        .Two(entry.flags)
        .Two(entry.method)
        .Four(kNewYear1980)
        .Four(entry.claimedChecksum.value_or(Checksum(entry.bytes)))
        .Four(packedSize)
        .Four(size)
        .Two(name.size())
        .Bytes();
}

std::string LocalHeader(const ArchiveEntry& entry, const Told& told) {
    const std::string name = entry.localName.value_or(entry.name);
    const std::size_t size = entry.localSize.value_or(static_cast<std::uint32_t>(told.size));
    return Fields()
        .Four(0x04034b50)
        .Two(20)
        .Text(SharedFields(entry, name, told.packedSize, size))
        .Two(entry.localExtra.size())
        .Text(name)
        .Text(entry.localExtra)
        .Bytes();
}

std::string WideFields(const Told& told) {
    return Fields().Two(1).Two(24).Eight(told.size).Eight(told.packedSize).Eight(told.offset).Bytes();
}

std::string DirectoryHeader(const ArchiveEntry& entry, const Told& told) {
    const std::string extra = entry.wide ? WideFields(told) : "";
    return Fields()
        .Four(0x02014b50)
        .Two(20)
        .Two(20)
        .Text(SharedFields(entry, entry.name, entry.wide ? kInWideField : told.packedSize,
                           entry.wide ? kInWideField : told.size))
        .Two(extra.size())
        .Two(0)
        .Two(0)
        .Two(0)
        .Four(0)
        .Four(entry.wide ? kInWideField : told.offset)
        .Text(entry.name)
        .Text(extra)
        .Bytes();
}

std::string EndOfDirectory(std::size_t count, std::size_t size, std::size_t offset) {
    return Fields().Four(0x06054b50).Two(0).Two(0).Two(count).Two(count).Four(size).Four(offset).Two(0).Bytes();
}

std::string Packed(const ArchiveEntry& entry) {
    return entry.packed.value_or(entry.method == 8 ? PackedBytes(entry.bytes) : entry.bytes);
}

}  // namespace

ArchiveBuilder& ArchiveBuilder::Add(ArchiveEntry entry) {
    entries_.push_back(std::move(entry));
    return *this;
}

ArchiveBuilder& ArchiveBuilder::ClaimCount(std::uint16_t count) {
    claimedCount_ = count;
    return *this;
}

std::string ArchiveBuilder::Bytes() const {
    if (entries_.size() >= 0xFFFF) {
        throw std::runtime_error("too many entries for an archive of this form");
    }
    std::string archive;
    std::string directory;
    for (const ArchiveEntry& entry : entries_) {
        const std::string packed = Packed(entry);
        const Told told{entry.claimedCompressedSize.value_or(packed.size()),
                        entry.claimedSize.value_or(entry.bytes.size()), entry.headerAt.value_or(archive.size())};
        directory += DirectoryHeader(entry, told);
        if (!entry.headerAt) {
            archive += LocalHeader(entry, told) + packed;
        }
    }
    return archive + directory +
           EndOfDirectory(claimedCount_.value_or(static_cast<std::uint16_t>(entries_.size())), directory.size(),
                          archive.size());
}

std::string PackedBytes(const std::string& bytes) {
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
