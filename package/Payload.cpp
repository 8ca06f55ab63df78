#include <algorithm>
#include <array>
#include <iostream>
#include <optional>
#include <string_view>
#include <utility>

#include "hvframework/StringUtils.h"
#include "package/Manifest.h"
#include "package/XmlReaders.h"

namespace HV {
namespace {

using Elements = std::vector<const TiXmlElement*>;

template <typename Value>
using Word = std::pair<std::string_view, Value>;

constexpr std::array<Word<PayloadType>, 9> kTypeWords{{
    {"app", PayloadType::App},
    {"plugin", PayloadType::Plugin},
    {"presets", PayloadType::Presets},
    {"library", PayloadType::Library},
    {"framework", PayloadType::Framework},
    {"resource", PayloadType::Resource},
    {"help", PayloadType::Help},
    {"script", PayloadType::Script},
    {"patch", PayloadType::Patch},
}};

constexpr std::array<Word<DeploymentType>, 7> kDeploymentWords{{
    {"app", DeploymentType::App},
    {"sysdir", DeploymentType::SysDir},
    {"hostplugins", DeploymentType::HostPlugins},
    {"hostapp", DeploymentType::HostPlugins},
    {"hostpresets", DeploymentType::HostPresets},
    {"hostscripts", DeploymentType::HostScripts},
    {"run", DeploymentType::Run},
}};

constexpr std::array<Word<PreconditionType>, 2> kPreconditionWords{{
    {"regkey", PreconditionType::RegKey},
    {"file", PreconditionType::File},
}};

constexpr std::array<Word<MatchPolicy>, 2> kMatchPolicyWords{{
    {"skip", MatchPolicy::Skip},
    {"force", MatchPolicy::Force},
}};

template <typename Value, std::size_t Count>
std::optional<Value> Lookup(const std::array<Word<Value>, Count>& words, std::string_view word) {
    const auto found = std::ranges::find(words, word, &Word<Value>::first);
    return found == words.end() ? std::nullopt : std::optional(found->second);
}

PayloadType TypeFromWord(const std::string& word) {
    return Lookup(kTypeWords, word).value_or(PayloadType::Unknown);
}

/// Authors may write either separator; paths of a manifest are kept with `\`.
std::string WithBackslashes(std::string text) {
    std::ranges::replace(text, '/', '\\');
    return text;
}

void Warn(const char* line) {
    std::cerr << line << std::endl;
}

std::string ChildPath(const TiXmlElement& element, const char* name) {
    std::string text;
    GetChildText(element, name, text);
    return WithBackslashes(std::move(text));
}

std::string AttributeOf(const TiXmlElement& element, const char* name) {
    std::string text;
    GetAttribute(element, name, text);
    return text;
}

Elements ChildrenOf(const TiXmlElement& element, const char* groupName, const char* itemName) {
    Elements items;
    GetChildren(element, groupName, itemName, items);
    return items;
}

/// What a payload without a usable deployment is taken to want.
DeploymentType DefaultDeployment(PayloadType type) {
    switch (type) {
        case PayloadType::App:
            return DeploymentType::App;
        case PayloadType::Plugin:
            return DeploymentType::HostPlugins;
        default:
            return DeploymentType::Unknown;
    }
}

bool ReadDeployment(const TiXmlElement& element, Payload& payload) {
    const std::string word = AttributeOf(element, "deployment");
    payload.deployment = Lookup(kDeploymentWords, word).value_or(DefaultDeployment(payload.type));
    if (payload.deployment != DeploymentType::Unknown) {
        return true;
    }
    std::cerr << "ERROR: invalid deployment type: \"" << word << "\"" << std::endl;
    return false;
}

/// The attribute wins over the text. No slash is turned here: the keyword is no path.
std::string ReadSysDir(const TiXmlElement& element) {
    std::string keyword;
    const TiXmlElement* sysdir = element.FirstChildElement("sysdir");
    if (sysdir != nullptr && !GetAttribute(*sysdir, "type", keyword)) {
        GetText(*sysdir, keyword);
    }
    return keyword;
}

std::vector<std::string> ReadHosts(const TiXmlElement& element) {
    std::vector<std::string> hosts;
    std::string host;
    for (const TiXmlElement* item : ChildrenOf(element, "hosts", "host-ref")) {
        if (GetText(*item, host)) {
            hosts.push_back(host);
        }
    }
    return hosts;
}

std::vector<PayloadDependency> ReadDependencies(const TiXmlElement& element) {
    std::vector<PayloadDependency> dependencies;
    std::string product;
    std::string type;
    for (const TiXmlElement* item : ChildrenOf(element, "dependencies", "dependency")) {
        if (GetAttribute(*item, "product", product) && GetAttribute(*item, "type", type)) {
            dependencies.push_back({TypeFromWord(type), product});
        }
    }
    return dependencies;
}

std::vector<std::string> ReadParents(const TiXmlElement& element) {
    std::vector<std::string> parents;
    std::string id;
    for (const TiXmlElement* item : ChildrenOf(element, "parents", "parent")) {
        if (GetAttribute(*item, "idref", id)) {
            parents.push_back(id);
        }
    }
    return parents;
}

/// The order of the tests decides which warning a condition with several faults gets.
std::optional<Precondition> ReadPrecondition(const TiXmlElement& element) {
    const auto type = Lookup(kPreconditionWords, AttributeOf(element, "type"));
    if (!type) {
        Warn("WARNING: unsupported/unset precondition type encountered.");
        return std::nullopt;
    }
    const auto policy = Lookup(kMatchPolicyWords, AttributeOf(element, "matchpolicy"));
    if (!policy) {
        Warn("WARNING: precondition with unsupported/unset match policy encountered.");
        return std::nullopt;
    }
    std::string target;
    GetText(element, target);
    if (target.empty()) {
        Warn("WARNING: precondition missing child text.");
        return std::nullopt;
    }
    return Precondition{*type, *policy, target};
}

std::vector<Precondition> ReadPreconditions(const TiXmlElement& element) {
    std::vector<Precondition> preconditions;
    for (const TiXmlElement* item : ChildrenOf(element, "preconditions", "condition")) {
        if (auto precondition = ReadPrecondition(*item)) {
            preconditions.push_back(std::move(*precondition));
        }
    }
    return preconditions;
}

std::vector<RegistryEntry> ReadRegistryEntries(const TiXmlElement& element) {
    std::vector<RegistryEntry> entries;
    for (const TiXmlElement* item : ChildrenOf(element, "registry-entries", "registry")) {
        RegistryEntry& entry = entries.emplace_back();
        GetAttribute(*item, "os", entry.os);
        GetAttribute(*item, "root", entry.root);
        GetAttribute(*item, "key", entry.key);
        GetAttribute(*item, "name", entry.name);
        GetText(*item, entry.value);
    }
    return entries;
}

Shortcut ReadShortcut(const TiXmlElement& element) {
    Shortcut shortcut;
    GetBoolAttribute(element, "failonerror", shortcut.failOnError);
    if (const TiXmlElement* sysdir = element.FirstChildElement("sysdir")) {
        GetAttribute(*sysdir, "type", shortcut.sysdir);
    }
    shortcut.subdir = ChildPath(element, "subdir");
    if (const TiXmlElement* original = element.FirstChildElement("original")) {
        GetText(*original, shortcut.original);
        GetAttribute(*original, "type", shortcut.originalType);
    }
    return shortcut;
}

std::vector<Shortcut> ReadShortcuts(const TiXmlElement& element) {
    std::vector<Shortcut> shortcuts;
    for (const TiXmlElement* item : ChildrenOf(element, "shortcuts", "shortcut")) {
        Shortcut shortcut = ReadShortcut(*item);
        if (shortcut.original.empty() || shortcut.sysdir.empty()) {
            Warn("WARNING: invalid shortcut encountered, missing original and/or sysdir value.");
        } else {
            shortcuts.push_back(std::move(shortcut));
        }
    }
    return shortcuts;
}

/// Nothing, without a word, for an element that names neither a command nor a script.
std::optional<PayloadScript> ReadScript(const TiXmlElement& element) {
    PayloadScript script;
    GetChildText(element, "command", script.command);
    if (script.command.empty()) {
        GetAttribute(element, "source", script.source);
    }
    if (script.command.empty() && script.source.empty()) {
        return std::nullopt;
    }
    GetAttribute(element, "os", script.os);
    GetAttribute(element, "id", script.id);
    GetBoolAttribute(element, "failonerror", script.failOnError);
    return script;
}

void ReadPostflights(const TiXmlElement& element, Payload& payload) {
    for (const TiXmlElement* item : ChildrenOf(element, "postflights", "postflight")) {
        if (auto script = ReadScript(*item)) {
            payload.postflights.push_back(std::move(*script));
            // Fixed (contracts, manifest): it is the payload that is named here, and not the script as in the
            // preflights below.
            if (payload.id.empty()) {
                payload.id = "postflight";
            }
        }
    }
}

void ReadPreflights(const TiXmlElement& element, Payload& payload) {
    for (const TiXmlElement* item : ChildrenOf(element, "preflights", "preflight")) {
        if (auto script = ReadScript(*item)) {
            script->isPreflight = true;
            if (script->id.empty()) {
                script->id = "preflight";
            }
            payload.preflights.push_back(std::move(*script));
        }
    }
}

}  // namespace

bool Payload::Parse(const TiXmlElement& element) {
    std::string typeWord;
    if (!GetAttribute(element, "id", id) || !GetAttribute(element, "type", typeWord)) {
        return false;
    }
    type = TypeFromWord(typeWord);
    if (!GetAttribute(element, "os", os)) {
        os = "*";
    }
    if (!ReadDeployment(element, *this)) {
        return false;
    }
    source = ChildPath(element, "source");
    subpath = ChildPath(element, "subpath");
    sysdir = ReadSysDir(element);
    hosts = ReadHosts(element);
    dependencies = ReadDependencies(element);
    parents = ReadParents(element);
    preconditions = ReadPreconditions(element);
    registryEntries = ReadRegistryEntries(element);
    shortcuts = ReadShortcuts(element);
    ReadPostflights(element, *this);
    ReadPreflights(element, *this);
    return true;
}

bool Payload::MatchesOS() const {
    return os == "*" || HVL::StringUtils::StartsWith(os, "win");
}

bool Payload::HasWildcardSource() const {
    return source.find('*') != std::string::npos;
}

bool Payload::GoesIntoHosts() const {
    return type == PayloadType::Plugin || deployment == DeploymentType::HostPlugins ||
           deployment == DeploymentType::HostPresets || deployment == DeploymentType::HostScripts;
}

}  // namespace HV
