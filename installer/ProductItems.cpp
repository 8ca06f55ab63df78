#include "installer/ProductItems.h"

#include <algorithm>

namespace HV {

int CheckedCount(const std::vector<ProductItem>& items) {
    return static_cast<int>(
        std::count_if(items.begin(), items.end(), [](const ProductItem& item) { return item.checked; }));
}

std::vector<std::string> UncheckedIdentifiers(const std::vector<ProductItem>& items) {
    std::vector<std::string> identifiers;
    for (const ProductItem& item : items) {
        if (!item.checked) {
            identifiers.push_back(item.identifier);
        }
    }
    return identifiers;
}

}  // namespace HV
