#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string>

namespace platform {

/// The two versions that a program's file says of itself.
struct ProgramVersions {
    using Numbers = std::array<std::uint16_t, 4>;
    Numbers product{};
    Numbers file{};
};

/// Nothing when the file cannot be read, is no program, or carries no version block with the whole of both.
[[nodiscard]] std::optional<ProgramVersions> VersionsOfProgram(const std::string& path);

}  // namespace platform
