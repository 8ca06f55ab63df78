#include <gtest/gtest.h>
#include <io.h>

#include <chrono>
#include <thread>

#include "tests/support/FolderAccess.h"
#include "tests/support/HostProgramWindows.h"
#include "tests/support/ScratchFile.h"

namespace {

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
    const bool started = StartOnHost(L"stat", L"stat --format=%a \"" + NameOnHost(folder) + L"\"", handle);
    const std::string rights = started ? LineIn(output) : std::string();
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
