#pragma once

#include <tinyxml.h>

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "platform/filesystem.h"

/// The manifest of a package: what the product is and what is to be done with the package's files.
///
/// Plain records, filled once from the text of a `_hvmanifest.xml` and only read afterwards; nobody but the parser
/// looks at the XML. Everything can be copied; lists stand in document order. Values are kept as the author wrote
/// them: nothing is expanded, and no keyword is checked that is not needed to tell what a payload is.
namespace HV {

/// What a payload (or the product that a payload depends on) is, by the manifest's word for it.
enum class PayloadType {
    Unknown = 0,
    App = 1,
    Plugin = 2,
    Presets = 3,
    Library = 4,
    Framework = 5,
    Resource = 6,
    Help = 7,
    Script = 8,
    Patch = 9,
};

/// Where a payload goes, by the manifest's word for it.
enum class DeploymentType {
    Unknown = 0,
    App = 1,
    SysDir = 2,
    HostPlugins = 3,  // "hostapp" is the same value: the two words are one.
    HostPresets = 4,
    HostScripts = 5,
    Run = 6,
};

enum class PreconditionType { RegKey = 0, File = 1 };

/// What a condition that holds means for its payload. The numbers are the results of the engine's check.
enum class MatchPolicy { Skip = 0, Force = 1 };

/// Words that authors may meet in manifests. Nothing reads or replaces them: text that holds one passes as it stands.
inline constexpr const char* kHostAppVKeyToken = "${HostAppVKey}";
inline constexpr const char* kHostAppVNameToken = "${HostAppVName}";
inline constexpr const char* kFilesToUninstallToken = "${Files-to-uninstall}";

/// A product that must be on the machine for the payload to work.
struct PayloadDependency {
    PayloadType type = PayloadType::Unknown;
    std::string product;
};

struct RegistryEntry {
    std::string os;
    std::string root;
    std::string key;
    std::string name;
    std::string value;
};

struct Shortcut {
    std::string sysdir;
    std::string subdir;
    std::string original;
    std::string originalType;
    bool failOnError = false;
};

/// A command, or a script of the package, that runs before or after its payload is placed.
struct PayloadScript {
    std::string source;  // empty whenever there is a command
    std::string command;
    std::string os;
    std::string id;
    bool failOnError = true;
    bool isPreflight = false;
};

struct Precondition {
    PreconditionType type = PreconditionType::RegKey;
    MatchPolicy matchPolicy = MatchPolicy::Skip;
    std::string target;  // a registry key or a file's path
};

/// One thing of the package that is placed, or passed over, as a whole.
struct Payload {
    PayloadType type = PayloadType::Unknown;
    DeploymentType deployment = DeploymentType::Unknown;
    std::string id;
    std::string os;
    std::string source;   // relative to the package's root, separated by `\`
    std::string subpath;  // below the chosen directory, separated by `\`
    std::string sysdir;
    std::vector<std::string> hosts;
    std::vector<PayloadDependency> dependencies;
    std::vector<std::string> parents;
    std::vector<RegistryEntry> registryEntries;
    std::vector<Shortcut> shortcuts;
    std::vector<PayloadScript> preflights;
    std::vector<PayloadScript> postflights;
    std::vector<Precondition> preconditions;

    /// Fills a fresh payload from its element. False, with the payload half filled, when `id` or `type` is missing or
    /// the deployment is neither given nor told by the type; lesser faults are warned of on standard error, and what
    /// has them is left out.
    [[nodiscard]] bool Parse(const TiXmlElement& element);

    /// Whether the payload is meant for this system: "*", or anything that begins with "win".
    [[nodiscard]] bool MatchesOS() const;

    [[nodiscard]] bool HasWildcardSource() const;

    /// Whether the payload is placed into the folders of hosts: a plug-in, or what is deployed as a host's own.
    [[nodiscard]] bool GoesIntoHosts() const;
};

struct InstallerPolicy {
    bool show = false;
    bool doRegister = false;
    bool uninstall = false;
    bool uninstallOnUpgrade = false;
    std::string upgrade;
    bool timeWarning = false;
};

/// The parsed tree of a manifest: copied with it, and moved without copying a single node.
class ManifestDocument {
public:
    ManifestDocument() = default;
    ManifestDocument(const ManifestDocument& other);
    ManifestDocument(ManifestDocument&& other) noexcept = default;
    ManifestDocument& operator=(ManifestDocument other) noexcept;
    ~ManifestDocument() = default;

    /// Drops the tree that is held and gives an empty one, without any error set, to be parsed into.
    TiXmlDocument& Renew();

    /// The tree; null until something has been parsed. Owned by this object.
    [[nodiscard]] const TiXmlDocument* Get() const { return tree_.get(); }

private:
    std::unique_ptr<TiXmlDocument> tree_;
};

struct Manifest {
    std::vector<Payload> payloads;
    std::string manifestVersion;
    std::string productId;
    std::string productShortName;
    std::string productVersion;
    InstallerPolicy policy;
    std::vector<std::string> macLegacyUninstallToolArgs;
    std::string packageIdentifier;  // productId, "_v", productVersion
    std::map<std::string, std::string> productData;
    fs::path documentPath;  // stays empty: a manifest is read from an archive
    std::string xmlText;
    ManifestDocument document;

    /// Reads the text of a manifest. False when it is not one: the reason is logged at ERROR, and the records keep what
    /// had been read until then. Any bytes will do as `text`, also hostile ones.
    [[nodiscard]] bool Parse(const std::string& text);

    /// Empties what a second text must not inherit. The tool arguments, the package identifier, `uninstallOnUpgrade`
    /// and `timeWarning` stay.
    void Clear();

    /// The value of a product property; empty for an unknown key, which an empty value cannot be told from.
    [[nodiscard]] std::string GetProductData(const std::string& key) const;
};

}  // namespace HV
