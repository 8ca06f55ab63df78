#include "platform/shell_link.h"

#include "platform/windows/win32.h"

#include <array>

#include <objbase.h>
#include <shobjidl.h>

namespace platform {
namespace {

using PathBuffer = std::array<wchar_t, 260>;
using DescriptionBuffer = std::array<wchar_t, 64>;

// Owns one reference to a COM object.
template <class Interface>
class ComPointer {
public:
    ComPointer() = default;
    ComPointer(const ComPointer&) = delete;
    ComPointer& operator=(const ComPointer&) = delete;
    ~ComPointer() {
        if (object_ != nullptr) {
            object_->Release();
        }
    }

    // Where a call that gives a reference away puts it.
    void** Receive() { return reinterpret_cast<void**>(&object_); }
    Interface* operator->() const { return object_; }

private:
    Interface* object_ = nullptr;
};

// False when `text` and its terminator do not fit.
template <std::size_t Size>
bool Widen(const std::string& text, std::array<wchar_t, Size>& buffer) {
    return MultiByteToWideChar(CP_ACP, 0, text.c_str(), -1, buffer.data(), static_cast<int>(Size)) != 0;
}

ShellLinkResult Save(const ComPointer<IShellLinkW>& link, const std::string& linkPath) {
    ComPointer<IPersistFile> file;
    if (FAILED(link->QueryInterface(IID_IPersistFile, file.Receive()))) {
        return ShellLinkResult::NoFile;
    }
    PathBuffer path{};
    const bool saved = Widen(linkPath, path) && SUCCEEDED(file->Save(path.data(), TRUE));
    return saved ? ShellLinkResult::Saved : ShellLinkResult::NotSaved;
}

}  // namespace

ShellLinkResult SaveShellLink(const ShellLink& wanted, const std::string& path) {
    // Never paired with CoUninitialize: the thread may hold objects of the shell that are not ours.
    (void)CoInitialize(nullptr);
    PathBuffer target{};
    DescriptionBuffer description{};
    ComPointer<IShellLinkW> link;
    if (!Widen(wanted.target, target) || !Widen(wanted.description, description) ||
        FAILED(CoCreateInstance(CLSID_ShellLink, nullptr, CLSCTX_INPROC_SERVER, IID_IShellLinkW, link.Receive()))) {
        return ShellLinkResult::NoLink;
    }
    link->SetPath(target.data());
    link->SetDescription(description.data());
    if (wanted.showsIconOfTarget) {
        link->SetIconLocation(target.data(), 0);
    }
    return Save(link, path);
}

}  // namespace platform
