#include "platform/command_processor.h"

#include <stdexcept>

#include "platform/filesystem.h"
#include "platform/hosted/win32.h"

namespace platform {
namespace {

constexpr const char* systemFolder = R"(C:\Windows\System32)";

}  // namespace

// Here _popen starts /bin/sh by its full name, which asks neither of these variables and looks into the current folder
// only where the search path says so. What the machine's programs see is what they would see on Windows.
void UseSystemCommandProcessor() {
    SetEnvironmentVariableA("COMSPEC", (std::string(systemFolder) + "\\cmd.exe").c_str());
    SetEnvironmentVariableA("NoDefaultCurrentDirectoryInExePath", "1");
}

void EnterSystemFolder() {
    boost::system::error_code error;
    fs::current_path(fs::path(systemFolder), error);
    if (error) {
        throw std::runtime_error("the system's folder cannot be made the current one");
    }
}

}  // namespace platform
