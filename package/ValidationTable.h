#pragma once

#include <span>
#include <string>
#include <string_view>
#include <vector>

/// The packages that this build may install, compiled in.
///
/// The rows are data of a release and come from a source of their own (package/ValidationRows.cpp, of a build without
/// release rows, or one that is made from the package files). The command-line form does not consult the table.
namespace HV {

struct ValidationInfo {
    std::string displayName;  // "None" for a package that is no product of its own
    std::string productId;
    std::string version;
    std::string md5;  // of the whole package file: 32 hexadecimal digits, lower case
};

/// Fills `names` with the file names of the packages, in table order.
void GetValidationFileNames(std::vector<std::string>& names);

/// Fills `info` with the row of a file name, compared exactly; leaves it alone for a name that is not in the table.
void GetValidationInfo(const std::string& name, ValidationInfo& info);

/// A row as it stands in the source.
struct ValidationRow {
    std::string_view fileName;
    std::string_view displayName;
    std::string_view productId;
    std::string_view version;
    std::string_view md5;
};

/// The rows of this build, in table order.
std::span<const ValidationRow> ValidationRows();

}  // namespace HV
