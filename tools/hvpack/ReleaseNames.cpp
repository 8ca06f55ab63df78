#include "tools/hvpack/ReleaseNames.h"

#include <algorithm>
#include <string_view>

#include "hvframework/FileUtils.h"
#include "hvframework/ProductData.h"
#include "tools/hvpack/PackageError.h"

namespace HVPack {
namespace {

using std::string_view;

/// Where a text ends up, which says what it must not hold besides control characters, and why.
struct Use {
    string_view refused;
    string_view reason;
};

// A file name is echoed by the removal script, and identifiers and versions name the script and the history's records.
constexpr Use kNamesFiles = {R"(\/%&|<>^!":*?)", "file names and the removal script are made of it"};
constexpr Use kNamesEntry = {R"(\/%&|<>^!")", "the removal script and a registry key are made of it"};
constexpr Use kIsShown = {"", "it is shown in one line"};
constexpr Use kIsOpened = {R"(\<>^|" )", "a browser is started with it"};

constexpr string_view kWebSchemes[] = {"http://", "https://"};

bool IsControl(char c) {
    return (c >= 0 && c < ' ') || c == '\x7F';
}

std::string Hexadecimal(char c) {
    constexpr string_view digits = "0123456789ABCDEF";
    const auto byte = static_cast<unsigned char>(c);
    return std::string("0x") + digits[byte >> 4] + digits[byte & 15];
}

/// In quotes, in one line whatever it holds.
std::string Quoted(const std::string& value) {
    std::string text = "\"";
    for (const char c : value) {
        text += IsControl(c) ? "<" + Hexadecimal(c) + ">" : std::string(1, c);
    }
    return text + "\"";
}

/// The one place that refuses a name.
void Refuse(const std::string& file, const std::string& field, const std::string& value, const Use& use) {
    const auto bad =
        std::ranges::find_if(value, [&](char c) { return IsControl(c) || use.refused.find(c) != string_view::npos; });
    if (bad != value.end()) {
        const std::string character =
            IsControl(*bad) ? "the control character " + Hexadecimal(*bad) : "the character " + std::string(1, *bad);
        throw PackageError(file + ": " + field + " is " + Quoted(value) + ", and must not hold " + character + ": " +
                           std::string(use.reason));
    }
}

bool IsWebAddress(std::string address) {
    std::ranges::transform(address, address.begin(),
                           [](char c) { return c >= 'A' && c <= 'Z' ? char(c - 'A' + 'a') : c; });
    return std::ranges::any_of(kWebSchemes, [&](string_view scheme) {
        return address.starts_with(scheme) && address.size() > scheme.size() && address[scheme.size()] != '/';
    });
}

void RefuseAddress(const std::string& file, const std::string& field, const std::string& address) {
    if (!address.empty() && !IsWebAddress(address)) {
        throw PackageError(file + ": " + field + " is " + Quoted(address) +
                           ", and is no address that begins with http:// or https://");
    }
    Refuse(file, field, address, kIsOpened);
}

HVL::ProductData ReadSuite(const std::string& path, const std::string& file) {
    std::string text;
    if (HVL::FileUtils::ReadFileToString(path, text) != 0) {
        throw PackageError("cannot read " + path);
    }
    HVL::ProductData suite;
    try {
        if (!suite.ReadJSON(text)) {
            throw PackageError(file + " is not JSON");
        }
    } catch (const PackageError&) {
        throw;
    } catch (const std::runtime_error& error) {
        throw PackageError(file + " is not a suite file: " + error.what());
    }
    return suite;
}

}  // namespace

void RefuseUnsafeNames(const std::string& fileName, const HV::Manifest& manifest) {
    Refuse(fileName, "its name", fileName, kNamesFiles);
    Refuse(fileName, "product", manifest.productId, kNamesFiles);
    Refuse(fileName, "productversion", manifest.productVersion, kNamesFiles);
    for (const char* key : {"display_name", "version"}) {
        Refuse(fileName, std::string(key) + " in product-data", manifest.GetProductData(key), kIsShown);
    }
}

void RefuseUnlessSuite(const std::string& path) {
    const std::string file = fs::path(path).filename().string();
    const HVL::ProductData suite = ReadSuite(path, file);
    if (suite.GetProductType() != 0) {
        throw PackageError(file + " is no suite's: product_type has to be \"0\", in quotes");
    }
    for (const char* key : {"identifier", "version", "display_name"}) {
        if (suite.GetValue(key).empty()) {
            throw PackageError(file + " has no text for " + key);
        }
    }
    Refuse(file, "identifier", suite.GetIdentifier(), kNamesFiles);
    Refuse(file, "version", suite.GetVersion(), kNamesFiles);
    Refuse(file, "display_name", suite.GetDisplayName(), kNamesEntry);
    RefuseAddress(file, "product_url", suite.GetValue("product_url"));
}

}  // namespace HVPack
