#include "platform/hosted/host_file.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>

namespace hosted {

int Descriptor::Close() {
    const int number = Give();
    return number < 0 || close(number) == 0 ? 0 : errno;
}

int WriteAll(int descriptor, std::string_view bytes) {
    while (!bytes.empty()) {
        const ssize_t written = write(descriptor, bytes.data(), bytes.size());
        if (written < 0 && errno != EINTR) {
            return errno;
        }
        bytes.remove_prefix(written < 0 ? 0 : static_cast<std::size_t>(written));
    }
    return 0;
}

bool IsReadOnly(const struct stat& found) {
    return (found.st_mode & (S_IWUSR | S_IWGRP | S_IWOTH)) == 0;
}

namespace {

// A lock of the whole file that belongs to what is opened, not to the process: so a program finds its own files open
// too, and the lock goes with the last copy of the descriptor, whoever closes it.
struct flock LockOf(short type) {
    struct flock lock {};
    lock.l_type = type;
    lock.l_whence = SEEK_SET;
    return lock;
}

}  // namespace

void MarkAsOpen(int descriptor) {
    const bool onlyWrites = (fcntl(descriptor, F_GETFL) & O_ACCMODE) == O_WRONLY;
    const struct flock lock = LockOf(onlyWrites ? F_WRLCK : F_RDLCK);
    fcntl(descriptor, F_OFD_SETLK, &lock);
}

bool IsOpenSomewhere(const std::string& hostName) {
    const Descriptor file(open(hostName.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOFOLLOW));
    struct flock lock = LockOf(F_WRLCK);
    return file.IsOpen() && fcntl(file.Get(), F_OFD_GETLK, &lock) == 0 && lock.l_type != F_UNLCK;
}

}  // namespace hosted
