// Two version texts, separated by the first line feed, read and compared.
#include "hvframework/Version.h"

#include "fuzz/Fuzzing.h"

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text = fuzzing::Text(data, size);
    const std::size_t end = text.find('\n');
    const HVL::Version left(text.substr(0, end));
    const HVL::Version right(end == std::string::npos ? text : text.substr(end + 1));
    const bool less = left.IsLess(right);
    const bool equal = left.IsEqual(right);
    fuzzing::Demand(int(less) + int(equal) + int(right.IsLess(left)) == 1, "two versions are in one order");
    fuzzing::Demand(left.IsLessOrEqual(right) == (less || equal), "less or equal is what it says");
    fuzzing::Demand(left.IsGreater(right) == right.IsLess(left), "greater is less from the other side");
    fuzzing::Demand(left.IsGreaterOrEqual(right) == !less, "greater or equal is not less");
    std::int32_t major = 0;
    std::int32_t minor = 0;
    std::int32_t patch = 0;
    left.GetShortParts(major, minor, patch);
    return 0;
}
