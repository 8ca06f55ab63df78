#pragma once

#include <tinyxml.h>

#include <string>

namespace HVL {

/// Reads a text into `document`, whatever its bytes are. Gives an empty text, or what is wrong with it: a text that the
/// XML library would not survive (hvframework/XmlNesting.h) is not read at all.
[[nodiscard]] std::string ReadXml(const std::string& text, TiXmlDocument& document);

}  // namespace HVL
