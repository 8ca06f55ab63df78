#pragma once

#include <ostream>

#include "platform/rectangle.h"

/// Rectangles of the platform, as tests compare and print them.
inline bool operator==(const RECT& one, const RECT& other) {
    return one.left == other.left && one.top == other.top && one.right == other.right && one.bottom == other.bottom;
}

inline std::ostream& operator<<(std::ostream& stream, const RECT& rect) {
    return stream << "(" << rect.left << ", " << rect.top << ") to (" << rect.right << ", " << rect.bottom << ")";
}
