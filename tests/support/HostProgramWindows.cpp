#include "tests/support/HostProgramWindows.h"

#include <gtest/gtest.h>

#include "platform/utf8.h"

std::wstring NameOnHost(const std::string& path) {
    using NameFinder = char*(__cdecl*)(LPCWSTR);
    const FARPROC address = GetProcAddress(GetModuleHandleA("kernel32"), "wine_get_unix_file_name");
    if (address == nullptr) {
        ADD_FAILURE() << "this is not Wine";
        return {};
    }
    const auto find = reinterpret_cast<NameFinder>(reinterpret_cast<void*>(address));
    char* name = find(platform::WideFromUtf8(path).c_str());
    const std::wstring wide = platform::WideFromUtf8(name != nullptr ? name : "");
    HeapFree(GetProcessHeap(), 0, name);
    return wide;
}

bool StartOnHost(const std::wstring& name, std::wstring line, HANDLE output) {
    STARTUPINFOW start{};
    start.cb = sizeof start;
    if (output != nullptr) {
        SetHandleInformation(output, HANDLE_FLAG_INHERIT, HANDLE_FLAG_INHERIT);
        start.dwFlags = STARTF_USESTDHANDLES;
        start.hStdOutput = output;
    }
    // Wine gives no handles of a program of the host: the record then holds by chance what may be somebody else's.
    PROCESS_INFORMATION process{};
    if (!CreateProcessW((L"Z:\\usr\\bin\\" + name).c_str(), line.data(), nullptr, nullptr, TRUE, 0, nullptr, nullptr,
                        &start, &process)) {
        ADD_FAILURE() << "cannot start " << platform::Utf8FromWide(name) << ": " << GetLastError();
        return false;
    }
    return true;
}
