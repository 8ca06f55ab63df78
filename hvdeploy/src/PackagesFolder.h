#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "hvframework/ProductData.h"
#include "platform/filesystem.h"

/// A folder of packages: which of its files a run reads, and what each of them is to it.
namespace HV {

/// What the name of a suite file ends in.
inline constexpr const char* kSuiteEnding = ".json";

/// Whether a file is named as a suite, in any case of its ending.
[[nodiscard]] bool IsNamedAsSuite(const fs::path& file);

/// Whether a run over a folder reads a file of this name: a package or a suite, in any case of its ending.
[[nodiscard]] bool IsReadByRun(const fs::path& file);

/// Hands every regular file directly in `folder` to `take`, in the system's order. Throws what the filesystem library
/// throws when the folder cannot be listed to its end; the files until then have been handed over.
void ForEachFile(const fs::path& folder, const std::function<void(const fs::path&)>& take);

/// What a run finds in a folder.
struct PackagesFolder {
    std::vector<fs::path> preflightPackages;
    std::vector<fs::path> mainPackages;
    std::vector<fs::path> postflightPackages;
    // Those that a suite could be made of: none, so a folder without a suite file has no suite.
    std::vector<fs::path> synthesisPackages;
    fs::path suitePath;              // empty without a suite file
    std::uint64_t packageBytes = 0;  // of all packages
    bool hasStranger = false;        // a file that would be read is none of the accepted names
};

/// Walks over `dir` and sorts what it finds. With `acceptedNames` each file of another name that would be read gets a
/// line in the log and is left out. Throws what ForEachFile throws, and when the size of a package cannot be told.
[[nodiscard]] PackagesFolder ReadPackagesFolder(const fs::path& dir,
                                                const std::optional<std::set<std::string>>& acceptedNames);

/// Reads the suite file into `suite`. False without a word when it cannot be read, else as TakeSuiteText().
bool ReadSuiteFile(const fs::path& suitePath, HVL::ProductData& suite);

/// Reads `text` into `suite`, and returns whether it is that of a suite; what is wrong stands in the log as the fault
/// of `suitePath`. Throws what the library throws for JSON that is no object.
bool TakeSuiteText(const std::string& text, const fs::path& suitePath, HVL::ProductData& suite);

}  // namespace HV
