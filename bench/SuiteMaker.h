#pragma once

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <string>

namespace HVBench {

/// What is to be made; the same figures and the same seed give the same bytes.
struct SuiteShape {
    int packages = 1;
    int filesPerPackage = 1;
    std::size_t pluginSize = 0;    // of the first file of each package; 0 makes it one like the others
    std::size_t averageSize = 64;  // of the other files; they lie between a quarter of it and seven quarters
    bool lastFails = false;        // adds a package whose only payload has no place to go to
    std::uint64_t seed = 1;
};

/// Makes a packages folder: each package is written as a folder of files below `work` and packed by the program
/// `hvpack`. A package has one payload, the folder `payload`, for a folder of its own below "Program Files", and a
/// record for the history. Throws std::runtime_error when a package cannot be made.
void MakeSuite(const SuiteShape& shape, const std::string& hvpack, const std::filesystem::path& work,
               const std::filesystem::path& packages);

/// The file of the package that fails. Its name puts it into the last phase, after all others: within a phase packages
/// come in the order in which the folder lists them, which may be any.
inline constexpr const char* kFailingPackage = "postflight-fails.hvpkg";

/// `size` bytes that a packer brings to about half, as programs and presets are: words of a few bytes that come again,
/// between others that do not.
std::string MakeBytes(std::size_t size, std::uint64_t seed);

void WriteFile(const std::filesystem::path& path, const std::string& bytes);

}  // namespace HVBench
