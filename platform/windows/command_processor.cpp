#include "platform/command_processor.h"

#include <cstdlib>
#include <stdexcept>
#include <string>

#include "platform/win32.h"

namespace platform {
namespace {

/// As the system itself knows it; the variables that name it are the user's to set.
std::wstring SystemFolder() {
    std::wstring folder(MAX_PATH, L'\0');
    const UINT length = GetSystemDirectoryW(folder.data(), static_cast<UINT>(folder.size()));
    if (length == 0 || length > folder.size()) {
        throw std::runtime_error("the system does not tell its folder");
    }
    folder.resize(length);
    return folder;
}

// Through the runtime, which keeps the variables once more and reads its own when it starts a command.
void Set(const wchar_t* name, const std::wstring& value) {
    if (_wputenv_s(name, value.c_str()) != 0) {
        throw std::runtime_error("the environment cannot be changed");
    }
}

}  // namespace

void UseSystemCommandProcessor() {
    Set(L"COMSPEC", SystemFolder() + L"\\cmd.exe");
    Set(L"NoDefaultCurrentDirectoryInExePath", L"1");
}

void EnterSystemFolder() {
    if (!SetCurrentDirectoryW(SystemFolder().c_str())) {
        throw std::runtime_error("the system's folder cannot be made the current one");
    }
}

}  // namespace platform
