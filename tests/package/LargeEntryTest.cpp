// An entry beyond 2 GB, which takes as much memory and disk while it is unpacked: a program of its own.
#include <gtest/gtest.h>
#include <zlib.h>

#include <cstdio>

#include "package/ZipEntries.h"
#include "platform/filesystem.h"
#include "platform/win32.h"
#include "tests/support/ArchiveBuilder.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"

namespace {

constexpr std::size_t kStretch = std::size_t{1} << 20;
constexpr std::size_t kStretches = 2048;
const std::string kPath = R"(C:\a.zip)";
const std::string kFile = R"(C:\out\large)";

std::string Deflated(z_stream& stream, std::string& bytes, int flush) {
    std::string packed(bytes.size() + 1000, '\0');
    stream.next_in = reinterpret_cast<Bytef*>(bytes.data());
    stream.avail_in = static_cast<uInt>(bytes.size());
    stream.next_out = reinterpret_cast<Bytef*>(packed.data());
    stream.avail_out = static_cast<uInt>(packed.size());
    EXPECT_GE(deflate(&stream, flush), Z_OK);
    packed.resize(packed.size() - stream.avail_out);
    return packed;
}

/// One stretch of zeros that leans on nothing before it, again and again, and "end". Made of 2 GB, but not from them.
ArchiveEntry LargeEntry() {
    std::string zeros(kStretch, '\0');
    std::string end = "end";
    z_stream stream{};
    EXPECT_EQ(deflateInit2(&stream, Z_BEST_SPEED, Z_DEFLATED, -MAX_WBITS, 8, Z_DEFAULT_STRATEGY), Z_OK);
    const std::string stretch = Deflated(stream, zeros, Z_FULL_FLUSH);
    const std::string last = Deflated(stream, end, Z_FINISH);
    deflateEnd(&stream);
    const uLong stretchSum = crc32(0, reinterpret_cast<const Bytef*>(zeros.data()), kStretch);
    std::string packed;
    uLong sum = 0;
    for (std::size_t number = 0; number < kStretches; ++number) {
        packed += stretch;
        sum = crc32_combine(sum, stretchSum, kStretch);
    }
    sum = crc32(sum, reinterpret_cast<const Bytef*>(end.data()), static_cast<uInt>(end.size()));
    return {.name = "large",
            .claimedSize = kStretches * kStretch + end.size(),
            .claimedChecksum = static_cast<std::uint32_t>(sum),
            .packed = packed + last};
}

std::string LastBytesOf(const std::string& path, long count) {
    std::FILE* file = nullptr;
    std::string bytes(static_cast<std::size_t>(count), '?');
    EXPECT_EQ(fopen_s(&file, path.c_str(), "rb"), 0);
    EXPECT_EQ(std::fseek(file, -count, SEEK_END), 0);
    EXPECT_EQ(std::fread(bytes.data(), 1, bytes.size(), file), bytes.size());
    std::fclose(file);
    return bytes;
}

TEST(LargeEntry, IsUnpackedToItsLastByte) {
    Machine machine;
    const LogRecorder log;
    machine.Has(kPath, ArchiveBuilder().Add(LargeEntry()).Bytes());
    EXPECT_EQ(HV::ExtractZip(kPath, R"(C:\out)"), 0) << log.Text();
    EXPECT_EQ(fs::file_size(kFile), (std::uint64_t{1} << 31) + 3);
    EXPECT_EQ(LastBytesOf(kFile, 5), std::string("\0\0end", 5));
}

}  // namespace
