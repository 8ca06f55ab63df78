#include <gtest/gtest.h>
#include <io.h>

#include <chrono>
#include <thread>

#include "platform/utf8.h"
#include "platform/win32.h"
#include "tests/support/FolderAccess.h"
#include "tests/support/ScratchFile.h"

namespace {

/// The host's name of a folder, which Wine knows.
std::wstring HostName(const std::string& folder) {
    using NameFinder = char*(__cdecl*)(LPCWSTR);
    const FARPROC address = GetProcAddress(GetModuleHandleA("kernel32"), "wine_get_unix_file_name");
    if (address == nullptr) {
        ADD_FAILURE() << "this is not Wine";
        return {};
    }
    const auto find = reinterpret_cast<NameFinder>(reinterpret_cast<void*>(address));
    char* name = find(platform::WideFromUtf8(folder).c_str());
    const std::wstring wide = platform::WideFromUtf8(name != nullptr ? name : "");
    HeapFree(GetProcessHeap(), 0, name);
    return wide;
}

/// The first line of the file, once it is there. Nobody can wait for a program of the host itself, and reading while it
/// writes would move the place where it writes: both have one.
std::string LineIn(int file) {
    using namespace std::chrono_literals;
    const auto deadline = std::chrono::steady_clock::now() + 30s;
    while (std::chrono::steady_clock::now() < deadline) {
        if (_filelengthi64(file) > 0) {
            const std::string text = ReadScratchFile(file);
            return text.substr(0, text.find('\n'));
        }
        std::this_thread::sleep_for(5ms);
    }
    return {};
}

/// What the host's own program says of the folder: its rights, in octal digits.
std::string RightsOf(const std::string& folder) {
    const int output = OpenScratchFile();
    const auto handle = reinterpret_cast<HANDLE>(_get_osfhandle(output));
    SetHandleInformation(handle, HANDLE_FLAG_INHERIT, HANDLE_FLAG_INHERIT);
    STARTUPINFOW start{};
    start.cb = sizeof start;
    start.dwFlags = STARTF_USESTDHANDLES;
    start.hStdOutput = handle;
    PROCESS_INFORMATION process{};
    std::wstring line = L"stat --format=%a \"" + HostName(folder) + L"\"";
    if (!CreateProcessW(L"Z:\\usr\\bin\\stat", line.data(), nullptr, nullptr, TRUE, 0, nullptr, nullptr, &start,
                        &process)) {
        ADD_FAILURE() << "cannot start stat: " << GetLastError();
        return {};
    }
    // For a program of the host Wine gives no handles: what stands in the record by chance may be those of the scratch
    // file.
    const std::string rights = LineIn(output);
    _close(output);
    return rights;
}

}  // namespace

bool OthersMayWrite(const Machine&, const std::string& folder) {
    const std::string rights = RightsOf(folder);
    if (rights.size() < 3) {
        ADD_FAILURE() << "the rights of " << folder << " are not known: " << rights;
        return false;
    }
    // The group's digit: there Wine keeps what the group of users may do.
    const int ofGroup = rights[rights.size() - 2] - '0';
    return (ofGroup & 2) != 0;
}
