#pragma once

#include <string>
#include <vector>

#include "package/Manifest.h"
#include "platform/filesystem.h"

namespace HV {

/// One item that is to be copied.
struct PayloadPathPair {
    fs::path source;
    fs::path destination;
};

/// One package file, from the moment it is found until the engine is done with it.
///
/// Made over a file, it is first validated, which fills the manifest and the lists, and then extracted. Made over a
/// directory, it is extracted from the start and cannot be validated. Only the constructor throws for a package that is
/// bad; every other failure is a return value with its reason in the log, and leaves the object usable.
/// Copies are independent; moving is cheap. The extracted directory belongs to whoever chose it.
class Package {
public:
    /// A path ending exactly in ".zip" or ".hvpkg" must be a regular file, else std::runtime_error is thrown. Any other
    /// path is kept when it is a directory, and forgotten without a word when it is not: `a.HVPKG` is no package.
    explicit Package(const fs::path& path);
    Package(const Package&) = default;
    Package(Package&&) noexcept = default;
    Package& operator=(const Package&) = default;
    Package& operator=(Package&&) noexcept = default;
    virtual ~Package() = default;

    /// Whether the file is a sound package: one manifest at the root, which parses, and (unless `metadataOnly`) every
    /// payload for this system is in the archive. Fills `manifest`, `zipFiles` and `zipDirs`, also when it fails.
    [[nodiscard]] bool Validate(bool metadataOnly);

    /// Unpacks the file into `destination`, which is made. On failure what was written stays there, `extractedPath` is
    /// as it was, and the caller removes the directory.
    [[nodiscard]] bool ExtractTo(const fs::path& destination);

    [[nodiscard]] bool IsExtracted() const;

    /// The package's file name, or the product identifier where there is no file.
    [[nodiscard]] std::string GetName() const;

    /// Fills `out` with what is to be copied to place `payload` below `destDir`, in the order of copying. An empty
    /// `destDir` is an error that is logged, with no pairs, except for the keyword "absolutepath". Throws what the
    /// filesystem library throws when the folder of a wildcard cannot be listed.
    void GetPayloadPaths(const fs::path& destDir, const Payload& payload, std::vector<PayloadPathPair>& out) const;

    fs::path zipPath;        // empty over a directory
    fs::path extractedPath;  // empty until there is one
    Manifest manifest;
    std::vector<std::string> zipFiles;  // in archive order, as the archive spells them
    std::vector<std::string> zipDirs;

private:
    [[nodiscard]] bool ReadRootManifest(const std::string& name);
    [[nodiscard]] bool ParseManifestEntry(const std::string& entry, const std::string& name);
    [[nodiscard]] bool CheckPayloads(const std::string& name) const;
    void AddMatchingItems(const fs::path& base, const fs::path& wildcard, std::vector<PayloadPathPair>& out) const;
};

}  // namespace HV
