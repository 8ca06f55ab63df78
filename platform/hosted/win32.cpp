#include "platform/hosted/win32.h"

#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cstring>
#include <optional>
#include <string>

#include "platform/hosted/failure.h"
#include "platform/hosted/host_file.h"
#include "platform/hosted/machine.h"

namespace {

using hosted::Machine;
using hosted::Operation;
using Stat = struct stat;

thread_local DWORD lastError = 0;

int Fail(int number) {
    const hosted::Failure failure = hosted::FailureOf(number);
    SetLastError(static_cast<DWORD>(failure.system));
    errno = failure.runtime;
    return -1;
}

/// 0, or the errno that keeps the file at `hostPath` from being deleted.
int RefusalToDelete(const std::string& hostPath) {
    Stat found{};
    if (lstat(hostPath.c_str(), &found) != 0) {
        return errno;
    }
    if (S_ISDIR(found.st_mode) || (S_ISREG(found.st_mode) && hosted::IsReadOnly(found))) {
        return EACCES;
    }
    if (const int error = Machine::Current().GetFaults().Check(Operation::Delete, hostPath)) {
        return error;
    }
    return hosted::IsOpenSomewhere(hostPath) ? EBUSY : 0;
}

bool IsLinkToFolder(const std::string& hostPath) {
    Stat itself{};
    Stat target{};
    return lstat(hostPath.c_str(), &itself) == 0 && S_ISLNK(itself.st_mode) && stat(hostPath.c_str(), &target) == 0 &&
           S_ISDIR(target.st_mode);
}

/// 0 or the errno. A link to a folder is a folder to Windows, and goes without what it names.
int RemoveFolder(const std::string& hostPath) {
    if (const int error = Machine::Current().GetFaults().Check(Operation::Delete, hostPath)) {
        return error;
    }
    if (rmdir(hostPath.c_str()) == 0) {
        return 0;
    }
    const int error = errno;
    return error == ENOTDIR && IsLinkToFolder(hostPath) && unlink(hostPath.c_str()) == 0 ? 0 : error;
}

bool IsFile(const std::string& hostPath) {
    Stat found{};
    return stat(hostPath.c_str(), &found) == 0 && !S_ISDIR(found.st_mode);
}

}  // namespace

DWORD GetLastError() {
    return lastError;
}

void SetLastError(DWORD error) {
    lastError = error;
}

DWORD GetEnvironmentVariableA(LPCSTR name, LPSTR buffer, DWORD size) {
    const std::optional<std::string> value = Machine::Current().GetEnvironment().Get(name);
    if (!value) {
        SetLastError(static_cast<DWORD>(ERROR_ENVVAR_NOT_FOUND));
        return 0;
    }
    if (value->size() >= size) {
        return static_cast<DWORD>(value->size() + 1);
    }
    std::memcpy(buffer, value->c_str(), value->size() + 1);
    // An empty value gives 0 as a missing one does; the last error tells them apart.
    SetLastError(static_cast<DWORD>(ERROR_SUCCESS));
    return static_cast<DWORD>(value->size());
}

BOOL SetEnvironmentVariableA(LPCSTR name, LPCSTR value) {
    if (name == nullptr || *name == '\0' || std::strchr(name, '=') != nullptr) {
        SetLastError(static_cast<DWORD>(ERROR_INVALID_PARAMETER));
        return FALSE;
    }
    Machine::Current().GetEnvironment().Set(name, value != nullptr ? std::optional<std::string>(value) : std::nullopt);
    return TRUE;
}

int _mkdir(const char* path) {
    const std::string hostPath = Machine::Current().HostPath(std::string_view(path));
    const int error = Machine::Current().GetFaults().Check(Operation::Create, hostPath);
    if (error != 0) {
        return Fail(error);
    }
    return mkdir(hostPath.c_str(), 0777) == 0 ? 0 : Fail(errno);
}

int _unlink(const char* path) {
    const std::string hostPath = Machine::Current().HostPath(std::string_view(path));
    const int error = RefusalToDelete(hostPath);
    if (error != 0) {
        return Fail(error);
    }
    return unlink(hostPath.c_str()) == 0 ? 0 : Fail(errno);
}

BOOL RemoveDirectoryA(LPCSTR path) {
    const std::string hostPath = Machine::Current().HostPath(std::string_view(path));
    const int error = RemoveFolder(hostPath);
    if (error == 0) {
        return TRUE;
    }
    Fail(error);
    if (error == ENOTDIR && IsFile(hostPath)) {
        SetLastError(static_cast<DWORD>(ERROR_DIRECTORY));
    }
    return FALSE;
}

int _isatty(int descriptor) {
    return isatty(descriptor);
}

int _fileno(FILE* stream) {
    return fileno(stream);
}
