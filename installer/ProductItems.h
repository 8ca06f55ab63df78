#pragma once

#include <string>
#include <vector>

/// The products that the user chooses from, and what is chosen. No window is needed.
namespace HV {

/// One product on the selection page.
struct ProductItem {
    std::string displayName;  // UTF-8
    std::string identifier;
    bool checked = false;
    bool enabled = false;  // whether the user may change `checked`
};

/// How many items are checked, enabled or not.
[[nodiscard]] int CheckedCount(const std::vector<ProductItem>& items);

/// The identifiers of the items that are not checked, in order; those that cannot be checked too.
[[nodiscard]] std::vector<std::string> UncheckedIdentifiers(const std::vector<ProductItem>& items);

}  // namespace HV
