#include "system/XMLStringsResource.h"

#include <tinyxml.h>

#include <iostream>
#include <utility>

#include "hvframework/XmlText.h"
#include "platform/program.h"

namespace HV {
namespace {

using Texts = std::map<std::string, std::string>;

/// The wizard has no choice of languages.
constexpr const char* kLanguage = "en";

constexpr std::uint16_t kTableNumber = 136;
constexpr const char* kTableType = "HVSTRINGS_XML";

void Say(const std::string& line) {
    std::cerr << line << std::endl;
}

bool Refuse(const std::string& line) {
    Say(line);
    return false;
}

// Only a text that comes first counts: an element that begins with a comment has none.
std::string TextOf(const TiXmlElement& element) {
    const TiXmlText* text = element.FirstChild() != nullptr ? element.FirstChild()->ToText() : nullptr;
    return text != nullptr ? text->ValueStr() : std::string();
}

bool ReadString(const TiXmlElement& element, Texts& texts) {
    const char* key = element.Attribute("key");
    if (key == nullptr) {
        return Refuse("ERROR: string element encountered with no key attribute.");
    }
    const std::string* os = element.Attribute(std::string("os"));
    if (os != nullptr && os->empty()) {
        return Refuse("ERROR: empty os attribute value encountered.");
    }
    // Exactly this word, though a manifest may say "windows" as well: this table is our own, and has one way to say it.
    if (os == nullptr || *os == "win") {
        texts[key] = TextOf(element);
    }
    return true;
}

bool ReadStrings(const TiXmlElement& element, Texts& texts) {
    for (auto child = element.FirstChildElement("string"); child != nullptr;
         child = child->NextSiblingElement("string")) {
        if (!ReadString(*child, texts)) {
            return false;
        }
    }
    return true;
}

bool ReadLanguage(const TiXmlElement& element, std::map<std::string, Texts>& languages) {
    const char* language = element.Attribute("lang");
    if (language == nullptr) {
        return Refuse("ERROR: strings element has no lang attribute.");
    }
    if (languages.contains(language)) {
        return Refuse("ERROR: duplicate lang attribute value encountered: " + std::string(language));
    }
    Texts texts;
    if (!ReadStrings(element, texts)) {
        return false;
    }
    languages.emplace(language, std::move(texts));
    return true;
}

// What is inserted is not looked at again. Fixed (contracts, texts): the look ends where the text ended before, not
// where it ends now, and a token that longer replacements have pushed beyond that stays as it is.
bool ReplaceIn(std::string& text, const std::string& token, const std::string& replacement) {
    const std::size_t end = text.size();
    bool replaced = false;
    for (std::size_t at = text.find(token); at < end; at = text.find(token, at + replacement.size())) {
        text.replace(at, token.size(), replacement);
        replaced = true;
    }
    return replaced;
}

}  // namespace

bool XMLStringsResource::Parse(const std::string& xml) {
    languages.clear();
    TiXmlDocument document;
    if (!HVL::ReadXml(xml, document).empty()) {
        return false;
    }
    const TiXmlElement* root = document.FirstChildElement();
    if (root == nullptr || root->ValueStr() != "hvstrings") {
        return Refuse("ERROR: root element hvstrings not found.");
    }
    const char* rootVersion = root->Attribute("version");
    if (rootVersion == nullptr) {
        return Refuse("ERROR: hvstrings element has no version attribute.");
    }
    version = rootVersion;
    for (auto child = root->FirstChildElement("strings"); child != nullptr;
         child = child->NextSiblingElement("strings")) {
        if (!ReadLanguage(*child, languages)) {
            return false;
        }
    }
    return !languages.empty();
}

std::string XMLStringsResource::GetString(const std::string& key) const {
    const auto texts = languages.find(kLanguage);
    if (texts == languages.end()) {
        Say("WARNING: lang " + std::string(kLanguage) + " not found in this string resource collection.");
        return {};
    }
    const auto text = texts->second.find(key);
    if (text == texts->second.end()) {
        Say("WARNING: did not find string resource with key " + key + " for language-code \"" + kLanguage + "\"");
        return {};
    }
    return text->second;
}

void XMLStringsResource::ReplaceAll(const std::string& token, const std::string& replacement) {
    if (token.empty()) {
        return;
    }
    for (auto& [language, texts] : languages) {
        for (auto& [key, text] : texts) {
            std::string copy = text;
            if (ReplaceIn(copy, token, replacement)) {
                text = std::move(copy);
            }
        }
    }
}

std::string LoadStringsText() {
    return platform::CompiledResource(kTableNumber, kTableType);
}

}  // namespace HV
