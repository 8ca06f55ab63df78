#include <gtest/gtest.h>

#include <chrono>
#include <thread>

#include "platform/utf8.h"
#include "platform/win32.h"
#include "tests/support/HostLink.h"

namespace {

/// The host's name of a path whose folder is there, which Wine knows.
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

/// Has the host run the line by the program of this name, until there is something at `path` or, as told, nothing.
/// Nobody can wait for a program of the host itself.
void RunOnHost(const wchar_t* program, std::wstring line, const std::string& path, bool isThere) {
    using namespace std::chrono_literals;
    STARTUPINFOW start{};
    start.cb = sizeof start;
    PROCESS_INFORMATION process{};
    if (!CreateProcessW(program, line.data(), nullptr, nullptr, FALSE, 0, nullptr, nullptr, &start, &process)) {
        ADD_FAILURE() << "cannot start " << platform::Utf8FromWide(program) << ": " << GetLastError();
        return;
    }
    CloseHandle(process.hThread);
    CloseHandle(process.hProcess);
    const std::wstring name = platform::WideFromUtf8(path);
    const auto deadline = std::chrono::steady_clock::now() + 60s;
    while ((GetFileAttributesW(name.c_str()) != INVALID_FILE_ATTRIBUTES) != isThere) {
        if (std::chrono::steady_clock::now() > deadline) {
            ADD_FAILURE() << "the host has not done it: " << platform::Utf8FromWide(line);
            return;
        }
        std::this_thread::sleep_for(5ms);
    }
}

}  // namespace

HostLink::HostLink(const Machine&, const std::string& path, const std::string& target) : path_(path) {
    const std::wstring line = L"ln -sT \"" + NameOnHost(target) + L"\" \"" + NameOnHost(path) + L"\"";
    RunOnHost(L"Z:\\usr\\bin\\ln", line, path, true);
}

HostLink::~HostLink() {
    RunOnHost(L"Z:\\usr\\bin\\rm", L"rm -f \"" + NameOnHost(path_) + L"\"", path_, false);
}
