// The suite file of a release, and a file of the history folder: JSON.
#include <stdexcept>

#include "fuzz/Fuzzing.h"
#include "hvframework/ProductData.h"

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    HVL::ProductData product;
    try {
        static_cast<void>(product.ReadJSON(fuzzing::Text(data, size)));
    } catch (const std::runtime_error&) {
        // JSON, but none that tells of a product.
    }
    static_cast<void>(product.GetProductType());
    static_cast<void>(product.GetInstalledFilePathsText());
    fuzzing::Demand(!(product < product), "no product comes before itself");
    return 0;
}
