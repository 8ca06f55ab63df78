#pragma once

#include <cstdint>
#include <string>

namespace platform {

/// This program's full path, or the first 260 characters of it. Hosted it is on drive C in the machine's folder, and on
/// drive Z outside of it.
[[nodiscard]] std::string ProgramPath();

/// The bytes of the resource of this number and type, whatever the case of the type's name, that this program's build
/// has given it; empty when there is none such.
[[nodiscard]] std::string CompiledResource(std::uint16_t number, const char* type);

}  // namespace platform
