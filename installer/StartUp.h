#pragma once

#include <string>

/// What the wizard does before its first window, as far as no window is needed.
namespace HV {

class WizardToolkit;

/// The full path of this program, as the system knows it, cut at 260 characters.
[[nodiscard]] std::string ProgramPath();

/// The folder "packages" beside a program, whether or not it exists.
[[nodiscard]] std::string PackagesDirectoryPath(const std::string& programPath = ProgramPath());

/// Sees to the folders that the wizard and the engine read from (GuardedFolders), then configures logging from the
/// property file that stands in ProgramData or, when there is none, from a new one in a new temporary folder. Both
/// categories log from DEBUG on afterwards. Failures stand on standard error and stop nothing.
void StartLogging();

/// Tells the user and ends the process, with status 0, unless the packages folder is there.
void RequirePackagesDirectory(WizardToolkit& toolkit, const std::string& packagesDirectory);

}  // namespace HV
