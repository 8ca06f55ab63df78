#include "platform/hosted/ignoring_case.h"

#include <algorithm>

namespace hosted {
namespace {

unsigned char UpperCase(char c) {
    return static_cast<unsigned char>(c >= 'a' && c <= 'z' ? c - 'a' + 'A' : c);
}

}  // namespace

bool LessIgnoringCase::operator()(std::string_view left, std::string_view right) const {
    return std::lexicographical_compare(left.begin(), left.end(), right.begin(), right.end(),
                                        [](char a, char b) { return UpperCase(a) < UpperCase(b); });
}

bool EqualsIgnoringCase(std::string_view left, std::string_view right) {
    return std::equal(left.begin(), left.end(), right.begin(), right.end(),
                      [](char a, char b) { return UpperCase(a) == UpperCase(b); });
}

}  // namespace hosted
