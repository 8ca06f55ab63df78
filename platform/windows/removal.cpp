#include "platform/removal.h"

#include <winternl.h>

#include <string_view>
#include <vector>

#include "platform/filesystem.h"
#include "platform/windows/handle.h"

namespace platform {
namespace {

constexpr DWORD kToDelete = static_cast<DWORD>(0x00010000);  // the access right whose name platform/win32.h takes away
constexpr ULONG kEverybodyElse = FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE;

/// Opens `name` in the open folder `parent` as itself: a link is not followed. `access` beside that for deleting.
Handle OpenIn(HANDLE parent, std::wstring& name, ACCESS_MASK access) {
    UNICODE_STRING text{};
    text.Buffer = name.data();
    text.Length = static_cast<USHORT>(name.size() * sizeof(wchar_t));
    text.MaximumLength = text.Length;
    OBJECT_ATTRIBUTES object{};
    InitializeObjectAttributes(&object, &text, 0, parent, nullptr);
    IO_STATUS_BLOCK status{};
    HANDLE opened = nullptr;
    const NTSTATUS result =
        NtOpenFile(&opened, kToDelete | FILE_READ_ATTRIBUTES | SYNCHRONIZE | access, &object, &status, kEverybodyElse,
                   FILE_SYNCHRONOUS_IO_NONALERT | FILE_OPEN_REPARSE_POINT | FILE_OPEN_FOR_BACKUP_INTENT);
    return Handle(result < 0 ? nullptr : opened);
}

/// The same for a whole path.
Handle Open(const std::wstring& path, DWORD access) {
    return Handle(CreateFileW(path.c_str(), kToDelete | FILE_READ_ATTRIBUTES | SYNCHRONIZE | access, kEverybodyElse,
                              nullptr, OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS | FILE_FLAG_OPEN_REPARSE_POINT,
                              nullptr));
}

/// What has been opened is looked at, and not what the listing said it was.
bool IsFolder(HANDLE item) {
    BY_HANDLE_FILE_INFORMATION found{};
    return GetFileInformationByHandle(item, &found) && (found.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0 &&
           (found.dwFileAttributes & FILE_ATTRIBUTE_REPARSE_POINT) == 0;
}

/// The name goes at once where the system can do that, though somebody may still be reading.
bool Delete(HANDLE item) {
    struct {
        ULONG flags;
    } now{0x1 | 0x2};  // FILE_DISPOSITION_FLAG_DELETE, FILE_DISPOSITION_FLAG_POSIX_SEMANTICS
    constexpr auto kDispositionEx = static_cast<FILE_INFO_BY_HANDLE_CLASS>(21);  // FileDispositionInfoEx
    if (SetFileInformationByHandle(item, kDispositionEx, &now, sizeof now)) {
        return true;
    }
    const DWORD error = GetLastError();
    if (error == ERROR_ACCESS_DENIED || error == ERROR_DIR_NOT_EMPTY || error == ERROR_SHARING_VIOLATION) {
        return false;
    }
    FILE_DISPOSITION_INFO later{TRUE};
    return SetFileInformationByHandle(item, FileDispositionInfo, &later, sizeof later);
}

bool IsOwnName(std::wstring_view name) {
    return name == L"." || name == L"..";
}

bool Empty(HANDLE folder);

bool RemoveIn(HANDLE parent, std::wstring name, bool isFolder) {
    // A user who may delete a folder need not be allowed to look into it; an empty one goes all the same.
    Handle item = OpenIn(parent, name, isFolder ? FILE_LIST_DIRECTORY : 0);
    if (!item.IsOpen() && isFolder) {
        item = OpenIn(parent, name, 0);
    }
    return item.IsOpen() && (!isFolder || !IsFolder(item.Get()) || Empty(item.Get())) && Delete(item.Get());
}

/// Removes each entry of one piece of a listing.
bool RemoveListed(HANDLE folder, const char* listed) {
    for (;;) {
        const auto& entry = *reinterpret_cast<const FILE_ID_BOTH_DIR_INFO*>(listed);
        const std::wstring name(entry.FileName, entry.FileNameLength / sizeof(wchar_t));
        const bool isFolder = (entry.FileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
        if (!IsOwnName(name) && !RemoveIn(folder, name, isFolder)) {
            return false;
        }
        if (entry.NextEntryOffset == 0) {
            return true;
        }
        listed += entry.NextEntryOffset;
    }
}

bool Empty(HANDLE folder) {
    std::vector<char> listed(65536);
    while (GetFileInformationByHandleEx(folder, FileIdBothDirectoryInfo, listed.data(),
                                        static_cast<DWORD>(listed.size()))) {
        if (!RemoveListed(folder, listed.data())) {
            return false;
        }
    }
    return GetLastError() == ERROR_NO_MORE_FILES;
}

}  // namespace

int RemoveTree(const std::string& path) {
    const std::wstring name = fs::path(path).native();
    if (GetFileAttributesW(name.c_str()) == INVALID_FILE_ATTRIBUTES) {
        return 0;
    }
    Handle item = Open(name, FILE_LIST_DIRECTORY);
    if (!item.IsOpen()) {
        item = Open(name, 0);
    }
    return item.IsOpen() && (!IsFolder(item.Get()) || Empty(item.Get())) && Delete(item.Get()) ? 0 : -1;
}

}  // namespace platform
