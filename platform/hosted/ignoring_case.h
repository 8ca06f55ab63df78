#pragma once

#include <string_view>

namespace hosted {

/// Names as the platform compares them: UTF-8, without regard to case. Letters outside of ASCII have the upper case
/// that this system knows for them.

/// True when `left` comes before `right`, in the order that both have in upper case.
struct LessIgnoringCase {
    using is_transparent = void;
    bool operator()(std::string_view left, std::string_view right) const;
};
bool EqualsIgnoringCase(std::string_view left, std::string_view right);

}  // namespace hosted
