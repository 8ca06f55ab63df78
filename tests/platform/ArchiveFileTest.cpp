#include <gtest/gtest.h>
#include <minizip/unzip.h>
#include <minizip/zip.h>

#include <random>
#include <string>
#include <vector>

#include "platform/archive_file.h"
#include "platform/filesystem.h"
#include "platform/libraries.h"
#include "tests/support/Machine.h"

namespace {

constexpr const char* FileName = "C:\\ProgramData\\\xC3\x9C.zip";

/// The functions as the library is given them, on one file.
class Stream {
public:
    Stream(const fs::path& name, int mode) {
        platform::FillArchiveFileFunctions(functions_);
        stream_ = functions_.zopen64_file(functions_.opaque, name.c_str(), mode);
    }
    ~Stream() {
        if (stream_ != nullptr) {
            Close();
        }
    }
    Stream(const Stream&) = delete;
    Stream& operator=(const Stream&) = delete;

    [[nodiscard]] bool IsOpen() const { return stream_ != nullptr; }
    std::string Read(std::size_t count) {
        std::string bytes(count, '\0');
        bytes.resize(functions_.zread_file(functions_.opaque, stream_, bytes.data(), static_cast<uLong>(count)));
        return bytes;
    }
    std::size_t Write(const std::string& bytes) {
        return functions_.zwrite_file(functions_.opaque, stream_, bytes.data(), static_cast<uLong>(bytes.size()));
    }
    long Seek(ZPOS64_T offset, int origin) {
        return functions_.zseek64_file(functions_.opaque, stream_, offset, origin);
    }
    ZPOS64_T Tell() { return functions_.ztell64_file(functions_.opaque, stream_); }
    int Error() { return functions_.zerror_file(functions_.opaque, stream_); }
    int Close() {
        const voidpf stream = stream_;
        stream_ = nullptr;
        return functions_.zclose_file(functions_.opaque, stream);
    }

private:
    zlib_filefunc64_def functions_{};
    voidpf stream_ = nullptr;
};

constexpr int ToRead = ZLIB_FILEFUNC_MODE_READ | ZLIB_FILEFUNC_MODE_EXISTING;
constexpr int ToCreate = ZLIB_FILEFUNC_MODE_READ | ZLIB_FILEFUNC_MODE_WRITE | ZLIB_FILEFUNC_MODE_CREATE;
constexpr int ToChange = ZLIB_FILEFUNC_MODE_READ | ZLIB_FILEFUNC_MODE_WRITE | ZLIB_FILEFUNC_MODE_EXISTING;

std::string SomeBytes(std::size_t count) {
    std::mt19937 generator(7);
    std::string bytes(count, '\0');
    for (char& byte : bytes) {
        byte = static_cast<char>(generator());
    }
    return bytes;
}

class ArchiveFileTest : public testing::Test {
protected:
    Machine machine;
};

TEST_F(ArchiveFileTest, ReadsTheSameBytesInPiecesOfAnySize) {
    const std::string content = SomeBytes(300000);
    machine.Has(FileName, content);
    int ran = 0;
    for (const std::size_t piece : {1u, 46u, 16384u, 65535u, 65536u, 65537u, 200000u, 400000u}) {
        Stream stream(FileName, ToRead);
        ASSERT_TRUE(stream.IsOpen());
        std::string read;
        for (std::string part = stream.Read(piece); !part.empty(); part = stream.Read(piece)) {
            read += part;
        }
        EXPECT_TRUE(read == content) << piece;
        EXPECT_EQ(stream.Error(), 0);
        ++ran;
    }
    EXPECT_EQ(ran, 8);
}

TEST_F(ArchiveFileTest, MovesFromStartPlaceAndEnd) {
    machine.Has(FileName, "0123456789");
    Stream stream(FileName, ToRead);
    EXPECT_EQ(stream.Seek(4, ZLIB_FILEFUNC_SEEK_SET), 0);
    EXPECT_EQ(stream.Read(2), "45");
    EXPECT_EQ(stream.Seek(1, ZLIB_FILEFUNC_SEEK_CUR), 0);
    EXPECT_EQ(stream.Read(1), "7");
    EXPECT_EQ(stream.Seek(0, ZLIB_FILEFUNC_SEEK_END), 0);
    EXPECT_EQ(stream.Tell(), 10u);
    EXPECT_EQ(stream.Read(5), "");
    EXPECT_EQ(stream.Seek(0, 9), -1);
    EXPECT_EQ(stream.Error(), 0);
}

/// The same orders, in any mixture, to the stream and to a plain string: both must hold the same at the end.
TEST_F(ArchiveFileTest, WritesReadsAndCorrectsLikeAStringInMemory) {
    const std::string source = SomeBytes(200000);
    std::mt19937 generator(11);
    std::string expected;
    std::size_t position = 0;
    Stream stream(FileName, ToCreate);
    ASSERT_TRUE(stream.IsOpen());
    int steps = 0;
    for (; steps < 2000; ++steps) {
        const std::size_t count = generator() % (steps % 50 == 0 ? 100000 : 300);
        const std::size_t choice = generator() % 4;
        if (choice == 0) {
            position = generator() % (expected.size() + 1);
            ASSERT_EQ(stream.Seek(position, ZLIB_FILEFUNC_SEEK_SET), 0);
        } else if (choice == 1) {
            const std::string there = position < expected.size() ? expected.substr(position, count) : std::string();
            ASSERT_TRUE(stream.Read(count) == there) << "step " << steps;
            position += there.size();
        } else {
            const std::string bytes = source.substr(generator() % 1000, count);
            ASSERT_EQ(stream.Write(bytes), count);
            expected.resize(std::max(expected.size(), position + count));
            expected.replace(position, count, bytes);
            position += count;
        }
        ASSERT_EQ(stream.Tell(), position);
    }
    EXPECT_EQ(stream.Close(), 0);
    EXPECT_EQ(steps, 2000);
    EXPECT_TRUE(machine.Content(FileName) == expected);
}

TEST_F(ArchiveFileTest, ReachesBeyondFourGigabytes) {
    const ZPOS64_T place = ZPOS64_T{5} << 30;
    {
        Stream stream(FileName, ToCreate);
        stream.Seek(place, ZLIB_FILEFUNC_SEEK_SET);
        EXPECT_EQ(stream.Write("far"), 3u);
        EXPECT_EQ(stream.Close(), 0);
    }
    EXPECT_EQ(fs::file_size(FileName), place + 3);
    Stream stream(FileName, ToRead);
    stream.Seek(place, ZLIB_FILEFUNC_SEEK_SET);
    EXPECT_EQ(stream.Read(10), "far");
    stream.Seek(0, ZLIB_FILEFUNC_SEEK_END);
    EXPECT_EQ(stream.Tell(), place + 3);
}

TEST_F(ArchiveFileTest, CreatingReplacesAndChangingKeeps) {
    machine.Has(FileName, "0123456789");
    {
        Stream stream(FileName, ToChange);
        stream.Seek(2, ZLIB_FILEFUNC_SEEK_SET);
        stream.Write("xy");
    }
    EXPECT_EQ(machine.Content(FileName), "01xy456789");
    Stream(FileName, ToCreate).Write("new");
    EXPECT_EQ(machine.Content(FileName), "new");
}

TEST_F(ArchiveFileTest, OpensNeitherWhatIsMissingNorAFolder) {
    EXPECT_FALSE(Stream("C:\\ProgramData\\none.zip", ToRead).IsOpen());
    EXPECT_FALSE(Stream("C:\\ProgramData\\none.zip", ToChange).IsOpen());
    EXPECT_FALSE(Stream("C:\\ProgramData\\none\\new.zip", ToCreate).IsOpen());
    EXPECT_FALSE(Stream("C:\\ProgramData", ToRead).IsOpen());
    EXPECT_FALSE(machine.Exists("C:\\ProgramData\\none.zip"));
}

TEST_F(ArchiveFileTest, TheLibraryFindsInAnArchiveWhatItPutThere) {
    zlib_filefunc64_def functions{};
    platform::FillArchiveFileFunctions(functions);
    const fs::path name(FileName);
    zipFile archive = zipOpen2_64(name.c_str(), APPEND_STATUS_CREATE, nullptr, &functions);
    ASSERT_NE(archive, nullptr);
    for (int i = 0; i < 300; ++i) {
        const std::string content = SomeBytes(static_cast<std::size_t>(i) * 100);
        ASSERT_EQ(zipOpenNewFileInZip64(archive, ("entry" + std::to_string(i)).c_str(), nullptr, nullptr, 0, nullptr, 0,
                                        nullptr, Z_DEFLATED, Z_BEST_SPEED, 0),
                  ZIP_OK);
        ASSERT_EQ(zipWriteInFileInZip(archive, content.data(), static_cast<unsigned>(content.size())), ZIP_OK);
        ASSERT_EQ(zipCloseFileInZip(archive), ZIP_OK);
    }
    ASSERT_EQ(zipClose(archive, nullptr), ZIP_OK);

    unzFile reader = unzOpen2_64(name.c_str(), &functions);
    ASSERT_NE(reader, nullptr);
    int found = 0;
    for (int more = unzGoToFirstFile(reader); more == UNZ_OK; more = unzGoToNextFile(reader), ++found) {
        std::string content(static_cast<std::size_t>(found) * 100 + 1, '\0');
        ASSERT_EQ(unzOpenCurrentFile(reader), UNZ_OK);
        content.resize(static_cast<std::size_t>(
            unzReadCurrentFile(reader, content.data(), static_cast<unsigned>(content.size()))));
        EXPECT_EQ(unzCloseCurrentFile(reader), UNZ_OK);
        EXPECT_TRUE(content == SomeBytes(static_cast<std::size_t>(found) * 100)) << found;
    }
    EXPECT_EQ(unzClose(reader), UNZ_OK);
    EXPECT_EQ(found, 300);
}

}  // namespace
