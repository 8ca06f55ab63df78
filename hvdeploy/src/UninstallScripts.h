#pragma once

#include <cstdint>
#include <string>
#include <unordered_set>
#include <vector>

#include "hvframework/ProductData.h"
#include "package/Package.h"

/// The way of removal that a run leaves behind: a batch file for the product, and the entry in the system's list of
/// installed programs that runs it.
namespace HV {

/// The folder of the batch files. It is a fixed place and not looked up in the environment.
extern const char* const kUninstallScriptFolder;

/// The path of the batch file for `product`, or for the package alone when the product has no identifier or version.
std::string GetUninstallScriptPath(const Package& package, const HVL::ProductData& product);

/// Enters `product` in the system's list of installed programs, with `scriptPath` as its command of removal. Does
/// nothing when the script does not exist or IsRefused(), or when the entry cannot be made.
void OSRegisterUninstall(const std::string& scriptPath, const HVL::ProductData& product);

/// Writes batch files segment by segment, one for each package of a product.
///
/// It remembers the lines of the script that it wrote last, so that a run over many packages does not read a growing
/// file again for each. A script whose size has changed meanwhile is read anew. Not thread-safe.
class UninstallScripts {
public:
    /// Appends the package's segment, in which the script deletes `installedFiles` (and `extraPath`, unless it is
    /// empty) itself. `scriptPath` is filled in when it is empty. Always returns true: a script that cannot be written
    /// does not fail an installation that has succeeded.
    bool WriteStandaloneUninstallScript(std::string& scriptPath, const std::vector<std::string>& installedFiles,
                                        const Package& package, const HVL::ProductData& product,
                                        const std::string& extraPath);

    /// Appends the package's segment, in which the script calls the separate uninstaller; a package that the script
    /// names already is left alone. Otherwise as above.
    bool WriteServiceUninstallScript(std::string& scriptPath, const Package& package, const HVL::ProductData& product);

private:
    using Lines = std::unordered_set<std::string>;

    bool ReadExistingLines(const std::string& scriptPath);
    void Append(const std::string& scriptPath, const std::string& text);

    std::string knownPath;
    std::uint64_t knownSize = 0;
    Lines knownLines;
};

}  // namespace HV
