#include <fcntl.h>
#include <sys/stat.h>
#include <sys/statvfs.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <climits>
#include <cstdio>
#include <cstdlib>

#include "platform/hosted/failure.h"
#include "platform/hosted/file_error.h"
#include "platform/hosted/folder.h"
#include "platform/hosted/host_file.h"
#include "platform/hosted/machine.h"

namespace hosted::filesystem {
namespace {

using Stat = struct stat;

constexpr auto Failed = static_cast<std::uintmax_t>(-1);

std::string HostName(const path& item) {
    return Machine::Current().HostPath(item.native());
}

int Check(Operation operation, const std::string& hostName, std::uint64_t bytes = 0) {
    return Machine::Current().GetFaults().Check(operation, hostName, bytes);
}

bool MeansMissing(int number) {
    return number == ENOENT || number == ENOTDIR || number == ENAMETOOLONG;
}

/// The errno of a call that gives 0 or -1.
int ErrorOf(int result) {
    return result == 0 ? 0 : errno;
}

file_status StatusOf(int number, const Stat& found) {
    if (number != 0) {
        return file_status(MeansMissing(number) ? file_not_found : status_error);
    }
    if (S_ISREG(found.st_mode)) {
        return file_status(regular_file);
    }
    if (S_ISDIR(found.st_mode)) {
        return file_status(directory_file);
    }
    return file_status(S_ISLNK(found.st_mode) ? symlink_file : type_unknown);
}

using StatCall = int (*)(const char*, Stat*);

file_status AskStatus(const path& item, StatCall call, const char* operation, error_code* error) {
    Stat found{};
    const int number = ErrorOf(call(HostName(item).c_str(), &found));
    // Asked without a code, a missing item is an answer; a code that is there is told the reason as well.
    if (error != nullptr || !MeansMissing(number)) {
        Report(number, error, operation, item);
    }
    return StatusOf(number, found);
}

bool IsDirectoryOnHost(const std::string& hostName) {
    Stat found{};
    return ::stat(hostName.c_str(), &found) == 0 && S_ISDIR(found.st_mode);
}

std::uintmax_t AskSize(const path& file, error_code* error) {
    Stat found{};
    int number = ErrorOf(::stat(HostName(file).c_str(), &found));
    if (number == 0 && !S_ISREG(found.st_mode)) {
        number = ENOTSUP;
    }
    Report(number, error, "boost::filesystem::file_size", file);
    return number == 0 ? static_cast<std::uintmax_t>(found.st_size) : Failed;
}

/// Windows lets a folder take the place of a file; the host does not, but it can make the two change places.
int ReplaceFileByFolder(const std::string& from, const std::string& to) {
    const int number = ErrorOf(::renameat2(AT_FDCWD, from.c_str(), AT_FDCWD, to.c_str(), RENAME_EXCHANGE));
    return number != 0 ? number : ErrorOf(::unlink(from.c_str()));
}

/// What stands at `to` may be replaced only where Windows would do it: no folder, and nothing read-only.
int RenameOverExisting(const std::string& from, const std::string& to) {
    Stat source{};
    Stat target{};
    if (::lstat(from.c_str(), &source) != 0) {
        return errno;
    }
    const bool taken = ::lstat(to.c_str(), &target) == 0;
    const bool itself = taken && source.st_dev == target.st_dev && source.st_ino == target.st_ino;
    if (taken && !itself && (S_ISDIR(target.st_mode) || IsReadOnly(target))) {
        return EACCES;
    }
    if (taken && !itself && IsOpenSomewhere(to)) {
        return EBUSY;
    }
    if (taken && !itself && S_ISDIR(source.st_mode)) {
        return ReplaceFileByFolder(from, to);
    }
    return ErrorOf(std::rename(from.c_str(), to.c_str()));
}

int RenameOnHost(const std::string& from, const std::string& to) {
    if (const int number = Machine::Current().GetFaults().CheckRename(from, to); number != 0) {
        return number;
    }
    if (IsOpenSomewhere(from)) {
        return EBUSY;
    }
    // Nearly always the new name is free, and one call does. Some file systems do not know the flag: EINVAL.
    const int number = ErrorOf(::renameat2(AT_FDCWD, from.c_str(), AT_FDCWD, to.c_str(), RENAME_NOREPLACE));
    return number == EEXIST || number == EINVAL ? RenameOverExisting(from, to) : number;
}

int CopyThroughBuffer(int source, int target, off_t expected) {
    std::array<char, 65536> buffer;
    off_t copied = 0;
    // A file of the size that it said is done without one more read for its end; some of /proc say zero and hold more.
    while (copied < expected || expected == 0) {
        const ssize_t count = ::read(source, buffer.data(), buffer.size());
        if (count == 0) {
            break;
        }
        if (count < 0) {
            if (errno == EINTR) {
                continue;
            }
            return errno;
        }
        if (const int number = WriteAll(target, {buffer.data(), static_cast<std::size_t>(count)}); number != 0) {
            return number;
        }
        copied += count;
    }
    return 0;
}

bool MeansNotHere(int number) {
    return number == EXDEV || number == ENOSYS || number == EINVAL || number == EOPNOTSUPP || number == EPERM;
}

/// The host copies by itself, and shares the blocks where its file system can. Where it cannot do this at all it has
/// not moved anything yet, and the bytes take the long way.
int CopyOnHost(int source, int target, off_t size) {
    off_t left = size;
    while (left > 0) {
        const ssize_t copied = ::copy_file_range(source, nullptr, target, nullptr, static_cast<std::size_t>(left), 0);
        if (copied == 0) {
            return 0;
        }
        if (copied < 0) {
            if (left == size && MeansNotHere(errno)) {
                return CopyThroughBuffer(source, target, size);
            }
            if (errno != EINTR) {
                return errno;
            }
            continue;
        }
        left -= copied;
    }
    return 0;
}

constexpr off_t SmallFile = 65536;

int FillCopy(int source, Descriptor& target, const Stat& found, const std::string& targetName) {
    int number = Check(Operation::Write, targetName, static_cast<std::uint64_t>(found.st_size));
    if (number == 0) {
        number = found.st_size <= SmallFile ? CopyThroughBuffer(source, target.Get(), found.st_size)
                                            : CopyOnHost(source, target.Get(), found.st_size);
    }
    if (number != 0) {
        return number;
    }
    // As with CopyFile, the copy is as old as its source.
    const std::array<timespec, 2> times = {timespec{.tv_sec = 0, .tv_nsec = UTIME_OMIT}, found.st_mtim};
    number = ErrorOf(::futimens(target.Get(), times.data()));
    return number != 0 ? number : target.Close();
}

int CopyFile(const std::string& from, const std::string& to) {
    // Without waiting: opening a pipe must not hang before it is seen to be none of ours.
    const Descriptor source(::open(from.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK));
    Stat found{};
    if (!source.IsOpen() || ::fstat(source.Get(), &found) != 0) {
        return errno;
    }
    if (!S_ISREG(found.st_mode)) {
        return EACCES;
    }
    if (const int number = Check(Operation::Create, to); number != 0) {
        return number;
    }
    // The mode carries a read-only file's nature over, and does not keep this descriptor from writing.
    Descriptor target(::open(to.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, found.st_mode & 0777));
    if (!target.IsOpen()) {
        return errno;
    }
    const int number = FillCopy(source.Get(), target, found, to);
    if (number != 0) {
        ::unlink(to.c_str());
    }
    return number;
}

bool Copy(const path& from, const path& to, error_code* error) {
    const int number = CopyFile(HostName(from), HostName(to));
    Report(number, error, "boost::filesystem::copy_file", from, to);
    return number == 0;
}

/// 0 or the errno; `made` says whether the folder is new.
int MakeFolder(const path& folder, bool& made) {
    const std::string hostName = HostName(folder);
    made = false;
    if (IsDirectoryOnHost(hostName)) {
        return 0;
    }
    if (const int number = Check(Operation::Create, hostName); number != 0) {
        return number;
    }
    made = ::mkdir(hostName.c_str(), 0777) == 0;
    return made || (errno == EEXIST && IsDirectoryOnHost(hostName)) ? 0 : errno;
}

/// Makes what is missing from the top down. On failure `folder` is the one that could not be made.
int MakeFolders(path& folder, bool& made) {
    made = false;
    if (!folder.has_relative_path() || IsDirectoryOnHost(HostName(folder))) {
        return 0;
    }
    path parent = folder.parent_path();
    if (const int number = MakeFolders(parent, made); number != 0) {
        folder = parent;
        return number;
    }
    const path name = folder.filename();
    return name == path(".") || name == path("..") ? 0 : MakeFolder(folder, made);
}

bool CreateFolder(const path& folder, error_code* error) {
    bool made = false;
    Report(MakeFolder(folder, made), error, "boost::filesystem::create_directory", folder);
    return made;
}

bool CreateFolders(const path& folder, error_code* error) {
    bool made = false;
    path failed = folder;
    const int number = folder.empty() ? EINVAL : MakeFolders(failed, made);
    Report(number, error, "boost::filesystem::create_directories", folder, number == 0 ? path() : failed);
    return number == 0 && made;
}

int RemoveOne(const std::string& hostName, bool isFolder) {
    if (const int number = Check(Operation::Delete, hostName); number != 0) {
        return number;
    }
    if (!isFolder && IsOpenSomewhere(hostName)) {
        return EBUSY;
    }
    return ErrorOf(isFolder ? ::rmdir(hostName.c_str()) : ::unlink(hostName.c_str()));
}

bool Remove(const path& item, error_code* error) {
    const std::string hostName = HostName(item);
    Stat found{};
    int number = ErrorOf(::lstat(hostName.c_str(), &found));
    if (number == 0) {
        number = RemoveOne(hostName, S_ISDIR(found.st_mode));
    }
    Report(MeansMissing(number) ? 0 : number, error, "boost::filesystem::remove", item);
    return number == 0;
}

/// Counts what it removes; an item that is gone already counts as none.
int RemoveTree(const std::string& hostName, file_type type, std::uintmax_t& count) {
    if (type == directory_file) {
        const Folder folder(hostName);
        if (folder.Error() != 0) {
            return folder.Error();
        }
        for (const Folder::Entry& entry : folder.Entries()) {
            if (const int number = RemoveTree(hostName + "/" + entry.name, entry.type, count); number != 0) {
                return number;
            }
        }
    }
    const int number = RemoveOne(hostName, type == directory_file);
    if (number == 0) {
        ++count;
    }
    return MeansMissing(number) ? 0 : number;
}

std::uintmax_t RemoveAll(const path& item, error_code* error) {
    const std::string hostName = HostName(item);
    Stat found{};
    std::uintmax_t count = 0;
    int number = ErrorOf(::lstat(hostName.c_str(), &found));
    if (number == 0) {
        number = RemoveTree(hostName, StatusOf(0, found).type(), count);
    }
    number = MeansMissing(number) ? 0 : number;
    Report(number, error, "boost::filesystem::remove_all", item);
    return number == 0 ? count : Failed;
}

path AskCurrentPath(error_code* error) {
    char* folder = ::getcwd(nullptr, 0);
    Report(folder != nullptr ? 0 : errno, error, "boost::filesystem::current_path");
    if (folder == nullptr) {
        return {};
    }
    path current = Machine::Current().WindowsPath(folder);
    std::free(folder);
    return current;
}

void SetCurrentPath(const path& folder, error_code* error) {
    Report(ErrorOf(::chdir(HostName(folder).c_str())), error, "boost::filesystem::current_path", folder);
}

/// `item` seen from the absolute path `base`, part by part, so that a drive or a root of its own stays.
path Absolute(const path& item, const path& base) {
    if (item.empty() || base.is_relative()) {
        return base;
    }
    path result = item.has_root_name() ? item.root_name() : base.root_name();
    if (item.has_root_directory()) {
        // What names no drive is on the machine's, wherever on the host the current folder is.
        result = result == path("Z:") && !item.has_root_name() ? path("C:") : result;
        result += item.root_directory();
    } else {
        result += base.root_directory();
        result /= base.relative_path();
    }
    return result / item.relative_path();
}

std::string Describe(const path& item, const char* before) {
    return item.empty() ? std::string() : before + ("\"" + item.string() + "\"");
}

}  // namespace

filesystem_error::filesystem_error(const std::string& operation, error_code error)
    : filesystem_error(operation, path(), path(), error) {}

filesystem_error::filesystem_error(const std::string& operation, const path& first, error_code error)
    : filesystem_error(operation, first, path(), error) {}

filesystem_error::filesystem_error(const std::string& operation, const path& first, const path& second,
                                   error_code error)
    : system_error(error, operation),
      details_(std::make_shared<const Details>(
          Details{first, second, system_error::what() + Describe(first, ": ") + Describe(second, ", ")})) {}

void Report(int number, error_code* error, const char* operation, const path& first, const path& second) {
    const error_code code(number == 0 ? 0 : FailureOf(number).library, boost::system::system_category());
    if (error != nullptr) {
        *error = number == 0 ? error_code() : code;
    } else if (number != 0) {
        throw filesystem_error(operation, first, second, code);
    }
}

file_status status(const path& item) {
    return AskStatus(item, ::stat, "boost::filesystem::status", nullptr);
}

file_status status(const path& item, error_code& error) {
    return AskStatus(item, ::stat, "boost::filesystem::status", &error);
}

file_status symlink_status(const path& item) {
    return AskStatus(item, ::lstat, "boost::filesystem::symlink_status", nullptr);
}

file_status symlink_status(const path& item, error_code& error) {
    return AskStatus(item, ::lstat, "boost::filesystem::symlink_status", &error);
}

std::uintmax_t file_size(const path& file) {
    return AskSize(file, nullptr);
}
std::uintmax_t file_size(const path& file, error_code& error) {
    return AskSize(file, &error);
}

space_info space(const path& item, error_code& error) {
    struct statvfs found {};
    const int number = ErrorOf(::statvfs(HostName(item).c_str(), &found));
    Report(number, &error, "boost::filesystem::space", item);
    if (number != 0) {
        return {Failed, Failed, Failed};
    }
    const std::uintmax_t block = found.f_frsize;
    return {found.f_blocks * block, found.f_bfree * block, found.f_bavail * block};
}

void rename(const path& from, const path& to) {
    Report(RenameOnHost(HostName(from), HostName(to)), nullptr, "boost::filesystem::rename", from, to);
}

void rename(const path& from, const path& to, error_code& error) {
    Report(RenameOnHost(HostName(from), HostName(to)), &error, "boost::filesystem::rename", from, to);
}

bool copy_file(const path& from, const path& to) {
    return Copy(from, to, nullptr);
}
bool copy_file(const path& from, const path& to, error_code& error) {
    return Copy(from, to, &error);
}
bool create_directory(const path& folder) {
    return CreateFolder(folder, nullptr);
}
bool create_directory(const path& folder, error_code& error) {
    return CreateFolder(folder, &error);
}
bool create_directories(const path& folder) {
    return CreateFolders(folder, nullptr);
}
bool create_directories(const path& folder, error_code& error) {
    return CreateFolders(folder, &error);
}
bool remove(const path& item) {
    return Remove(item, nullptr);
}
bool remove(const path& item, error_code& error) {
    return Remove(item, &error);
}
std::uintmax_t remove_all(const path& item) {
    return RemoveAll(item, nullptr);
}
std::uintmax_t remove_all(const path& item, error_code& error) {
    return RemoveAll(item, &error);
}
path current_path() {
    return AskCurrentPath(nullptr);
}
path current_path(error_code& error) {
    return AskCurrentPath(&error);
}
void current_path(const path& folder) {
    SetCurrentPath(folder, nullptr);
}
void current_path(const path& folder, error_code& error) {
    SetCurrentPath(folder, &error);
}

path absolute(const path& item, const path& base) {
    if (item.is_absolute()) {
        return item;
    }
    return Absolute(item, base.is_absolute() ? base : Absolute(base, current_path()));
}

path absolute(const path& item, error_code& error) {
    error.clear();
    if (item.is_absolute()) {
        return item;
    }
    const path base = current_path(error);
    return error ? path() : Absolute(item, base);
}

}  // namespace hosted::filesystem
