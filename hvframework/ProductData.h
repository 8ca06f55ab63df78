#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <vector>

namespace HVL {

/// What is known of one product or suite outside its package: a bag of string keys, a few of which have fields of their
/// own. A key that is absent and one that is empty are the same thing.
class ProductData {
public:
    ProductData() = default;

    /// The order of display: by display name, then identifier, then version, the last by its numbers.
    virtual bool operator<(const ProductData& other) const;

    /// Adds the members of the JSON object `json` to the record, which is not cleared first. Members that are neither
    /// strings nor the array "installed_file_paths" are passed over. Returns false on a syntax error, or when values
    /// nest more than a hundred deep, with the record as it was. Throws std::runtime_error when the text is JSON but no
    /// object, when a path in that array is no string, and for a number that no double can hold.
    [[nodiscard]] bool ReadJSON(const std::string& json);

    /// Stores `value` in the key's own field, or in `values`. The paths of "installed_file_paths" come only through
    /// ReadJSON: a text under that key goes into `values` and hides them from GetValue.
    void SetValue(const std::string& key, const std::string& value);

    /// The key's text: from `values` if it is there, else from the key's own field, else empty.
    [[nodiscard]] std::string GetValue(const std::string& key) const;

    [[nodiscard]] std::string GetIdentifier() const;
    [[nodiscard]] std::string GetVersion() const;
    [[nodiscard]] std::string GetDisplayName() const;

    /// The number in "product_type", of which 0 marks a suite; -1 when the text is empty.
    [[nodiscard]] std::int32_t GetProductType() const;

    /// `installedFilePaths` as an array text, `[ "a",  "b"]`. Nothing in a path is escaped.
    [[nodiscard]] std::string GetInstalledFilePathsText() const;

    std::map<std::string, std::string> values;
    std::int32_t installState = -1;
    std::string installedDatetime;
    bool uninstall = false;
    std::string upgrade;
    std::vector<std::string> installedFilePaths;
};

}  // namespace HVL
