#include "tests/support/PackageBuilder.h"

#include <algorithm>
#include <cstdio>
#include <stdexcept>

#include "platform/win32.h"

namespace {

std::string Escaped(const std::string& text) {
    std::string escaped;
    for (const char c : text) {
        switch (c) {
            case '&':
                escaped += "&amp;";
                break;
            case '<':
                escaped += "&lt;";
                break;
            case '>':
                escaped += "&gt;";
                break;
            case '"':
                escaped += "&quot;";
                break;
            default:
                escaped += c;
        }
    }
    return escaped;
}

std::string Attribute(const std::string& name, const std::string& value) {
    return " " + name + "=\"" + Escaped(value) + "\"";
}

std::string AttributeIfAny(const std::string& name, const std::string& value) {
    return value.empty() ? "" : Attribute(name, value);
}

std::string Element(const std::string& name, const std::string& inside) {
    return "<" + name + ">" + inside + "</" + name + ">";
}

std::string TextElementIfAny(const std::string& name, const std::string& text) {
    return text.empty() ? "" : Element(name, Escaped(text));
}

std::string ScriptElement(const std::string& name, const std::string& command, bool failOnError,
                          const std::string& os) {
    return "<" + name + AttributeIfAny("os", os) + Attribute("failonerror", failOnError ? "true" : "false") + ">" +
           Element("command", Escaped(command)) + "</" + name + ">";
}

void WriteFile(const fs::path& path, const std::string& bytes) {
    std::FILE* file = nullptr;
    if (fopen_s(&file, path.string().c_str(), "wb") != 0 || file == nullptr) {
        throw std::runtime_error("cannot make " + path.string());
    }
    const bool written = std::fwrite(bytes.data(), 1, bytes.size(), file) == bytes.size();
    if (std::fclose(file) != 0 || !written) {
        throw std::runtime_error("cannot write " + path.string());
    }
}

}  // namespace

PackageBuilder::PackageBuilder(std::string productId)
    : productId_(std::move(productId)), fileName_(productId_ + ".hvpkg") {}

PackageBuilder& PackageBuilder::Version(const std::string& version) {
    version_ = version;
    return *this;
}

PackageBuilder& PackageBuilder::DisplayName(const std::string& name) {
    return Property("display_name", name);
}

PackageBuilder& PackageBuilder::Property(const std::string& key, const std::string& value) {
    properties_ += "<value" + Attribute("key", key) + ">" + Escaped(value) + "</value>";
    return *this;
}

PackageBuilder& PackageBuilder::Policy(const std::string& attribute, const std::string& value) {
    policyAttributes_ += Attribute(attribute, value);
    return *this;
}

PackageBuilder& PackageBuilder::Payload(const std::string& type) {
    PayloadParts& payload = payloads_.emplace_back();
    payload.type = type;
    payload.id = "payload-" + std::to_string(payloads_.size());
    return *this;
}

PackageBuilder::PayloadParts& PackageBuilder::Current() {
    if (payloads_.empty()) {
        throw std::logic_error("a payload is described before Payload() began one");
    }
    return payloads_.back();
}

PackageBuilder& PackageBuilder::Id(const std::string& id) {
    Current().id = id;
    return *this;
}

PackageBuilder& PackageBuilder::Os(const std::string& os) {
    Current().os = os;
    return *this;
}

PackageBuilder& PackageBuilder::Deployment(const std::string& deployment) {
    Current().deployment = deployment;
    return *this;
}

PackageBuilder& PackageBuilder::Source(const std::string& source) {
    Current().source = source;
    return *this;
}

PackageBuilder& PackageBuilder::Subpath(const std::string& subpath) {
    Current().subpath = subpath;
    return *this;
}

PackageBuilder& PackageBuilder::SysDir(const std::string& keyword) {
    Current().sysdir = keyword;
    return *this;
}

PackageBuilder& PackageBuilder::To(const std::string& keyword, const std::string& subpath) {
    return Deployment("sysdir").SysDir(keyword).Subpath(subpath);
}

PackageBuilder& PackageBuilder::AddToGroup(const std::string& group, const std::string& xml) {
    Current().groups[group] += xml;
    return *this;
}

PackageBuilder& PackageBuilder::ForHost(const std::string& hostRef) {
    return AddToGroup("hosts", Element("host-ref", Escaped(hostRef)));
}

PackageBuilder& PackageBuilder::DependsOn(const std::string& product, const std::string& type) {
    return AddToGroup("dependencies", "<dependency" + Attribute("product", product) + Attribute("type", type) + "/>");
}

PackageBuilder& PackageBuilder::Parent(const std::string& payloadId) {
    return AddToGroup("parents", "<parent" + Attribute("idref", payloadId) + "/>");
}

PackageBuilder& PackageBuilder::Condition(const std::string& type, const std::string& matchPolicy,
                                          const std::string& target) {
    return AddToGroup("preconditions", "<condition" + Attribute("type", type) + Attribute("matchpolicy", matchPolicy) +
                                           ">" + Escaped(target) + "</condition>");
}

PackageBuilder& PackageBuilder::Preflight(const std::string& command, bool failOnError, const std::string& os) {
    return PreflightXml(ScriptElement("preflight", command, failOnError, os));
}

PackageBuilder& PackageBuilder::Postflight(const std::string& command, bool failOnError, const std::string& os) {
    return PostflightXml(ScriptElement("postflight", command, failOnError, os));
}

PackageBuilder& PackageBuilder::PreflightXml(const std::string& xml) {
    return AddToGroup("preflights", xml);
}

PackageBuilder& PackageBuilder::PostflightXml(const std::string& xml) {
    return AddToGroup("postflights", xml);
}

PackageBuilder& PackageBuilder::RegistryEntry(const std::string& root, const std::string& key, const std::string& name,
                                              const std::string& value, const std::string& os) {
    return AddToGroup("registry-entries", "<registry" + AttributeIfAny("os", os) + Attribute("root", root) +
                                              Attribute("key", key) + Attribute("name", name) + ">" + Escaped(value) +
                                              "</registry>");
}

PackageBuilder& PackageBuilder::Shortcut(const std::string& original, const std::string& originalType,
                                         const std::string& sysdir, const std::string& subdir, bool failOnError) {
    return AddToGroup("shortcuts", "<shortcut" + Attribute("failonerror", failOnError ? "true" : "false") + "><sysdir" +
                                       Attribute("type", sysdir) + "/>" + TextElementIfAny("subdir", subdir) +
                                       "<original" + AttributeIfAny("type", originalType) + ">" + Escaped(original) +
                                       "</original></shortcut>");
}

void PackageBuilder::AddFoldersOf(const std::string& path) {
    for (auto end = path.find('/'); end != std::string::npos; end = path.find('/', end + 1)) {
        Folder(path.substr(0, end));
    }
}

PackageBuilder& PackageBuilder::Folder(const std::string& path) {
    const std::string entry = path + "/";
    if (std::ranges::find(folders_, entry) == folders_.end()) {
        folders_.push_back(entry);
    }
    return *this;
}

PackageBuilder& PackageBuilder::File(const std::string& path, const std::string& bytes) {
    AddFoldersOf(path);
    files_.emplace_back(path, bytes);
    if (!payloads_.empty() && Current().source.empty()) {
        Current().source = path;
    }
    return *this;
}

PackageBuilder& PackageBuilder::RawEntry(const std::string& name, const std::string& bytes) {
    ArchiveEntry entry;
    entry.name = name;
    entry.bytes = bytes;
    return RawEntry(entry);
}

PackageBuilder& PackageBuilder::RawEntry(ArchiveEntry entry) {
    rawEntries_.push_back(std::move(entry));
    return *this;
}

PackageBuilder& PackageBuilder::ManifestText(const std::string& xml) {
    manifestText_ = xml;
    manifestIsGiven_ = true;
    return *this;
}

PackageBuilder& PackageBuilder::WithoutManifest() {
    hasManifest_ = false;
    return *this;
}

PackageBuilder& PackageBuilder::Named(const std::string& fileName) {
    fileName_ = fileName;
    return *this;
}

std::string PackageBuilder::PayloadText(const PayloadParts& payload) {
    std::string inside = TextElementIfAny("source", payload.source) + TextElementIfAny("subpath", payload.subpath) +
                         TextElementIfAny("sysdir", payload.sysdir);
    for (const auto& [group, items] : payload.groups) {
        inside += Element(group, items);
    }
    return "    <payload" + Attribute("id", payload.id) + Attribute("type", payload.type) +
           AttributeIfAny("os", payload.os) + AttributeIfAny("deployment", payload.deployment) + ">" + inside +
           "</payload>\n";
}

std::string PackageBuilder::Manifest() const {
    if (manifestIsGiven_) {
        return manifestText_;
    }
    std::string contents;
    for (const PayloadParts& payload : payloads_) {
        contents += PayloadText(payload);
    }
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<hvmanifest version=\"1.0\"" +
           Attribute("product", productId_) + Attribute("productversion", version_) + ">\n" + "  <installer-policy" +
           policyAttributes_ + "/>\n  <product-data>" + properties_ + "</product-data>\n" + "  <contents>\n" +
           contents + "  </contents>\n</hvmanifest>\n";
}

std::string PackageBuilder::Bytes() const {
    ArchiveBuilder archive;
    if (hasManifest_) {
        archive.Add({.name = "_hvmanifest.xml", .bytes = Manifest()});
    }
    for (const std::string& folder : folders_) {
        archive.Add({.name = folder, .bytes = "", .method = 0});
    }
    for (const auto& [path, bytes] : files_) {
        archive.Add({.name = path, .bytes = bytes});
    }
    for (const ArchiveEntry& entry : rawEntries_) {
        archive.Add(entry);
    }
    return archive.Bytes();
}

fs::path PackageBuilder::WriteTo(const fs::path& directory) const {
    fs::create_directories(directory);
    const fs::path path = directory / fileName_;
    WriteFile(path, Bytes());
    return path;
}
