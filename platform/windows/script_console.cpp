#include "platform/windows/script_console.h"

#include <fcntl.h>

#include <array>
#include <cstddef>
#include <string>
#include <vector>

namespace platform {

namespace {

constexpr int kTries = 500;
constexpr DWORD kBetweenTries = 10;  // milliseconds

HANDLE HandleOf(FILE* stream) {
    const int descriptor = _fileno(stream);
    // NOLINTNEXTLINE(performance-no-int-to-ptr): the runtime gives handles as numbers.
    return descriptor < 0 ? INVALID_HANDLE_VALUE : reinterpret_cast<HANDLE>(_get_osfhandle(descriptor));
}

// Runtimes differ in what they open where there is nothing: no descriptor, or one onto no handle. Neither has a type.
bool LeadsSomewhere(FILE* stream) {
    return ::GetFileType(HandleOf(stream)) != FILE_TYPE_UNKNOWN;
}

// A program without streams has streams of the runtime that have no descriptor, which freopen refuses or opens under
// some other number. The numbers matter: what the runtime starts gets 0, 1 and 2.
void OpenUnlessItLeadsSomewhere(int number, FILE* stream, const char* mode, DWORD standard) {
    if (LeadsSomewhere(stream)) {
        return;
    }
    const int nowhere = _open("NUL", _O_RDWR);
    if (nowhere < 0) {
        return;
    }
    if (nowhere != number) {
        _dup2(nowhere, number);
        _close(nowhere);
    }
    FILE* const opened = _fileno(stream) < 0 ? _fdopen(number, mode) : nullptr;
    if (opened != nullptr) {
        *stream = *opened;
    }
    // The runtime does this by itself for console programs alone, and not every reader asks the runtime.
    ::SetStdHandle(standard, HandleOf(stream));
}

// The command processor of the system, and no other that a search path might lead to: this program runs with high
// rights.
std::wstring CommandProcessor() {
    std::array<wchar_t, MAX_PATH> folder{};
    const UINT length = ::GetSystemDirectoryW(folder.data(), static_cast<UINT>(folder.size()));
    return std::wstring(folder.data(), length) + L"\\cmd.exe";
}

HANDLE NullDevice(SECURITY_ATTRIBUTES& security) {
    return ::CreateFileW(L"NUL", GENERIC_WRITE, FILE_SHARE_READ | FILE_SHARE_WRITE, &security, OPEN_EXISTING, 0,
                         nullptr);
}

void Close(HANDLE& handle) {
    if (handle != nullptr && handle != INVALID_HANDLE_VALUE) {
        ::CloseHandle(handle);
    }
    handle = nullptr;
}

// Starts it without a window, with these two handles and no other: it must not keep the log of this program open, nor
// anything else. Gives nothing when that fails.
PROCESS_INFORMATION StartCommandProcessor(HANDLE input, HANDLE output) {
    SIZE_T size = 0;
    ::InitializeProcThreadAttributeList(nullptr, 1, 0, &size);
    std::vector<std::byte> room(size);
    auto* const attributes = reinterpret_cast<LPPROC_THREAD_ATTRIBUTE_LIST>(room.data());
    std::array<HANDLE, 2> handed{input, output};
    PROCESS_INFORMATION made{};
    if (::InitializeProcThreadAttributeList(attributes, 1, 0, &size) == FALSE) {
        return made;
    }
    ::UpdateProcThreadAttribute(attributes, 0, PROC_THREAD_ATTRIBUTE_HANDLE_LIST, handed.data(),
                                handed.size() * sizeof(HANDLE), nullptr, nullptr);
    STARTUPINFOEXW start{};
    start.StartupInfo.cb = sizeof start;
    start.StartupInfo.dwFlags = STARTF_USESTDHANDLES;
    start.StartupInfo.hStdInput = input;
    start.StartupInfo.hStdOutput = output;
    start.StartupInfo.hStdError = output;
    start.lpAttributeList = attributes;
    std::wstring line = L"cmd.exe /d /q";
    ::CreateProcessW(CommandProcessor().c_str(), line.data(), nullptr, nullptr, TRUE,
                     CREATE_NO_WINDOW | EXTENDED_STARTUPINFO_PRESENT, nullptr, nullptr, &start.StartupInfo, &made);
    ::DeleteProcThreadAttributeList(attributes);
    Close(made.hThread);
    return made;
}

bool HasConsole() {
    return ::GetConsoleCP() != 0;
}

}  // namespace

void OpenMissingStandardStreams() {
    OpenUnlessItLeadsSomewhere(0, stdin, "r", STD_INPUT_HANDLE);
    OpenUnlessItLeadsSomewhere(1, stdout, "w", STD_OUTPUT_HANDLE);
    OpenUnlessItLeadsSomewhere(2, stderr, "w", STD_ERROR_HANDLE);
}

WindowlessConsole::WindowlessConsole() {
    if (!HasConsole()) {
        StartOwner();
    }
}

WindowlessConsole::~WindowlessConsole() {
    ReleaseOwner();
}

void WindowlessConsole::ReleaseOwner() {
    Close(input_);
    Close(owner_);
}

void WindowlessConsole::StartOwner() {
    SECURITY_ATTRIBUTES inherited{sizeof inherited, nullptr, TRUE};
    HANDLE itsInput = nullptr;
    if (::CreatePipe(&itsInput, &input_, &inherited, 0) == FALSE) {
        return;
    }
    ::SetHandleInformation(input_, HANDLE_FLAG_INHERIT, 0);
    HANDLE nowhere = NullDevice(inherited);
    const PROCESS_INFORMATION made = StartCommandProcessor(itsInput, nowhere);
    owner_ = made.hProcess;
    ownerId_ = made.dwProcessId;
    Close(itsInput);
    Close(nowhere);
}

bool WindowlessConsole::Join() {
    const bool joined = HasConsole() || JoinOwner();
    ReleaseOwner();
    if (joined) {
        return true;
    }
    if (::AllocConsole() == FALSE) {
        return false;
    }
    ::ShowWindow(::GetConsoleWindow(), SW_HIDE);
    return true;
}

bool WindowlessConsole::JoinOwner() const {
    for (int tried = 0; owner_ != nullptr && tried < kTries; ++tried) {
        if (::AttachConsole(ownerId_) != FALSE) {
            return true;
        }
        // A program may have been given a console that leads nowhere; it lets go of that first.
        if (::GetLastError() == ERROR_ACCESS_DENIED) {
            ::FreeConsole();
        }
        // Not yet: the command processor has to come to life first. If it ends, it never will.
        if (::WaitForSingleObject(owner_, kBetweenTries) == WAIT_OBJECT_0) {
            return false;
        }
    }
    return false;
}

}  // namespace platform
