#include "platform/held_folder.h"

#include <algorithm>

#include "platform/filesystem.h"
#include "platform/windows/open_folder.h"
#include "platform/windows/trust.h"

namespace platform {
namespace {

/// Owner and access list of a private folder. The list is protected: it takes nothing over from the folder above.
std::wstring PrivateRights() {
    if (IsAdministrator()) {
        return L"O:BAD:P(A;OICI;FA;;;BA)(A;OICI;FA;;;SY)";
    }
    const std::wstring user = OwnAccount();
    return L"O:" + user + L"D:P(A;OICI;FA;;;" + user + L")";
}

bool IsPlantedLink(const std::wstring& path) {
    if (!IsReparsePoint(GetFileAttributesW(path.c_str()))) {
        return false;
    }
    const Handle item = OpenItself(path, READ_CONTROL, kEverySharing);
    return !item.IsOpen() || (IsLink(item.Get()) && !HasTrustedOwner(item.Get()));
}

/// The first link on the way to a full path that nobody trusted made; else empty.
std::wstring FindPlanted(const std::wstring& full) {
    const std::size_t root = full.find(L'\\', full.starts_with(L"\\\\") ? 2 : 0);
    for (std::size_t end = root; end < full.size();) {
        end = std::min(full.find(L'\\', end + 1), full.size());
        if (std::wstring part = full.substr(0, end); IsPlantedLink(part)) {
            return part;
        }
    }
    return {};
}

}  // namespace

std::unique_ptr<HeldFolder> MakePrivateFolder(const std::string& path, NoFolder& reason) {
    return MakeFolder(fs::path(path).native(), PrivateRights(), reason);
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
    return std::make_unique<OpenFolder>(path, std::move(folder));
}

std::unique_ptr<HeldFolder> HoldOwnFolder(const std::string& path, bool& isLink) {
    const std::wstring name = fs::path(path).native();
    const bool looksSo = IsReparsePoint(GetFileAttributesW(name.c_str()));
    Handle folder = OpenToHold(name, FILE_LIST_DIRECTORY);
    isLink = folder.IsOpen() ? IsLinkAt(name, folder.Get()) : looksSo;
    return folder.IsOpen() && !isLink ? std::make_unique<OpenFolder>(path, std::move(folder)) : nullptr;
}

}  // namespace platform
