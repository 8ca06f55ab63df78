#pragma once

#include <string>
#include <vector>

#include "package/ValidationTable.h"
#include "platform/filesystem.h"

/// The build validation table of a release, made from its package files: a C++ source that defines
/// HV::ValidationRows() and HV::ReleaseDigests(), for the programs that are to know these packages.
///
/// The same packages give the same source, whatever folder they lie in.
namespace HVPack {

struct ReleaseRow {
    std::string fileName;
    HV::ValidationInfo info;
    std::string sha256;
};

/// The packages directly in `folder`, sorted by file name; other files are passed over, as the installer does. One that
/// is named as a package but for upper case is among them, so that nobody ships it unnoticed. Throws PackageError when
/// `folder` is no folder, has no package, or has two that are one name to Windows; fs::filesystem_error when it cannot
/// be listed.
[[nodiscard]] std::vector<fs::path> PackagesIn(const fs::path& folder);

/// The row of one package. A package whose policy does not show it is no product of its own, and is called "None"; the
/// others are called by the display name of their product data, or by their identifier where that is missing, as the
/// wizard calls them. Throws what ValidatedPackage throws.
[[nodiscard]] ReleaseRow RowOf(const fs::path& package);

/// The source with `rows`, of which there is at least one, in their order. Any byte may stand in a text.
[[nodiscard]] std::string TableSource(const std::vector<ReleaseRow>& rows);

/// Makes `output` a file with this text. One that has it already is not touched, so that nothing which depends on it is
/// built again. The text is written to a file beside it that takes its place in the end: `output` is either what it was
/// or complete. Throws PackageError when it cannot be written, and for a name that is a package's.
void WriteSource(const fs::path& output, const std::string& text);

}  // namespace HVPack
