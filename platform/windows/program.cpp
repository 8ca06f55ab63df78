#include "platform/program.h"

#include <algorithm>
#include <array>

#include "platform/windows/win32.h"

namespace platform {

std::string ProgramPath() {
    std::array<char, 260> path = {};
    GetModuleFileNameA(nullptr, path.data(), static_cast<DWORD>(path.size()));
    // The system may fill the buffer to its last character.
    return {path.begin(), std::find(path.begin(), path.end(), '\0')};
}

std::string CompiledResource(std::uint16_t number, const char* type) {
    const HRSRC found = FindResourceA(nullptr, MAKEINTRESOURCEA(number), type);
    const HGLOBAL loaded = found != nullptr ? LoadResource(nullptr, found) : nullptr;
    if (loaded == nullptr) {
        return {};
    }
    const auto* bytes = static_cast<const char*>(LockResource(loaded));
    // No zero ends it: its size is the only end that it has.
    std::string content(bytes, bytes != nullptr ? SizeofResource(nullptr, found) : 0);
    FreeResource(loaded);
    return content;
}

}  // namespace platform
