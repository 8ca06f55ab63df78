#include "platform/hosted/shell_link.h"

#include <sys/stat.h>

#include <algorithm>
#include <cstdio>
#include <cwchar>
#include <string>
#include <string_view>

#include "platform/hosted/link_file.h"
#include "platform/hosted/machine.h"
#include "platform/utf8.h"

namespace {

void DescribeTarget(hosted::LinkFile& link) {
    struct stat status {};
    if (stat(hosted::Machine::Current().HostPath(link.target).c_str(), &status) != 0) {
        return;
    }
    const bool isFolder = S_ISDIR(status.st_mode);
    link.attributes = isFolder ? hosted::AttributeDirectory : hosted::AttributeArchive;
    link.size = isFolder ? 0 : static_cast<std::uint32_t>(status.st_size);
}

bool WriteFile(const std::string& path, const std::string& bytes) {
    std::FILE* file = nullptr;
    if (fopen_s(&file, path.c_str(), "wb") != 0) {
        return false;
    }
    const bool isWritten = std::fwrite(bytes.data(), 1, bytes.size(), file) == bytes.size();
    if (std::fclose(file) == 0 && isWritten) {
        return true;
    }
    _unlink(path.c_str());
    return false;
}

class ShellLink final : public IShellLinkW, public IPersistFile {
public:
    HRESULT QueryInterface(REFIID wanted, void** object) override {
        if (wanted == IID_IShellLinkW || wanted == IID_IUnknown) {
            *object = static_cast<IShellLinkW*>(this);
        } else if (wanted == IID_IPersistFile) {
            *object = static_cast<IPersistFile*>(this);
        } else {
            *object = nullptr;
            return E_NOINTERFACE;
        }
        AddRef();
        return S_OK;
    }

    ULONG AddRef() override { return ++references_; }

    ULONG Release() override {
        const ULONG left = --references_;
        if (left == 0) {
            delete this;
        }
        return left;
    }

    HRESULT SetPath(LPCWSTR path) override {
        if (std::wcslen(path) >= MAX_PATH) {
            return E_INVALIDARG;
        }
        link_.target = path;
        return S_OK;
    }

    HRESULT SetDescription(LPCWSTR text) override {
        link_.description = text;
        return S_OK;
    }

    HRESULT SetIconLocation(LPCWSTR path, int index) override {
        link_.icon = path;
        link_.iconIndex = index;
        return S_OK;
    }

    HRESULT Save(LPCOLESTR path, BOOL) override {
        DescribeTarget(link_);
        return WriteFile(platform::Utf8FromWide(path), LinkFileBytes(link_)) ? S_OK : E_FAIL;
    }

private:
    ~ShellLink() = default;

    hosted::LinkFile link_;
    ULONG references_ = 1;
};

}  // namespace

HRESULT CoInitialize(LPVOID) {
    return S_OK;
}

HRESULT CoCreateInstance(REFCLSID classId, IUnknown*, DWORD, REFIID wanted, LPVOID* object) {
    if (classId != CLSID_ShellLink) {
        *object = nullptr;
        return REGDB_E_CLASSNOTREG;
    }
    auto* const link = new ShellLink;
    const HRESULT result = link->QueryInterface(wanted, object);
    link->Release();
    return result;
}

int MultiByteToWideChar(UINT, DWORD, LPCSTR text, int, wchar_t* buffer, int size) {
    const std::wstring wide = platform::WideFromUtf8(text);
    if (wide.size() >= static_cast<std::size_t>(size)) {
        SetLastError(ERROR_INSUFFICIENT_BUFFER);
        return 0;
    }
    std::copy_n(wide.c_str(), wide.size() + 1, buffer);
    return static_cast<int>(wide.size() + 1);
}
