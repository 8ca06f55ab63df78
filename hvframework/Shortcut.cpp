#include "hvframework/Shortcut.h"

#include <array>
#include <iostream>

#include "hvframework/StringUtils.h"
#include "platform/shell_link.h"
#include "platform/win32.h"

namespace HVL::FileUtils {
namespace {

constexpr const char* kDescription = "Halvorn shortcut";

using PathBuffer = std::array<wchar_t, 260>;
using DescriptionBuffer = std::array<wchar_t, 64>;

// Fixed (contracts, shortcuts): numbers that tell the two failures apart. They name no line of this source.
constexpr int kNoFileInterface = 503;
constexpr int kNotSaved = 513;

// Owns one reference to a COM object.
template <class Interface>
class ComPointer {
public:
    ComPointer() = default;
    ComPointer(const ComPointer&) = delete;
    ComPointer& operator=(const ComPointer&) = delete;
    ~ComPointer() {
        if (object != nullptr) {
            object->Release();
        }
    }

    // Where a call that gives a reference away puts it.
    void** Receive() { return reinterpret_cast<void**>(&object); }
    Interface* operator->() const { return object; }

private:
    Interface* object = nullptr;
};

// False when `text` and its terminator do not fit.
template <std::size_t Size>
bool Widen(const std::string& text, std::array<wchar_t, Size>& buffer) {
    return MultiByteToWideChar(CP_ACP, 0, text.c_str(), -1, buffer.data(), static_cast<int>(Size)) != 0;
}

int Fail(int place) {
    std::cerr << "ERROR at "
              << "HVL::FileUtils::MakeShortcut"
              << ":" << place << std::endl;
    return -1;
}

int Save(const ComPointer<IShellLinkW>& link, const std::string& linkPath) {
    ComPointer<IPersistFile> file;
    if (FAILED(link->QueryInterface(IID_IPersistFile, file.Receive()))) {
        return Fail(kNoFileInterface);
    }
    PathBuffer path{};
    if (!Widen(linkPath, path) || FAILED(file->Save(path.data(), TRUE))) {
        return Fail(kNotSaved);
    }
    return 0;
}

}  // namespace

int MakeShortcut(const std::string& target, const std::string& linkPath) {
    // Never paired with CoUninitialize: the thread may hold objects of the shell that are not ours.
    (void)CoInitialize(nullptr);
    PathBuffer path{};
    DescriptionBuffer description{};
    if (!Widen(target, path) || !Widen(kDescription, description)) {
        return -1;
    }
    ComPointer<IShellLinkW> link;
    if (FAILED(CoCreateInstance(CLSID_ShellLink, nullptr, CLSCTX_INPROC_SERVER, IID_IShellLinkW, link.Receive()))) {
        return -1;
    }
    link->SetPath(path.data());
    link->SetDescription(description.data());
    if (StringUtils::EndsWith(target, ".exe")) {
        link->SetIconLocation(path.data(), 0);
    }
    return Save(link, linkPath);
}

}  // namespace HVL::FileUtils
