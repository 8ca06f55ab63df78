#pragma once

#include <string_view>

namespace hosted {

/// Names of keys, values and variables, compared without regard to the case of ASCII letters.

/// True when `left` comes before `right`, in the order that both have in upper case.
struct LessIgnoringCase {
    using is_transparent = void;
    bool operator()(std::string_view left, std::string_view right) const;
};
bool EqualsIgnoringCase(std::string_view left, std::string_view right);

}  // namespace hosted
