#include "package/XmlReaders.h"

namespace HV {

bool GetAttribute(const TiXmlElement& element, const char* name, std::string& out) {
    out.clear();
    const char* value = element.Attribute(name);
    if (value == nullptr) {
        return false;
    }
    out = value;
    return true;
}

bool GetBoolAttribute(const TiXmlElement& element, const char* name, bool& out) {
    std::string value;
    if (!GetAttribute(element, name, value)) {
        return false;
    }
    out = value == "true" || value == "1";
    return true;
}

bool GetText(const TiXmlElement& element, std::string& out) {
    out.clear();
    for (const TiXmlNode* node = element.FirstChild(); node != nullptr; node = node->NextSibling()) {
        if (const TiXmlText* text = node->ToText()) {
            out = text->ValueStr();
            return true;
        }
    }
    return false;
}

bool GetChildText(const TiXmlElement& element, const char* name, std::string& out) {
    out.clear();
    const TiXmlElement* child = element.FirstChildElement(name);
    return child != nullptr && GetText(*child, out);
}

bool GetChildren(const TiXmlElement& element, const char* groupName, const char* itemName,
                 std::vector<const TiXmlElement*>& out) {
    out.clear();
    const TiXmlElement* group = element.FirstChildElement(groupName);
    if (group == nullptr) {
        return false;
    }
    for (auto item = group->FirstChildElement(itemName); item != nullptr; item = item->NextSiblingElement(itemName)) {
        out.push_back(item);
    }
    return !out.empty();
}

}  // namespace HV
