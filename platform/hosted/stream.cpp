#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cstring>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "platform/hosted/failure.h"
#include "platform/hosted/host_file.h"
#include "platform/hosted/machine.h"
#include "platform/hosted/win32.h"

/// Streams of the runtime: how fopen_s reads its mode, and what lies between a text stream and its file.
namespace {

using hosted::Faults;
using hosted::Machine;
using hosted::Operation;
using Stat = struct stat;

constexpr char EndOfText = '\x1A';

struct Mode {
    char kind = 'r';
    bool both = false;
    bool text = true;
    bool itself = false;  ///< Neither a link nor a file with a second name.

    [[nodiscard]] bool Writes() const { return kind != 'r' || both; }
    [[nodiscard]] int Flags() const {
        const int access = both ? O_RDWR : kind == 'r' ? O_RDONLY : O_WRONLY;
        const int contents = kind == 'w' && !itself ? O_TRUNC : kind == 'a' ? O_APPEND : 0;
        return access | O_CLOEXEC | contents | (itself ? O_NOFOLLOW | O_NONBLOCK : 0);
    }
    /// As the host's own calls take it.
    [[nodiscard]] std::string Name() const { return std::string(1, kind) + (both ? "+" : ""); }
};

std::optional<Mode> ParseMode(std::string_view text) {
    if (text.empty() || std::string_view("rwa").find(text[0]) == std::string_view::npos) {
        return std::nullopt;
    }
    Mode mode;
    mode.kind = text[0];
    for (const char c : text.substr(1)) {
        if (c == '+') {
            mode.both = true;
        } else if (c == 'b' || c == 't') {
            mode.text = c == 't';
        } else {
            return std::nullopt;
        }
    }
    return mode;
}

/// A descriptor, or -1 and errno. Windows opens no folder as a file, and no read-only file for writing, whoever asks.
int OpenExisting(const std::string& hostPath, const Mode& mode) {
    Stat found{};
    if (mode.Writes() && stat(hostPath.c_str(), &found) == 0 && (S_ISDIR(found.st_mode) || hosted::IsReadOnly(found))) {
        errno = EACCES;
        return -1;
    }
    const int descriptor = open(hostPath.c_str(), mode.Flags());
    if (descriptor >= 0 && !mode.Writes() && fstat(descriptor, &found) == 0 && S_ISDIR(found.st_mode)) {
        close(descriptor);
        errno = EACCES;
        return -1;
    }
    return descriptor;
}

/// Empties a file that is there only once it is known to be no other. -1 and errno where it is one.
int EmptiedItself(int descriptor) {
    Stat found{};
    if (fstat(descriptor, &found) == 0 && S_ISREG(found.st_mode) && found.st_nlink == 1 &&
        ftruncate(descriptor, 0) == 0) {
        return descriptor;
    }
    close(descriptor);
    errno = EACCES;
    return -1;
}

int Open(const std::string& hostPath, const Mode& mode) {
    if (mode.Writes()) {
        if (const int error = Machine::Current().GetFaults().Check(Operation::Create, hostPath)) {
            errno = error;
            return -1;
        }
    }
    if (mode.kind != 'r') {
        // Nearly every file that is written is new.
        const int descriptor = open(hostPath.c_str(), mode.Flags() | O_CREAT | O_EXCL, 0666);
        if (descriptor < 0 && errno == EISDIR) {
            // The name ends in a separator, and there is no folder of that name.
            errno = ENAMETOOLONG;
        }
        if (descriptor >= 0 || errno != EEXIST) {
            return descriptor;
        }
    }
    const int descriptor = OpenExisting(hostPath, mode);
    return descriptor >= 0 && mode.itself ? EmptiedItself(descriptor) : descriptor;
}

/// What stands between a stream and its file where the two differ: in text mode, and where writes may have to fail.
class Filter {
public:
    Filter(int descriptor, std::string hostPath, bool text)
        : descriptor_(descriptor), hostPath_(std::move(hostPath)), text_(text) {}

    /// As a stream's functions do: the bytes taken, none on a failure.
    ssize_t Write(const char* bytes, std::size_t count) {
        if (!text_) {
            return WriteAll({bytes, count}) ? static_cast<ssize_t>(count) : 0;
        }
        std::string lines;
        lines.reserve(count + count / 16);
        for (std::size_t at = 0; at < count; ++at) {
            if (bytes[at] == '\n') {
                lines += '\r';
            }
            lines += bytes[at];
        }
        return WriteAll(lines) ? static_cast<ssize_t>(count) : 0;
    }

    ssize_t Read(char* bytes, std::size_t count) {
        if (!text_) {
            return read(descriptor_, bytes, count);
        }
        std::size_t filled = 0;
        while (filled < count) {
            const std::optional<char> next = NextOfText();
            if (!next) {
                break;
            }
            bytes[filled++] = *next;
        }
        return filled == 0 && failed_ ? -1 : static_cast<ssize_t>(filled);
    }

    /// Positions in a text are the file's own only while nothing has been read ahead; the logic seeks in none.
    int Seek(off64_t* offset, int whence) {
        if (text_ && !(*offset == 0 && whence == SEEK_CUR)) {
            errno = EINVAL;
            return -1;
        }
        const off64_t reached = lseek64(descriptor_, *offset, whence);
        *offset = reached;
        return reached < 0 ? -1 : 0;
    }

    int Close() { return close(descriptor_); }

private:
    bool WriteAll(std::string_view bytes) {
        Faults& faults = Machine::Current().GetFaults();
        int error = faults.Check(Operation::Write, hostPath_, bytes.size());
        if (error == 0) {
            error = hosted::WriteAll(descriptor_, bytes);
        }
        if (error != 0) {
            errno = error;
        }
        return error == 0;
    }

    /// CR LF is a line's end, a lone CR is itself, and Ctrl-Z ends the text wherever it stands.
    std::optional<char> NextOfText() {
        if (!Fill() || buffer_[at_] == EndOfText) {
            return std::nullopt;
        }
        const char c = buffer_[at_++];
        if (c == '\r' && Fill() && buffer_[at_] == '\n') {
            return buffer_[at_++];
        }
        return c;
    }

    bool Fill() {
        if (at_ < end_) {
            return true;
        }
        const ssize_t count = read(descriptor_, buffer_.data(), buffer_.size());
        failed_ = count < 0;
        at_ = 0;
        end_ = count < 0 ? 0 : static_cast<std::size_t>(count);
        return end_ > 0;
    }

    int descriptor_;
    std::string hostPath_;
    bool text_;
    bool failed_ = false;
    std::array<char, 8192> buffer_;
    std::size_t at_ = 0;
    std::size_t end_ = 0;
};

ssize_t WriteThrough(void* filter, const char* bytes, std::size_t count) {
    return static_cast<Filter*>(filter)->Write(bytes, count);
}
ssize_t ReadThrough(void* filter, char* bytes, std::size_t count) {
    return static_cast<Filter*>(filter)->Read(bytes, count);
}
int SeekThrough(void* filter, off64_t* offset, int whence) {
    return static_cast<Filter*>(filter)->Seek(offset, whence);
}
int CloseThrough(void* filter) {
    const std::unique_ptr<Filter> owner(static_cast<Filter*>(filter));
    return owner->Close();
}

FILE* FilteredStream(int descriptor, const std::string& hostPath, const Mode& mode) {
    auto filter = std::make_unique<Filter>(descriptor, hostPath, mode.text);
    const cookie_io_functions_t functions = {ReadThrough, WriteThrough, SeekThrough, CloseThrough};
    FILE* stream = fopencookie(filter.get(), mode.Name().c_str(), functions);
    if (stream != nullptr) {
        // The stream's closing ends it.
        static_cast<void>(filter.release());
    }
    return stream;
}

/// 0 and the stream, or the errno.
int OpenStream(std::string_view path, const Mode& mode, FILE*& stream) {
    const std::string hostPath = Machine::Current().HostPath(path);
    const int descriptor = Open(hostPath, mode);
    if (descriptor < 0) {
        return errno;
    }
    hosted::MarkAsOpen(descriptor);
    const bool mayFail = mode.Writes() && Machine::Current().GetFaults().Armed();
    stream =
        mode.text || mayFail ? FilteredStream(descriptor, hostPath, mode) : fdopen(descriptor, mode.Name().c_str());
    if (stream == nullptr) {
        const int error = errno;
        close(descriptor);
        return error;
    }
    return 0;
}

}  // namespace

namespace hosted {

FILE* OpenOwnFile(std::string_view path) {
    Mode mode;
    mode.kind = 'w';
    mode.text = false;
    mode.itself = true;
    FILE* stream = nullptr;
    return OpenStream(path, mode, stream) == 0 ? stream : nullptr;
}

}  // namespace hosted

errno_t fopen_s(FILE** stream, const char* path, const char* mode) {
    if (stream == nullptr || path == nullptr || mode == nullptr) {
        return EINVAL;
    }
    *stream = nullptr;
    const std::optional<Mode> parsed = ParseMode(mode);
    if (!parsed) {
        return EINVAL;
    }
    const int error = OpenStream(path, *parsed, *stream);
    return error == 0 ? 0 : hosted::FailureOf(error).runtime;
}
