#include "platform/hosted/failure.h"

#include <unistd.h>

#include <cerrno>
#include <cstdio>

namespace hosted {

Failure FailureOf(int number) {
    switch (number) {
        case ENOENT:
            return {number, ENOENT, ERROR_FILE_NOT_FOUND};
        case ENOTDIR:
            return {number, ENOENT, ERROR_PATH_NOT_FOUND};
        case ENAMETOOLONG:
            return {ENOENT, EINVAL, ERROR_INVALID_NAME};
        case EEXIST:
            return {number, EEXIST, ERROR_ALREADY_EXISTS};
        case ENOTEMPTY:
            return {number, ENOTEMPTY, ERROR_DIR_NOT_EMPTY};
        case ENOSPC:
            return {number, ENOSPC, ERROR_DISK_FULL};
        case EBUSY:
            return {EACCES, EACCES, ERROR_SHARING_VIOLATION};
        case EINVAL:
            return {number, EINVAL, ERROR_INVALID_PARAMETER};
        case EMFILE:
            return {number, EMFILE, ERROR_TOO_MANY_OPEN_FILES};
        default:
            return {number, EACCES, ERROR_ACCESS_DENIED};
    }
}

void EndWithMessage(const std::string& message) {
    std::fprintf(stderr, "%s\n", message.c_str());
    std::fflush(nullptr);
    // No exit handlers: they would ask for the machine that cannot be.
    _exit(1);
}

}  // namespace hosted
