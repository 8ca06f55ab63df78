#pragma once

#include "platform/hosted/win32.h"

/// The part of COM that makes a shell link, under the platform's names, and only what the logic calls.
///
/// A link is saved as a real link file, in the form that the shell reads (see link_file.h). One object is used by one
/// thread.

using HRESULT = LONG;
using ULONG = std::uint32_t;
using UINT = unsigned int;
using LPCWSTR = const wchar_t*;
using LPOLESTR = wchar_t*;
using LPCOLESTR = const wchar_t*;

inline constexpr HRESULT S_OK = 0;
inline constexpr HRESULT S_FALSE = 1;
inline constexpr HRESULT E_NOINTERFACE = static_cast<HRESULT>(0x80004002);
inline constexpr HRESULT E_FAIL = static_cast<HRESULT>(0x80004005);
inline constexpr HRESULT E_INVALIDARG = static_cast<HRESULT>(0x80070057);
inline constexpr HRESULT REGDB_E_CLASSNOTREG = static_cast<HRESULT>(0x80040154);

constexpr bool SUCCEEDED(HRESULT result) {
    return result >= 0;
}
constexpr bool FAILED(HRESULT result) {
    return result < 0;
}

struct GUID {
    std::uint32_t Data1;
    std::uint16_t Data2;
    std::uint16_t Data3;
    std::uint8_t Data4[8];

    bool operator==(const GUID& other) const = default;
};
using REFIID = const GUID&;
using REFCLSID = const GUID&;

inline constexpr GUID IID_IUnknown{0x00000000, 0, 0, {0xC0, 0, 0, 0, 0, 0, 0, 0x46}};
inline constexpr GUID IID_IPersistFile{0x0000010B, 0, 0, {0xC0, 0, 0, 0, 0, 0, 0, 0x46}};
inline constexpr GUID IID_IShellLinkW{0x000214F9, 0, 0, {0xC0, 0, 0, 0, 0, 0, 0, 0x46}};
inline constexpr GUID CLSID_ShellLink{0x00021401, 0, 0, {0xC0, 0, 0, 0, 0, 0, 0, 0x46}};

struct IUnknown {
    virtual HRESULT QueryInterface(REFIID wanted, void** object) = 0;
    virtual ULONG AddRef() = 0;
    virtual ULONG Release() = 0;

protected:
    ~IUnknown() = default;
};

struct IShellLinkW : IUnknown {
    /// E_INVALIDARG, and no change, for a path that does not fit into MAX_PATH characters. It need not exist.
    virtual HRESULT SetPath(LPCWSTR path) = 0;
    virtual HRESULT SetDescription(LPCWSTR text) = 0;
    virtual HRESULT SetIconLocation(LPCWSTR path, int index) = 0;

protected:
    ~IShellLinkW() = default;
};

struct IPersistFile : IUnknown {
    /// Writes the link file at once, in place of one that is there. A failure leaves no half file.
    virtual HRESULT Save(LPCOLESTR path, BOOL remember) = 0;

protected:
    ~IPersistFile() = default;
};

inline constexpr std::size_t MAX_PATH = 260;
inline constexpr DWORD CLSCTX_INPROC_SERVER = 1;
inline constexpr UINT CP_ACP = 0;

/// Always succeeds: nothing has to be prepared.
HRESULT CoInitialize(LPVOID reserved);
/// Makes the object of CLSID_ShellLink; there are no others.
HRESULT CoCreateInstance(REFCLSID classId, IUnknown* outer, DWORD context, REFIID wanted, LPVOID* object);

/// `text` up to its terminator (`length` is -1) as wide text with a terminator. Returns the characters written; 0 when
/// `buffer`, of `size` characters, does not hold them. The narrow page is UTF-8.
int MultiByteToWideChar(UINT codePage, DWORD flags, LPCSTR text, int length, wchar_t* buffer, int size);
