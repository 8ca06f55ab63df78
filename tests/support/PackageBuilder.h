#pragma once

#include <map>
#include <string>
#include <utility>
#include <vector>

#include "platform/filesystem.h"
#include "tests/support/ArchiveBuilder.h"

/// Makes a package as its author would describe it:
///
///     PackageBuilder("com.halvorn.glow").Version("2.0").Payload("plugin").File("plugins/Glow.aex",
///     "bytes").WriteTo(dir)
///
/// Calls from Id() to Shortcut() are about the payload that the last Payload() began. File() adds to the archive and,
/// where that payload has no source yet, becomes its source; Source() names another. The manifest is the first entry,
/// folders of files get entries of their own before everything else's files, and the same calls give the same bytes.
class PackageBuilder {
public:
    explicit PackageBuilder(std::string productId);

    // The product
    PackageBuilder& Version(const std::string& version);
    PackageBuilder& DisplayName(const std::string& name);  // product property "display_name"
    PackageBuilder& Property(const std::string& key, const std::string& value);
    PackageBuilder& Policy(const std::string& attribute, const std::string& value);

    // Payloads
    PackageBuilder& Payload(const std::string& type);
    PackageBuilder& Id(const std::string& id);  // "payload-1", "payload-2" ... unless called
    PackageBuilder& Os(const std::string& os);
    PackageBuilder& Deployment(const std::string& deployment);
    PackageBuilder& Source(const std::string& source);
    PackageBuilder& Subpath(const std::string& subpath);
    PackageBuilder& SysDir(const std::string& keyword);
    /// Deployment "sysdir" with this keyword and a path below it.
    PackageBuilder& To(const std::string& keyword, const std::string& subpath = "");
    PackageBuilder& ForHost(const std::string& hostRef);
    PackageBuilder& DependsOn(const std::string& product, const std::string& type = "library");
    PackageBuilder& Parent(const std::string& payloadId);
    PackageBuilder& Condition(const std::string& type, const std::string& matchPolicy, const std::string& target);
    PackageBuilder& Preflight(const std::string& command, bool failOnError = true, const std::string& os = "");
    PackageBuilder& Postflight(const std::string& command, bool failOnError = true, const std::string& os = "");
    /// The element as it stands, such as `<preflight source="setup.cmd"/>`, among the payload's preflights
    /// (postflights).
    PackageBuilder& PreflightXml(const std::string& xml);
    PackageBuilder& PostflightXml(const std::string& xml);
    PackageBuilder& RegistryEntry(const std::string& root, const std::string& key, const std::string& name,
                                  const std::string& value, const std::string& os = "");
    PackageBuilder& Shortcut(const std::string& original, const std::string& originalType, const std::string& sysdir,
                             const std::string& subdir = "", bool failOnError = false);

    // The archive
    PackageBuilder& File(const std::string& path, const std::string& bytes);
    PackageBuilder& Folder(const std::string& path);
    /// An entry as it stands, lies included, after all others. No folder is added for it.
    PackageBuilder& RawEntry(const std::string& name, const std::string& bytes);
    PackageBuilder& RawEntry(ArchiveEntry entry);
    /// The manifest's text, in place of the one made from the calls above; also for a text that is no XML.
    PackageBuilder& ManifestText(const std::string& xml);
    PackageBuilder& WithoutManifest();

    /// The manifest as it will stand in the package.
    [[nodiscard]] std::string Manifest() const;
    /// The bytes of the whole package.
    [[nodiscard]] std::string Bytes() const;

    /// The name of the file; the product identifier and ".hvpkg" unless called.
    PackageBuilder& Named(const std::string& fileName);
    /// Writes the package into the directory, which is made, and gives the path of the file. Fails by
    /// std::runtime_error.
    [[nodiscard]] fs::path WriteTo(const fs::path& directory) const;
    [[nodiscard]] fs::path WriteTo(const std::string& directory) const { return WriteTo(fs::path(directory)); }
    [[nodiscard]] fs::path WriteTo(const char* directory) const { return WriteTo(fs::path(directory)); }

private:
    struct PayloadParts {
        std::string type;
        std::string id;
        std::string os;
        std::string deployment;
        std::string source;
        std::string subpath;
        std::string sysdir;
        std::map<std::string, std::string> groups;  // the elements inside "hosts", "dependencies" and so on
    };

    PayloadParts& Current();
    PackageBuilder& AddToGroup(const std::string& group, const std::string& xml);
    void AddFoldersOf(const std::string& path);
    [[nodiscard]] static std::string PayloadText(const PayloadParts& payload);

    std::string productId_;
    std::string version_ = "1.0";
    std::string fileName_;
    std::string policyAttributes_;
    std::string properties_;
    std::vector<PayloadParts> payloads_;
    std::vector<std::string> folders_;
    std::vector<std::pair<std::string, std::string>> files_;
    std::vector<ArchiveEntry> rawEntries_;
    std::string manifestText_;
    bool manifestIsGiven_ = false;
    bool hasManifest_ = true;
};
