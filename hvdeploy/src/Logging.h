#pragma once

#include <string>

/// How the log categories come to life: from a property file, or in code from the arguments of a line.
namespace HV {

/// The path of the property file that the wizard obeys if there is one.
[[nodiscard]] std::string LoggingConfigOfTheMachine();

/// Writes a property file to `configPath` that logs to the console and to `logFileName` in `logDir`, with files of up
/// to 100 MiB and ten backups. An empty `logDir` means the default log folder; the folder is made if need be. Returns 1
/// when `configPath` could be opened for writing, else 0.
[[nodiscard]] int WriteLoggingConfig(const std::string& configPath, const std::string& logFileName,
                                     const std::string& logDir);

/// Hands the property file to log4cpp and writes a test line to each category. Returns 1 when log4cpp accepted the
/// file, else 0. What went wrong stands on standard error, a log file that cannot be opened too; nothing is thrown.
int ConfigureLogging(const std::string& configPath);

/// Sets the priority of `categoryName` from every argument that begins with `key` and "=", so that the last one wins.
/// Returns 1 when one of them set a priority, else 0. An unknown name gets a line on standard error.
int SetCategoryLevelFromArgs(std::string categoryName, int argc, const char* const* argv, const std::string& key);

}  // namespace HV
