#pragma once

#include <cstddef>
#include <string>

namespace HVL {

/// What the XML library would have to cope with if it read a text.
struct XmlShape {
    /// Elements within elements; the library reads, copies and frees them by recursion.
    std::size_t deepest = 0;
    /// Attributes of the element that has the most; the library looks at all before it takes another.
    std::size_t mostAttributes = 0;
};

/// The shape of this text.
///
/// Neither number is ever less than what the library reaches, also on text that is no XML, whatever its encoding.
/// `text` must end in kXmlPadding zero bytes besides the one that ends the string: the library may step over that one.
[[nodiscard]] XmlShape MeasureXml(const std::string& text);

/// Why the library must not read this text, which ends as above: its length, its depth or its attributes, in words.
/// Empty when it may.
[[nodiscard]] std::string ExcessOfXml(const std::string& text);

/// No text of ours nests as deep, a manifest six levels and others less. Beyond some thousands the library runs out of
/// stack.
inline constexpr std::size_t kDeepestElement = 200;

/// No element of ours has more than a handful. The library's time for one grows with their square.
inline constexpr std::size_t kMostAttributes = 256;

/// Bytes of text. The library's tree takes up to 80 times as much memory.
inline constexpr std::size_t kLongestXml = std::size_t{4} << 20;

/// The longest character of UTF-8.
inline constexpr std::size_t kXmlPadding = 4;

}  // namespace HVL
