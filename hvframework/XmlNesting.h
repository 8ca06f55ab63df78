#pragma once

#include <cstddef>
#include <string>

namespace HVL {

/// How deep the XML library would nest elements if it read this text; it reads, copies and frees them by recursion.
///
/// Never less than the depth that the library reaches, also on text that is no XML, whatever its encoding. `text` must
/// end in kXmlPadding zero bytes besides the one that ends the string: the library may step over that one.
[[nodiscard]] std::size_t DeepestNesting(const std::string& text);

/// No text of ours nests as deep, a manifest six levels and others less. Beyond some thousands the library runs out of
/// stack.
inline constexpr std::size_t kDeepestElement = 200;

/// The longest character of UTF-8.
inline constexpr std::size_t kXmlPadding = 4;

}  // namespace HVL
