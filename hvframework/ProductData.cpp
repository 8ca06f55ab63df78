#include "hvframework/ProductData.h"

#include <picojson.h>

#include <cstdlib>
#include <stdexcept>
#include <string_view>

#include "hvframework/StringUtils.h"
#include "hvframework/Version.h"

namespace HVL {
namespace {

constexpr std::string_view kIdentifier = "identifier";
constexpr std::string_view kVersion = "version";
constexpr std::string_view kDisplayName = "display_name";
constexpr std::string_view kProductType = "product_type";
constexpr std::string_view kInstallState = "install_state";
constexpr std::string_view kInstalledDatetime = "installed_datetime";
constexpr std::string_view kUninstall = "uninstall";
constexpr std::string_view kUpgrade = "upgrade";
constexpr std::string_view kInstalledFilePaths = "installed_file_paths";

// Fixed (contracts, suite file): only the first character counts, so "tuesday" is true as well.
bool ReadBool(const std::string& value) {
    return !value.empty() && std::string_view("tT1").find(value.front()) != std::string_view::npos;
}

// The library allows arrays this depth, and forgets to count objects.
constexpr std::size_t kDeepestValue = 100;

/// Whether the value at the start of `json` nests too deep for the library, which reads and frees values by recursion:
/// a file of some megabytes would leave it without a stack.
bool NestsTooDeep(const std::string& json) {
    std::size_t depth = 0;
    bool inText = false;
    for (std::size_t at = 0; at < json.size(); ++at) {
        const char c = json[at];
        if (inText) {
            at += c == '\\' ? 1 : 0;
            inText = c != '"';
        } else if (c == '"') {
            inText = true;
        } else if (c == '{' || c == '[') {
            if (++depth > kDeepestValue) {
                return true;
            }
        } else if ((c == '}' || c == ']') && depth-- <= 1) {
            return false;
        }
    }
    return false;
}

/// Whether `json` is JSON, as `document`. The library throws without a word for a number that no double can hold.
bool Parse(const std::string& json, picojson::value& document) {
    try {
        return picojson::parse(document, json).empty();
    } catch (const std::overflow_error&) {
        throw std::overflow_error("a number is too large to be read");
    }
}

}  // namespace

bool ProductData::operator<(const ProductData& other) const {
    if (const int order = GetDisplayName().compare(other.GetDisplayName()); order != 0) {
        return order < 0;
    }
    if (const int order = GetIdentifier().compare(other.GetIdentifier()); order != 0) {
        return order < 0;
    }
    return Version(GetVersion()).IsLess(Version(other.GetVersion()));
}

bool ProductData::ReadJSON(const std::string& json) {
    picojson::value document;
    if (NestsTooDeep(json) || !Parse(json, document)) {
        return false;
    }
    // The accessors throw on a value of another kind; the caller deals with that.
    for (const auto& [key, value] : document.get<picojson::object>()) {
        if (value.is<std::string>()) {
            SetValue(key, value.get<std::string>());
        } else if (value.is<picojson::array>() && key == kInstalledFilePaths) {
            for (const auto& path : value.get<picojson::array>()) {
                installedFilePaths.push_back(path.get<std::string>());
            }
        }
    }
    return true;
}

void ProductData::SetValue(const std::string& key, const std::string& value) {
    if (key == kInstallState) {
        installState = std::atoi(value.c_str());
    } else if (key == kInstalledDatetime) {
        installedDatetime = value;
    } else if (key == kUninstall) {
        uninstall = ReadBool(value);
    } else if (key == kUpgrade) {
        upgrade = value;
    } else {
        values[key] = value;
    }
}

std::string ProductData::GetValue(const std::string& key) const {
    if (const auto found = values.find(key); found != values.end()) {
        return found->second;
    }
    if (key == kInstallState) {
        return StringUtils::ToString(installState);
    }
    if (key == kInstalledDatetime) {
        return installedDatetime;
    }
    if (key == kInstalledFilePaths) {
        return GetInstalledFilePathsText();
    }
    if (key == kUpgrade) {
        return upgrade;
    }
    if (key == kUninstall) {
        return uninstall ? "true" : "false";
    }
    return {};
}

std::string ProductData::GetIdentifier() const {
    return GetValue(std::string(kIdentifier));
}

std::string ProductData::GetVersion() const {
    return GetValue(std::string(kVersion));
}

std::string ProductData::GetDisplayName() const {
    return GetValue(std::string(kDisplayName));
}

std::int32_t ProductData::GetProductType() const {
    const std::string text = GetValue(std::string(kProductType));
    return text.empty() ? -1 : std::atoi(text.c_str());
}

// Fixed (contracts, suite file): the blank before each quote and the one after each comma are both written, and nothing
// is escaped.
std::string ProductData::GetInstalledFilePathsText() const {
    std::string text = "[";
    for (std::size_t index = 0; index < installedFilePaths.size(); ++index) {
        text += " \"" + installedFilePaths[index] + "\"";
        if (index + 1 < installedFilePaths.size()) {
            text += ", ";
        }
    }
    return text + "]";
}

}  // namespace HVL
