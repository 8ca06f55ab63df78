#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

/// The bytes of a file in the source tree's resources folder. Fails the test when it cannot be read or is empty.
std::string ResourceFile(const std::string& name);

/// The number of 16 or 32 bits at `position`, least significant byte first. Throws std::out_of_range beyond the end.
std::uint32_t Number16(const std::string& bytes, std::size_t position);
std::uint32_t Number32(const std::string& bytes, std::size_t position);
