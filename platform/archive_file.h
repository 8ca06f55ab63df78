#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <vector>

#include "platform/raw_file.h"

namespace platform {

/// A file with a position and one buffer, made for the way in which zip archives are read and written: crowds of reads
/// of a few bytes, long reads one after the other, and short corrections a little before the end.
///
/// The buffer holds one stretch of the file, either as read or as not yet written. One thread at a time.
class ArchiveFile {
public:
    explicit ArchiveFile(std::unique_ptr<RawFile> file);

    /// Bytes read, fewer than `count` at the end or after a failure.
    std::size_t Read(void* bytes, std::size_t count);
    /// Bytes taken, fewer than `count` after a failure. A failure may show later, at the latest in Close().
    std::size_t Write(const void* bytes, std::size_t count);
    [[nodiscard]] std::uint64_t Position() const { return position_; }
    void MoveTo(std::uint64_t position) { position_ = lastMove_ = position; }
    /// Where the last MoveTo() led: the place of the record that was looked at last.
    [[nodiscard]] std::uint64_t LastMove() const { return lastMove_; }
    /// The size as it will be when everything is written.
    [[nodiscard]] std::uint64_t Size() const;
    /// True once something has failed.
    [[nodiscard]] bool HasFailed() const { return failed_; }
    /// Writes what is left. False when anything has failed since the file was opened.
    bool Close();

private:
    [[nodiscard]] std::uint64_t BufferEnd() const { return bufferStart_ + bufferSize_; }
    [[nodiscard]] bool IsInBuffer() const { return position_ >= bufferStart_ && position_ < BufferEnd(); }
    bool Fill();
    bool Flush();
    std::size_t TakeFromBuffer(char* bytes, std::size_t count);
    std::size_t ReadPastBuffer(char* bytes, std::size_t count);

    std::unique_ptr<RawFile> file_;
    std::vector<char> buffer_;
    std::uint64_t bufferStart_ = 0;
    std::size_t bufferSize_ = 0;
    std::uint64_t position_ = 0;
    std::uint64_t lastMove_ = 0;
    bool unwritten_ = false;
    bool failed_ = false;
};

}  // namespace platform
