#pragma once

#include <string>

/// What the wizard does before its first window, as far as no window is needed.
namespace HV {

class WizardToolkit;

/// The full path of this program, as the system knows it, cut at 260 characters. The only function of its source, so
/// that a program which stands for another, as tests do, can bring its own.
[[nodiscard]] std::string ProgramPath();

/// The folder "packages" beside this program, whether or not it exists.
[[nodiscard]] std::string PackagesDirectoryPath();

/// Configures logging from the property file that stands in ProgramData or, when there is none, from a new one in a new
/// temporary folder. Both categories log from DEBUG on afterwards. Failures stand on standard error and stop nothing.
void StartLogging();

/// Tells the user and ends the process, with status 0, unless the packages folder is there.
void RequirePackagesDirectory(WizardToolkit& toolkit);

}  // namespace HV
