#include "package/Manifest.h"

#include <utility>

#include "hvframework/Log.h"
#include "hvframework/XmlText.h"
#include "package/XmlReaders.h"

namespace HV {
namespace {

using Elements = std::vector<const TiXmlElement*>;

bool ReadRequired(const TiXmlElement& root, const char* name, std::string& out, const char* meaning) {
    if (GetAttribute(root, name, out)) {
        return true;
    }
    HVL_LOG(Error, "xml document - hvmanifest is missing " << meaning << ".");
    return false;
}

/// Fixed (contracts, manifest): what stands in for a missing short name keeps the dot.
std::string ShortNameOf(const std::string& productId) {
    const auto dot = productId.rfind('.');
    return dot == std::string::npos ? productId : productId.substr(dot);
}

bool ReadIdentity(const TiXmlElement& root, Manifest& manifest) {
    if (!ReadRequired(root, "version", manifest.manifestVersion, "manifest version") ||
        !ReadRequired(root, "product", manifest.productId, "product identifier") ||
        !ReadRequired(root, "productversion", manifest.productVersion, "product version")) {
        return false;
    }
    manifest.packageIdentifier = manifest.productId + "_v" + manifest.productVersion;
    if (!GetAttribute(root, "productshortname", manifest.productShortName)) {
        manifest.productShortName = ShortNameOf(manifest.productId);
    }
    return true;
}

/// Only arguments that begin with text count, so a comment before the text hides it.
void ReadUninstallToolArgs(const TiXmlElement& element, std::vector<std::string>& args) {
    Elements items;
    GetChildren(element, "mac-legacy-uninstallToolArgs", "arg", items);
    for (const TiXmlElement* item : items) {
        const TiXmlText* text = item->FirstChild() != nullptr ? item->FirstChild()->ToText() : nullptr;
        if (text != nullptr && !text->ValueStr().empty()) {
            args.push_back(text->ValueStr());
        }
    }
}

void ReadPolicy(const TiXmlElement& root, Manifest& manifest) {
    InstallerPolicy& policy = manifest.policy;
    const TiXmlElement* element = root.FirstChildElement("installer-policy");
    if (element == nullptr) {
        policy.timeWarning = false;
        return;
    }
    GetBoolAttribute(*element, "show", policy.show);
    GetBoolAttribute(*element, "register", policy.doRegister);
    GetBoolAttribute(*element, "uninstall", policy.uninstall);
    GetBoolAttribute(*element, "uninstall-on-upgrade", policy.uninstallOnUpgrade);
    GetAttribute(*element, "upgrade", policy.upgrade);
    GetBoolAttribute(*element, "time-warning", policy.timeWarning);
    ReadUninstallToolArgs(*element, manifest.macLegacyUninstallToolArgs);
}

void ReadProductData(const TiXmlElement& root, std::map<std::string, std::string>& productData) {
    Elements values;
    GetChildren(root, "product-data", "value", values);
    std::string key;
    for (const TiXmlElement* value : values) {
        if (GetAttribute(*value, "key", key)) {
            GetText(*value, productData[key]);
        }
    }
}

bool ReadPayloads(const TiXmlElement& root, std::vector<Payload>& payloads) {
    Elements items;
    GetChildren(root, "contents", "payload", items);
    payloads.reserve(items.size());
    for (const TiXmlElement* item : items) {
        Payload payload;
        if (!payload.Parse(*item)) {
            HVL_LOG(Error, "xml document - failed to parse payload entry");
            return false;
        }
        payloads.push_back(std::move(payload));
    }
    return true;
}

bool ParseTree(const std::string& text, TiXmlDocument& document) {
    const std::string problem = HVL::ReadXml(text, document);
    if (!problem.empty()) {
        HVL_LOG(Error, "XML parsing failed: " << problem);
    }
    return problem.empty();
}

}  // namespace

ManifestDocument::ManifestDocument(const ManifestDocument& other)
    : tree_(other.tree_ ? std::make_unique<TiXmlDocument>(*other.tree_) : nullptr) {}

ManifestDocument& ManifestDocument::operator=(ManifestDocument other) noexcept {
    tree_.swap(other.tree_);
    return *this;
}

TiXmlDocument& ManifestDocument::Renew() {
    tree_ = std::make_unique<TiXmlDocument>();
    return *tree_;
}

bool Manifest::Parse(const std::string& text) {
    xmlText = text;
    TiXmlDocument& tree = document.Renew();
    if (!ParseTree(xmlText, tree)) {
        return false;
    }
    Clear();
    const TiXmlElement* root = tree.FirstChildElement();
    if (root == nullptr) {
        return false;
    }
    if (root->ValueStr() != "hvmanifest") {
        HVL_LOG(Error, "xml document - hvmanifest does not have expected document root.");
        return false;
    }
    if (!ReadIdentity(*root, *this)) {
        return false;
    }
    ReadPolicy(*root, *this);
    ReadProductData(*root, productData);
    return ReadPayloads(*root, payloads);
}

void Manifest::Clear() {
    payloads.clear();
    manifestVersion.clear();
    productShortName.clear();
    productId.clear();
    productVersion.clear();
    productData.clear();
    policy.show = false;
    policy.doRegister = false;
    policy.uninstall = false;
    policy.upgrade.clear();
}

std::string Manifest::GetProductData(const std::string& key) const {
    const auto found = productData.find(key);
    return found == productData.end() ? std::string() : found->second;
}

}  // namespace HV
