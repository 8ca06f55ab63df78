#include "platform/archive_file.h"

#include <algorithm>
#include <cstring>

#include "platform/libraries.h"

namespace platform {
namespace {

constexpr std::size_t BufferCapacity = 65536;

ArchiveFile& File(voidpf stream) {
    return *static_cast<ArchiveFile*>(stream);
}

RawFile::Mode ModeOf(int mode) {
    if ((mode & ZLIB_FILEFUNC_MODE_READWRITEFILTER) == ZLIB_FILEFUNC_MODE_READ) {
        return RawFile::Mode::Read;
    }
    return (mode & ZLIB_FILEFUNC_MODE_CREATE) != 0 ? RawFile::Mode::Create : RawFile::Mode::Change;
}

// What minizip calls. Its streams are owned by its archive handle, from the opening to the closing.

voidpf OpenStream(voidpf, const void* name, int mode) {
    std::unique_ptr<RawFile> file = OpenRawFile(static_cast<const wchar_t*>(name), ModeOf(mode));
    return file == nullptr ? nullptr : std::make_unique<ArchiveFile>(std::move(file)).release();
}

uLong ReadStream(voidpf, voidpf stream, void* bytes, uLong count) {
    return static_cast<uLong>(File(stream).Read(bytes, count));
}

uLong WriteStream(voidpf, voidpf stream, const void* bytes, uLong count) {
    return static_cast<uLong>(File(stream).Write(bytes, count));
}

ZPOS64_T TellStream(voidpf, voidpf stream) {
    return File(stream).Position();
}

long SeekStream(voidpf, voidpf stream, ZPOS64_T offset, int origin) {
    ArchiveFile& file = File(stream);
    switch (origin) {
        case ZLIB_FILEFUNC_SEEK_SET:
            file.MoveTo(offset);
            return 0;
        case ZLIB_FILEFUNC_SEEK_CUR:
            file.MoveTo(file.Position() + offset);
            return 0;
        case ZLIB_FILEFUNC_SEEK_END:
            file.MoveTo(file.Size() + offset);
            return 0;
        default:
            return -1;
    }
}

int CloseStream(voidpf, voidpf stream) {
    const std::unique_ptr<ArchiveFile> file(&File(stream));
    return file->Close() ? 0 : EOF;
}

int HasStreamFailed(voidpf, voidpf stream) {
    return File(stream).HasFailed() ? 1 : 0;
}

// The same for a file that is somebody else's: it is open already, and stays so.

voidpf UseFile(voidpf file, const void*, int) {
    return file;
}

int LeaveFile(voidpf, voidpf) {
    return 0;
}

}  // namespace

ArchiveFile::ArchiveFile(std::unique_ptr<RawFile> file) : file_(std::move(file)), buffer_(BufferCapacity) {}

std::size_t ArchiveFile::Read(void* bytes, std::size_t count) {
    auto* to = static_cast<char*>(bytes);
    std::size_t done = 0;
    while (done < count) {
        const std::size_t got =
            IsInBuffer() ? TakeFromBuffer(to + done, count - done) : ReadPastBuffer(to + done, count - done);
        if (got == 0) {
            break;
        }
        done += got;
    }
    return done;
}

std::size_t ArchiveFile::TakeFromBuffer(char* bytes, std::size_t count) {
    const auto from = static_cast<std::size_t>(position_ - bufferStart_);
    const std::size_t taken = std::min(count, bufferSize_ - from);
    std::memcpy(bytes, buffer_.data() + from, taken);
    position_ += taken;
    return taken;
}

std::size_t ArchiveFile::ReadPastBuffer(char* bytes, std::size_t count) {
    if (count < BufferCapacity) {
        return Fill() ? TakeFromBuffer(bytes, count) : 0;
    }
    const std::int64_t got = Flush() ? file_->ReadAt(position_, bytes, count) : -1;
    if (got < 0) {
        failed_ = true;
        return 0;
    }
    position_ += static_cast<std::uint64_t>(got);
    return static_cast<std::size_t>(got);
}

/// Brings the stretch from the position on into the buffer; false when there is nothing.
bool ArchiveFile::Fill() {
    if (!Flush()) {
        return false;
    }
    const std::int64_t got = file_->ReadAt(position_, buffer_.data(), BufferCapacity);
    failed_ = failed_ || got < 0;
    bufferStart_ = position_;
    bufferSize_ = got < 0 ? 0 : static_cast<std::size_t>(got);
    return bufferSize_ > 0;
}

std::size_t ArchiveFile::Write(const void* bytes, std::size_t count) {
    const auto* from = static_cast<const char*>(bytes);
    std::size_t done = 0;
    while (done < count) {
        const bool joins = unwritten_ && position_ >= bufferStart_ && position_ <= BufferEnd() &&
                           position_ < bufferStart_ + BufferCapacity;
        if (!joins) {
            if (!Flush()) {
                break;
            }
            bufferStart_ = position_;
            bufferSize_ = 0;
            unwritten_ = true;
        }
        const auto to = static_cast<std::size_t>(position_ - bufferStart_);
        const std::size_t taken = std::min(count - done, BufferCapacity - to);
        std::memcpy(buffer_.data() + to, from + done, taken);
        bufferSize_ = std::max(bufferSize_, to + taken);
        position_ += taken;
        done += taken;
    }
    return done;
}

/// Afterwards nothing is unwritten: what could not be written is given up, and the file has failed for good.
bool ArchiveFile::Flush() {
    if (unwritten_) {
        unwritten_ = false;
        failed_ = !file_->WriteAt(bufferStart_, buffer_.data(), bufferSize_) || failed_;
    }
    return !failed_;
}

std::uint64_t ArchiveFile::Size() const {
    return unwritten_ ? std::max(file_->Size(), BufferEnd()) : file_->Size();
}

bool ArchiveFile::Close() {
    Flush();
    failed_ = !file_->Close() || failed_;
    return !failed_;
}

void FillArchiveFileFunctions(zlib_filefunc64_def& functions) {
    functions.zopen64_file = OpenStream;
    functions.zread_file = ReadStream;
    functions.zwrite_file = WriteStream;
    functions.ztell64_file = TellStream;
    functions.zseek64_file = SeekStream;
    functions.zclose_file = CloseStream;
    functions.zerror_file = HasStreamFailed;
    functions.opaque = nullptr;
}

void FillArchiveFileFunctions(zlib_filefunc64_def& functions, ArchiveFile& file) {
    FillArchiveFileFunctions(functions);
    functions.zopen64_file = UseFile;
    functions.zclose_file = LeaveFile;
    functions.opaque = &file;
}

}  // namespace platform
