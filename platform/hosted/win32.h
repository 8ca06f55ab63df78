#pragma once

#include <cerrno>
#include <cstdint>
#include <cstdio>

/// The platform's names over the hosted machine (machine.h), with the values and the behaviour that Windows 10 gives.
///
/// What no logic calls is not here. Every call may come from any thread. Results, sizes and last errors are those of
/// Windows; where a call of the runtime fails, `errno` is what Microsoft's runtime would leave there.

using BOOL = int;
using BYTE = std::uint8_t;
using WORD = std::uint16_t;
using DWORD = std::uint32_t;
using LONG = std::int32_t;
using LSTATUS = LONG;
using REGSAM = DWORD;
using LPBYTE = BYTE*;
using LPDWORD = DWORD*;
using LPSTR = char*;
using LPCSTR = const char*;
using LPVOID = void*;
using PVOID = void*;
using LPCVOID = const void*;
using errno_t = int;
using HANDLE = void*;
using PHANDLE = HANDLE*;

struct HINSTANCE__;
using HMODULE = HINSTANCE__*;
using PHMODULE = HMODULE*;

struct HKEY__;
using HKEY = HKEY__*;
using PHKEY = HKEY*;

struct FILETIME {
    DWORD dwLowDateTime;
    DWORD dwHighDateTime;
};
using PFILETIME = FILETIME*;

struct SECURITY_ATTRIBUTES;
using LPSECURITY_ATTRIBUTES = SECURITY_ATTRIBUTES*;

#define TRUE 1
#define FALSE 0

inline constexpr LONG ERROR_SUCCESS = 0;
inline constexpr LONG ERROR_FILE_NOT_FOUND = 2;
inline constexpr LONG ERROR_PATH_NOT_FOUND = 3;
inline constexpr LONG ERROR_TOO_MANY_OPEN_FILES = 4;
inline constexpr LONG ERROR_ACCESS_DENIED = 5;
inline constexpr LONG ERROR_INVALID_HANDLE = 6;
inline constexpr LONG ERROR_INVALID_DATA = 13;
inline constexpr LONG ERROR_WRITE_FAULT = 29;
inline constexpr LONG ERROR_SHARING_VIOLATION = 32;
inline constexpr LONG ERROR_INVALID_PARAMETER = 87;
inline constexpr LONG ERROR_DISK_FULL = 112;
inline constexpr LONG ERROR_INSUFFICIENT_BUFFER = 122;
inline constexpr LONG ERROR_INVALID_NAME = 123;
inline constexpr LONG ERROR_DIR_NOT_EMPTY = 145;
inline constexpr LONG ERROR_BAD_PATHNAME = 161;
inline constexpr LONG ERROR_ALREADY_EXISTS = 183;
inline constexpr LONG ERROR_ENVVAR_NOT_FOUND = 203;
inline constexpr LONG ERROR_MORE_DATA = 234;
inline constexpr LONG ERROR_NO_MORE_ITEMS = 259;
inline constexpr LONG ERROR_DIRECTORY = 267;
inline constexpr LONG ERROR_KEY_DELETED = 1018;
inline constexpr LONG ERROR_UNSUPPORTED_TYPE = 1630;
inline constexpr LONG ERROR_RESOURCE_NAME_NOT_FOUND = 1814;

DWORD GetLastError();
void SetLastError(DWORD error);

// Handles of folders, processes and tokens, which the calls that open them describe.

#define INVALID_HANDLE_VALUE (reinterpret_cast<HANDLE>(static_cast<std::intptr_t>(-1)))

BOOL CloseHandle(HANDLE handle);

// Environment. Names are compared without regard to case; a variable of the process comes before the machine's own.

/// The length without the terminator, or the size needed with it when `size` is too small; 0 and
/// ERROR_ENVVAR_NOT_FOUND for a variable that is not set.
DWORD GetEnvironmentVariableA(LPCSTR name, LPSTR buffer, DWORD size);
/// A null `value` removes the variable, the machine's own value of that name too.
BOOL SetEnvironmentVariableA(LPCSTR name, LPCSTR value);

// Registry. A handle stays good until it is closed or the machine is changed for another.

// Handles are numbers in the shape of pointers, which no constant expression can hold: hence macros, as on Windows.
#define HKEY_CLASSES_ROOT (reinterpret_cast<HKEY>(static_cast<std::intptr_t>(static_cast<LONG>(0x80000000))))
#define HKEY_CURRENT_USER (reinterpret_cast<HKEY>(static_cast<std::intptr_t>(static_cast<LONG>(0x80000001))))
#define HKEY_LOCAL_MACHINE (reinterpret_cast<HKEY>(static_cast<std::intptr_t>(static_cast<LONG>(0x80000002))))
#define HKEY_USERS (reinterpret_cast<HKEY>(static_cast<std::intptr_t>(static_cast<LONG>(0x80000003))))
#define HKEY_PERFORMANCE_DATA (reinterpret_cast<HKEY>(static_cast<std::intptr_t>(static_cast<LONG>(0x80000004))))
#define HKEY_CURRENT_CONFIG (reinterpret_cast<HKEY>(static_cast<std::intptr_t>(static_cast<LONG>(0x80000005))))
#define HKEY_PERFORMANCE_TEXT (reinterpret_cast<HKEY>(static_cast<std::intptr_t>(static_cast<LONG>(0x80000050))))
#define HKEY_PERFORMANCE_NLSTEXT (reinterpret_cast<HKEY>(static_cast<std::intptr_t>(static_cast<LONG>(0x80000060))))

inline constexpr DWORD REG_NONE = 0;
inline constexpr DWORD REG_SZ = 1;
inline constexpr DWORD REG_EXPAND_SZ = 2;
inline constexpr DWORD REG_BINARY = 3;
inline constexpr DWORD REG_DWORD = 4;
inline constexpr DWORD REG_DWORD_BIG_ENDIAN = 5;
inline constexpr DWORD REG_LINK = 6;
inline constexpr DWORD REG_MULTI_SZ = 7;
inline constexpr DWORD REG_QWORD = 11;

inline constexpr REGSAM KEY_QUERY_VALUE = 0x0001;
inline constexpr REGSAM KEY_SET_VALUE = 0x0002;
inline constexpr REGSAM KEY_CREATE_SUB_KEY = 0x0004;
inline constexpr REGSAM KEY_ENUMERATE_SUB_KEYS = 0x0008;
inline constexpr REGSAM KEY_READ = 0x20019;
inline constexpr REGSAM KEY_WRITE = 0x20006;
inline constexpr REGSAM KEY_ALL_ACCESS = 0xF003F;

inline constexpr DWORD REG_OPTION_NON_VOLATILE = 0;
inline constexpr DWORD REG_CREATED_NEW_KEY = 1;
inline constexpr DWORD REG_OPENED_EXISTING_KEY = 2;

inline constexpr DWORD RRF_RT_REG_NONE = 0x0001;
inline constexpr DWORD RRF_RT_REG_SZ = 0x0002;
inline constexpr DWORD RRF_RT_REG_EXPAND_SZ = 0x0004;
inline constexpr DWORD RRF_RT_REG_BINARY = 0x0008;
inline constexpr DWORD RRF_RT_REG_DWORD = 0x0010;
inline constexpr DWORD RRF_RT_REG_MULTI_SZ = 0x0020;
inline constexpr DWORD RRF_RT_REG_QWORD = 0x0040;
inline constexpr DWORD RRF_RT_ANY = 0xFFFF;
inline constexpr DWORD RRF_NOEXPAND = 0x10000000;
inline constexpr DWORD RRF_ZEROONFAILURE = 0x20000000;

/// Creates every missing level of `subKey`. `disposition` may be null.
LSTATUS RegCreateKeyExA(HKEY key, LPCSTR subKey, DWORD reserved, LPSTR keyClass, DWORD options, REGSAM access,
                        LPSECURITY_ATTRIBUTES security, PHKEY result, LPDWORD disposition);
LSTATUS RegOpenKeyExA(HKEY key, LPCSTR subKey, DWORD options, REGSAM access, PHKEY result);
LSTATUS RegCloseKey(HKEY key);
/// The direct sub-keys in the registry's own order, which is that of their names without regard to case.
LSTATUS RegEnumKeyExA(HKEY key, DWORD index, LPSTR name, LPDWORD nameLength, LPDWORD reserved, LPSTR keyClass,
                      LPDWORD classLength, PFILETIME lastWriteTime);
/// Strings come terminated even if they are stored without a terminator; ERROR_MORE_DATA leaves the size needed in
/// `dataSize`. A REG_EXPAND_SZ is expanded and then reported as REG_SZ, unless RRF_NOEXPAND is given.
LSTATUS RegGetValueA(HKEY key, LPCSTR subKey, LPCSTR name, DWORD flags, LPDWORD type, PVOID data, LPDWORD dataSize);
LSTATUS RegSetValueExA(HKEY key, LPCSTR name, DWORD reserved, DWORD type, const BYTE* data, DWORD dataSize);
LSTATUS RegSetKeyValueA(HKEY key, LPCSTR subKey, LPCSTR name, DWORD type, LPCVOID data, DWORD dataSize);
/// Deletes `subKey` with all below it; without a `subKey` everything below `key`, and its values, but not `key`.
LSTATUS RegDeleteTreeA(HKEY key, LPCSTR subKey);

// The runtime's file calls. A read-only file refuses writing and deleting, whoever asks, and a file that is open
// refuses deleting.

/// Text mode writes LF as CR LF and reads CR LF as LF; "b" in `mode` switches that off. The stream is then used and
/// closed with the plain calls of <cstdio>. Returns 0, or an errno with `*stream` null. A `mode` is r, w or a, and
/// after it any of +, b and t.
errno_t fopen_s(FILE** stream, const char* path, const char* mode);
int _mkdir(const char* path);
int _unlink(const char* path);
BOOL RemoveDirectoryA(LPCSTR path);
int _isatty(int descriptor);
int _fileno(FILE* stream);
