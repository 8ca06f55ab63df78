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

/// Fills `names` with the file names of the packages, in table order.
void GetValidationFileNames(std::vector<std::string>& names, std::span<const ValidationRow> rows = ValidationRows());

/// Fills `info` with the row of a file name, compared exactly; leaves it alone for a name that is not in the table.
void GetValidationInfo(const std::string& name, ValidationInfo& info,
                       std::span<const ValidationRow> rows = ValidationRows());

/// A package's second digest, as it stands in the source. MD5 tells a broken file from a good one; that nobody has made
/// another file for the same digest is what this one is for. The list stands beside the rows and names the same files.
struct ReleaseDigest {
    std::string_view fileName;
    std::string_view sha256;  // of the whole package file: 64 hexadecimal digits, lower case
};

/// The second digests of this build.
std::span<const ReleaseDigest> ReleaseDigests();

/// The second digest of a file name, compared exactly; empty for a name that is not in the list.
[[nodiscard]] std::string SecondDigestOf(const std::string& name,
                                         std::span<const ReleaseDigest> digests = ReleaseDigests());

}  // namespace HV
