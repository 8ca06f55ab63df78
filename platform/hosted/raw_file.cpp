#include "platform/raw_file.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <string>

#include "platform/hosted/host_file.h"
#include "platform/hosted/machine.h"

namespace platform {
namespace {

using hosted::Descriptor;
using hosted::Machine;
using hosted::Operation;

bool IsSameTime(const timespec& one, const timespec& other) {
    return one.tv_sec == other.tv_sec && one.tv_nsec == other.tv_nsec;
}

// The time of the last change of any kind cannot be put back, as that of the last writing can.
bool IsSameState(const struct stat& one, const struct stat& other) {
    return one.st_dev == other.st_dev && one.st_ino == other.st_ino && one.st_size == other.st_size &&
           IsSameTime(one.st_mtim, other.st_mtim) && IsSameTime(one.st_ctim, other.st_ctim);
}

class HostFile : public RawFile {
public:
    HostFile(Descriptor descriptor, std::string name) : descriptor_(std::move(descriptor)), name_(std::move(name)) {
        ::fstat(descriptor_.Get(), &opened_);
    }

    std::int64_t ReadAt(std::uint64_t place, void* bytes, std::size_t count) override {
        std::size_t done = 0;
        while (done < count) {
            const ssize_t got = ::pread(descriptor_.Get(), static_cast<char*>(bytes) + done, count - done,
                                        static_cast<off_t>(place + done));
            if (got < 0 && errno != EINTR) {
                return -1;
            }
            if (got == 0) {
                break;
            }
            done += got > 0 ? static_cast<std::size_t>(got) : 0;
        }
        return static_cast<std::int64_t>(done);
    }

    bool WriteAt(std::uint64_t place, const void* bytes, std::size_t count) override {
        if (Machine::Current().GetFaults().Check(Operation::Write, name_, count) != 0) {
            return false;
        }
        std::size_t done = 0;
        while (done < count) {
            const ssize_t put = ::pwrite(descriptor_.Get(), static_cast<const char*>(bytes) + done, count - done,
                                         static_cast<off_t>(place + done));
            if (put < 0 && errno != EINTR) {
                return false;
            }
            done += put > 0 ? static_cast<std::size_t>(put) : 0;
        }
        return true;
    }

    [[nodiscard]] std::uint64_t Size() const override {
        struct stat found {};
        return ::fstat(descriptor_.Get(), &found) == 0 ? static_cast<std::uint64_t>(found.st_size) : 0;
    }

    [[nodiscard]] bool IsStillAt(const wchar_t* name) const override {
        struct stat now {};
        const std::string hostName = Machine::Current().HostPath(std::wstring_view(name));
        return ::stat(hostName.c_str(), &now) == 0 && IsSameState(now, opened_);
    }

    bool Close() override { return descriptor_.Close() == 0; }

private:
    Descriptor descriptor_;
    std::string name_;
    struct stat opened_ {};
};

bool IsReadOnly(const std::string& name) {
    struct stat found {};
    return ::stat(name.c_str(), &found) == 0 && hosted::IsReadOnly(found);
}

int OpenFlags(RawFile::Mode mode) {
    switch (mode) {
        case RawFile::Mode::Read:
            return O_RDONLY;
        case RawFile::Mode::Change:
            return O_RDWR;
        case RawFile::Mode::Create:
            return O_RDWR | O_CREAT | O_TRUNC;
    }
    return O_RDONLY;
}

bool IsOrdinary(int descriptor) {
    struct stat found {};
    return ::fstat(descriptor, &found) == 0 && S_ISREG(found.st_mode);
}

}  // namespace

std::unique_ptr<RawFile> OpenRawFile(const wchar_t* windowsName, RawFile::Mode mode) {
    std::string name = Machine::Current().HostPath(std::wstring_view(windowsName));
    // The user of a machine may be root, whom a read-only file would not stop.
    if (mode != RawFile::Mode::Read &&
        (IsReadOnly(name) || Machine::Current().GetFaults().Check(Operation::Create, name) != 0)) {
        return nullptr;
    }
    // Without waiting: opening a pipe must not hang before it is seen to be none of ours.
    Descriptor descriptor(::open(name.c_str(), OpenFlags(mode) | O_CLOEXEC | O_NONBLOCK, 0666));
    if (!descriptor.IsOpen() || !IsOrdinary(descriptor.Get())) {
        return nullptr;
    }
    hosted::MarkAsOpen(descriptor.Get());
    return std::make_unique<HostFile>(std::move(descriptor), std::move(name));
}

}  // namespace platform
