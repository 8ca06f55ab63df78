#pragma once

#include <memory>
#include <string>
#include <utility>

#include "platform/held_folder.h"
#include "platform/windows/handle.h"

/// What folders with rights of their own are made and held by.
namespace platform {

/// A security descriptor of the system.
class Descriptor {
public:
    /// Of the text form, which is documented with ConvertStringSecurityDescriptorToSecurityDescriptor().
    explicit Descriptor(const std::wstring& text);
    ~Descriptor() { LocalFree(descriptor_); }
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;

    /// Null when the text is none.
    [[nodiscard]] PSECURITY_DESCRIPTOR Get() const { return descriptor_; }

private:
    PSECURITY_DESCRIPTOR descriptor_ = nullptr;
};

/// A folder that is held by being open.
class OpenFolder : public HeldFolder {
public:
    OpenFolder(std::string path, Handle folder) : path_(std::move(path)), folder_(std::move(folder)) {}
    [[nodiscard]] const std::string& Path() const override { return path_; }

private:
    std::string path_;
    Handle folder_;
};

[[nodiscard]] std::wstring FullPath(const std::wstring& path);

constexpr DWORD kEverySharing = FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE;

/// Opens what is at `path`, of whatever kind, with `access` and the right to ask what it is. A link is not followed.
[[nodiscard]] Handle OpenItself(const std::wstring& path, DWORD access, DWORD sharing);

/// The same without sharing its deletion, which keeps it where it is; unless somebody has it open for that already, as
/// programs that look at every new file do for a moment.
[[nodiscard]] Handle OpenToHold(const std::wstring& path, DWORD access);

/// Makes the folder with these rights, as text, and opens it in one step, so nobody comes between. Then looks whether
/// it is as it should be. Null as with MakePrivateFolder().
std::unique_ptr<HeldFolder> MakeFolder(const std::wstring& path, const std::wstring& rights, NoFolder& reason);

[[nodiscard]] bool IsReparsePoint(DWORD attributes);

/// Whether the item that is open as itself is a link or a junction, and not what the system keeps of other kinds in a
/// folder, such as files that are in a cloud. Where nothing tells the kind it may be one.
[[nodiscard]] bool IsLink(HANDLE item);

/// Whether `path`, open as itself, is a link. Asked of the name as well, because Wine opens what a link names.
[[nodiscard]] bool IsLinkAt(const std::wstring& path, HANDLE opened);

/// Whether the volume keeps for the open folder that it belongs to this program, or at least to its account: Wine names
/// the account whatever owner a folder is given. One that keeps no owners can keep nobody out.
[[nodiscard]] bool IsOwn(HANDLE folder);

}  // namespace platform
