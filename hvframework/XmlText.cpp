#include "hvframework/XmlText.h"

#include "hvframework/XmlNesting.h"

namespace HVL {

/// The library trusts its input in ways that a text from outside must not be trusted in: it steps over the end of one
/// that stops within a character, hence the zeros after it, goes as deep as elements are nested, and takes time and
/// memory as the text wants.
std::string ReadXml(const std::string& text, TiXmlDocument& document) {
    const std::string padded = text + std::string(kXmlPadding, '\0');
    if (std::string excess = ExcessOfXml(padded); !excess.empty()) {
        return excess;
    }
    document.Parse(padded.c_str(), nullptr, TIXML_ENCODING_UNKNOWN);
    return document.Error() ? document.ErrorDesc() : "";
}

}  // namespace HVL
