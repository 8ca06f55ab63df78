#pragma once

#include <tinyxml.h>

#include <string>
#include <vector>

/// Small readers over an XML element. Names are compared exactly; of children with one name the first counts.
namespace HV {

/// Clears `out` and gives it the attribute's value; returns whether there is such an attribute.
bool GetAttribute(const TiXmlElement& element, const char* name, std::string& out);

/// Gives `out` whether the attribute's value is "true" or "1"; an absent one leaves `out` alone. Returns its presence.
bool GetBoolAttribute(const TiXmlElement& element, const char* name, bool& out);

/// Clears `out` and gives it the text of the child element; returns whether that child has a text node.
bool GetChildText(const TiXmlElement& element, const char* name, std::string& out);

/// Clears `out` and gathers the children `itemName` of the first child `groupName`; returns whether there are any. The
/// elements belong to the document.
bool GetChildren(const TiXmlElement& element, const char* groupName, const char* itemName,
                 std::vector<const TiXmlElement*>& out);

/// Clears `out` and gives it the element's own text: its first text node, comments before it stepped over.
bool GetText(const TiXmlElement& element, std::string& out);

}  // namespace HV
