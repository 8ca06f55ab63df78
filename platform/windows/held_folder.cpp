#include "platform/held_folder.h"

#include "platform/windows/handle.h"

#include <sddl.h>
#include <winternl.h>

#include <algorithm>
#include <vector>

#include "platform/filesystem.h"
#include "platform/windows/trust.h"

namespace platform {
namespace {

/// What LocalAlloc() made.
class Descriptor {
public:
    /// Of the text form, which is documented with ConvertStringSecurityDescriptorToSecurityDescriptor().
    explicit Descriptor(const std::wstring& text) {
        ConvertStringSecurityDescriptorToSecurityDescriptorW(text.c_str(), SDDL_REVISION_1, &descriptor_, nullptr);
    }
    ~Descriptor() { LocalFree(descriptor_); }
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;
    [[nodiscard]] PSECURITY_DESCRIPTOR Get() const { return descriptor_; }

private:
    PSECURITY_DESCRIPTOR descriptor_ = nullptr;
};

/// Owner and access list of a private folder. The list is protected: it takes nothing over from the folder above.
std::wstring PrivateRights() {
    if (IsAdministrator()) {
        return L"O:BAD:P(A;OICI;FA;;;BA)(A;OICI;FA;;;SY)";
    }
    const std::wstring user = OwnAccount();
    return L"O:" + user + L"D:P(A;OICI;FA;;;" + user + L")";
}

std::wstring FullPath(const std::wstring& path) {
    std::vector<wchar_t> full(GetFullPathNameW(path.c_str(), 0, nullptr, nullptr) + std::size_t{1});
    const DWORD length = GetFullPathNameW(path.c_str(), static_cast<DWORD>(full.size()), full.data(), nullptr);
    return {full.data(), length};
}

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

class WindowsFolder : public HeldFolder {
public:
    WindowsFolder(std::string path, Handle folder) : path_(std::move(path)), folder_(std::move(folder)) {}
    [[nodiscard]] const std::string& Path() const override { return path_; }

private:
    std::string path_;
    Handle folder_;
};

Handle OpenItself(const std::wstring& path) {
    return Handle(CreateFileW(path.c_str(), FILE_READ_ATTRIBUTES | READ_CONTROL,
                              FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE, nullptr, OPEN_EXISTING,
                              FILE_FLAG_BACKUP_SEMANTICS | FILE_FLAG_OPEN_REPARSE_POINT, nullptr));
}

/// A link or a junction, and not what the system keeps of other kinds in a folder, such as files that are in a cloud.
/// Where nothing tells the kind it may be one.
bool IsLink(HANDLE item) {
    FILE_ATTRIBUTE_TAG_INFO found{};
    if (!GetFileInformationByHandleEx(item, FileAttributeTagInfo, &found, sizeof found)) {
        return true;
    }
    constexpr DWORD kStandsForAnother = 0x20000000;
    return found.ReparseTag == 0 || (found.ReparseTag & kStandsForAnother) != 0;
}

bool IsPlanted(const std::wstring& path) {
    const DWORD attributes = GetFileAttributesW(path.c_str());
    if (attributes == INVALID_FILE_ATTRIBUTES || (attributes & FILE_ATTRIBUTE_REPARSE_POINT) == 0) {
        return false;
    }
    const Handle item = OpenItself(path);
    return !item.IsOpen() || (IsLink(item.Get()) && !HasTrustedOwner(item.Get()));
}

/// The first link on the way to a full path that nobody trusted made; else empty.
std::wstring FindPlanted(const std::wstring& full) {
    const std::size_t root = full.find(L'\\', full.starts_with(L"\\\\") ? 2 : 0);
    for (std::size_t end = root; end < full.size();) {
        end = std::min(full.find(L'\\', end + 1), full.size());
        if (std::wstring part = full.substr(0, end); IsPlanted(part)) {
            return part;
        }
    }
    return {};
}

}  // namespace

std::unique_ptr<HeldFolder> MakePrivateFolder(const std::string& path, NoFolder& reason) {
    const std::wstring name = fs::path(path).native();
    const Descriptor rights(PrivateRights());
    HANDLE made = nullptr;
    reason = NoFolder::Failed;
    if (rights.Get() == nullptr) {
        return nullptr;
    }
    if (const NTSTATUS status = Make(name, rights.Get(), made); status < 0) {
        reason = IsTaken(status) ? NoFolder::Taken : NoFolder::Failed;
        return nullptr;
    }
    Handle folder(made);
    // A volume that keeps no owners and no access lists cannot keep anybody out. The account itself will do: it was
    // this program that made what it has open, and Wine names the account whatever owner it is given.
    if (!HasTrustedOwner(folder.Get()) && OwnerOf(folder.Get()) != OwnAccount()) {
        RemoveDirectoryW(name.c_str());
        return nullptr;
    }
    return std::make_unique<WindowsFolder>(fs::path(PathWithoutLinks(name, folder.Get())).string(), std::move(folder));
}

// Held first and looked at then: what is held keeps all folders above it where they are.
std::unique_ptr<HeldFolder> HoldFolder(const std::string& path, std::string& planted) {
    const std::wstring full = FullPath(fs::path(path).native());
    Handle folder(CreateFileW(full.c_str(), FILE_LIST_DIRECTORY | FILE_READ_ATTRIBUTES,
                              FILE_SHARE_READ | FILE_SHARE_WRITE, nullptr, OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS,
                              nullptr));
    planted = fs::path(FindPlanted(full)).string();
    if (!planted.empty() || !folder.IsOpen()) {
        return nullptr;
    }
    return std::make_unique<WindowsFolder>(path, std::move(folder));
}

}  // namespace platform
