#include <algorithm>
#include <array>

#include "installer/StartUp.h"
#include "platform/win32.h"

namespace HV {

std::string ProgramPath() {
    std::array<char, 260> path = {};
    GetModuleFileNameA(nullptr, path.data(), static_cast<DWORD>(path.size()));
    // The system may fill the buffer to its last character.
    return {path.begin(), std::find(path.begin(), path.end(), '\0')};
}

}  // namespace HV
