#include "package/ValidationTable.h"

#include <algorithm>

namespace HV {

void GetValidationFileNames(std::vector<std::string>& names, std::span<const ValidationRow> rows) {
    names.clear();
    for (const ValidationRow& row : rows) {
        names.emplace_back(row.fileName);
    }
}

void GetValidationInfo(const std::string& name, ValidationInfo& info, std::span<const ValidationRow> rows) {
    const auto row = std::ranges::find(rows, name, &ValidationRow::fileName);
    if (row != rows.end()) {
        info = {std::string(row->displayName), std::string(row->productId), std::string(row->version),
                std::string(row->md5)};
    }
}

std::string SecondDigestOf(const std::string& name, std::span<const ReleaseDigest> digests) {
    const auto found = std::ranges::find(digests, name, &ReleaseDigest::fileName);
    return found == digests.end() ? std::string() : std::string(found->sha256);
}

}  // namespace HV
