#include "platform/windows/open_folder.h"

#include <sddl.h>
#include <winternl.h>

#include <vector>

#include "platform/filesystem.h"
#include "platform/windows/trust.h"

namespace platform {
namespace {

/// The name by which the system itself knows a full path.
std::wstring SystemName(const std::wstring& full) {
    if (full.starts_with(L"\\\\?\\")) {
        return L"\\??\\" + full.substr(4);
    }
    return full.starts_with(L"\\\\") ? L"\\??\\UNC\\" + full.substr(2) : L"\\??\\" + full;
}

/// Makes the folder and opens it in one step, so nobody comes between. Others that open it may not delete or rename it.
NTSTATUS Make(const std::wstring& path, PSECURITY_DESCRIPTOR rights, HANDLE& folder) {
    std::wstring name = SystemName(FullPath(path));
    UNICODE_STRING text{};
    text.Buffer = name.data();
    text.Length = static_cast<USHORT>(name.size() * sizeof(wchar_t));
    text.MaximumLength = text.Length;
    OBJECT_ATTRIBUTES object{};
    InitializeObjectAttributes(&object, &text, OBJ_CASE_INSENSITIVE, nullptr, rights);
    IO_STATUS_BLOCK status{};
    return NtCreateFile(&folder, FILE_LIST_DIRECTORY | FILE_READ_ATTRIBUTES | READ_CONTROL | SYNCHRONIZE, &object,
                        &status, nullptr, FILE_ATTRIBUTE_NORMAL, FILE_SHARE_READ | FILE_SHARE_WRITE, FILE_CREATE,
                        FILE_DIRECTORY_FILE | FILE_SYNCHRONOUS_IO_NONALERT | FILE_OPEN_REPARSE_POINT, nullptr, 0);
}

bool IsTaken(NTSTATUS status) {
    constexpr auto kNameCollision = static_cast<NTSTATUS>(0xC0000035);
    return status == kNameCollision;
}

std::wstring LongPath(const std::wstring& path) {
    std::vector<wchar_t> full(GetLongPathNameW(path.c_str(), nullptr, 0) + std::size_t{1});
    const DWORD length = GetLongPathNameW(path.c_str(), full.data(), static_cast<DWORD>(full.size()));
    return {full.data(), length};
}

/// Where the folder is, without links, in the form that programs use.
std::wstring FinalPath(HANDLE folder) {
    std::vector<wchar_t> path(GetFinalPathNameByHandleW(folder, nullptr, 0, FILE_NAME_NORMALIZED) + std::size_t{1});
    const DWORD length =
        GetFinalPathNameByHandleW(folder, path.data(), static_cast<DWORD>(path.size()), FILE_NAME_NORMALIZED);
    const std::wstring final(path.data(), length < path.size() ? length : 0);
    if (final.starts_with(L"\\\\?\\UNC\\")) {
        return L"\\\\" + final.substr(8);
    }
    return final.starts_with(L"\\\\?\\") ? final.substr(4) : final;
}

/// A link above the folder can be turned elsewhere while the folder is held, so such a path is not the one to go by.
/// A short name of a folder is no link.
std::wstring PathWithoutLinks(const std::wstring& path, HANDLE folder) {
    const std::wstring final = FinalPath(folder);
    const std::wstring given = LongPath(FullPath(path));
    const bool same = CompareStringOrdinal(final.c_str(), static_cast<int>(final.size()), given.c_str(),
                                           static_cast<int>(given.size()), TRUE) == CSTR_EQUAL;
    return same || final.empty() ? path : final;
}

}  // namespace

Descriptor::Descriptor(const std::wstring& text) {
    ConvertStringSecurityDescriptorToSecurityDescriptorW(text.c_str(), SDDL_REVISION_1, &descriptor_, nullptr);
}

std::wstring FullPath(const std::wstring& path) {
    std::vector<wchar_t> full(GetFullPathNameW(path.c_str(), 0, nullptr, nullptr) + std::size_t{1});
    const DWORD length = GetFullPathNameW(path.c_str(), static_cast<DWORD>(full.size()), full.data(), nullptr);
    return {full.data(), length};
}

Handle OpenItself(const std::wstring& path, DWORD access, DWORD sharing) {
    return Handle(CreateFileW(path.c_str(), access | FILE_READ_ATTRIBUTES, sharing, nullptr, OPEN_EXISTING,
                              FILE_FLAG_BACKUP_SEMANTICS | FILE_FLAG_OPEN_REPARSE_POINT, nullptr));
}

Handle OpenToHold(const std::wstring& path, DWORD access) {
    Handle item = OpenItself(path, access, FILE_SHARE_READ | FILE_SHARE_WRITE);
    if (!item.IsOpen() && GetLastError() == ERROR_SHARING_VIOLATION) {
        item = OpenItself(path, access, kEverySharing);
    }
    return item;
}

std::unique_ptr<HeldFolder> MakeFolder(const std::wstring& path, const std::wstring& rights, NoFolder& reason) {
    const Descriptor descriptor(rights);
    HANDLE made = nullptr;
    reason = NoFolder::Failed;
    if (descriptor.Get() == nullptr) {
        return nullptr;
    }
    if (const NTSTATUS status = Make(path, descriptor.Get(), made); status < 0) {
        reason = IsTaken(status) ? NoFolder::Taken : NoFolder::Failed;
        return nullptr;
    }
    Handle folder(made);
    if (!IsOwn(folder.Get())) {
        RemoveDirectoryW(path.c_str());
        return nullptr;
    }
    return std::make_unique<OpenFolder>(fs::path(PathWithoutLinks(path, folder.Get())).string(), std::move(folder));
}

bool IsReparsePoint(DWORD attributes) {
    return attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_REPARSE_POINT) != 0;
}

bool IsLink(HANDLE item) {
    FILE_ATTRIBUTE_TAG_INFO found{};
    if (!GetFileInformationByHandleEx(item, FileAttributeTagInfo, &found, sizeof found)) {
        return true;
    }
    constexpr DWORD kStandsForAnother = 0x20000000;
    return found.ReparseTag == 0 || (found.ReparseTag & kStandsForAnother) != 0;
}

bool IsLinkAt(const std::wstring& path, HANDLE opened) {
    FILE_BASIC_INFO found{};
    const bool opensOne = !GetFileInformationByHandleEx(opened, FileBasicInfo, &found, sizeof found) ||
                          IsReparsePoint(found.FileAttributes);
    return (opensOne || IsReparsePoint(GetFileAttributesW(path.c_str()))) && IsLink(opened);
}

bool IsOwn(HANDLE folder) {
    return HasTrustedOwner(folder) || OwnerOf(folder) == OwnAccount();
}

}  // namespace platform
