#pragma once

#include <functional>
#include <set>
#include <span>
#include <string>
#include <vector>

#include "hosts/HostAppCheck.h"
#include "hvframework/ProductData.h"
#include "package/HeldFile.h"
#include "package/ValidationTable.h"
#include "system/Processes.h"
#include "system/XMLStringsResource.h"

namespace HV {

/// What a wizard may install: the packages of a folder, as far as they stand in tables. The tables are those of this
/// build unless others are given; they are asked for when the folder has been listed.
struct Release {
    std::string packagesDirectory;
    std::function<std::span<const ValidationRow>()> rows = ValidationRows;
    std::function<std::span<const ReleaseDigest>()> digests = ReleaseDigests;
};

/// One package that has passed every check.
struct PackageInfo {
    std::string identifier;
    std::string path;
    std::string displayName;
    std::string version;
    bool show = false;  // a product that the user sees
    bool requiresHost = false;
    bool hostFound = false;
    std::vector<std::string> hostRefs;  // hosts of this machine that the package will use
};

/// The data that the wizard works on: hosts, packages, the suite, the texts. It touches no window.
///
/// A program has one, Instance(), which its entry hands to whatever works on it. The main thread alone uses it; the
/// engine reads everything again for itself.
class InstallerModel {
public:
    /// The one model of this program and of the release beside it, made and loaded by the first call.
    static InstallerModel& Instance();

    /// A model that is not loaded yet. It takes a first snapshot of the processes.
    explicit InstallerModel(Release release);

    /// Detects hosts, digests and checks every package, and reads the suite and the texts. To be called once.
    void Load();

    /// Drops the model, so that the next Instance() makes and loads another. A process that shows one wizard has no use
    /// for it; one that walks through many, as tests do, has.
    static void Forget();

    /// The text of a key, its variables filled in; empty for an unknown key.
    [[nodiscard]] std::string GetString(const std::string& key) const;

    /// The identifiers of the packages that the user sees, in order.
    [[nodiscard]] std::vector<std::string> ShownIdentifiers() const;

    /// The package with exactly this identifier, or an empty record.
    [[nodiscard]] PackageInfo FindPackage(const std::string& identifier) const;

    /// Whether there are shown packages and all of them lack their hosts.
    [[nodiscard]] bool AllProductsLackHosts() const;

    /// Whether any shown package lacks its hosts.
    [[nodiscard]] bool SomeProductLacksHost() const;

    /// Whether the manager application runs now. Takes a new snapshot of the processes.
    [[nodiscard]] bool ManagerIsRunning();

    /// Fills `out` with the running hosts of all packages, chosen or not, and returns whether there are any. Takes a
    /// new snapshot unless no package uses a host.
    [[nodiscard]] bool FindRunningHosts(std::vector<ProcessRecord>& out);

    /// Whether the packages folder holds, of all that the engine would read, what was there when it was scanned, and
    /// nothing else. The first thing that is otherwise is logged, and ends the look.
    [[nodiscard]] bool PackagesAreUntouched() const;

    /// The names of all files of the packages folder that the engine may read.
    [[nodiscard]] std::set<std::string> NamesOfRelease() const;

    bool valid = false;  // the folder was scanned and every package is good
    std::string packagesDirectory;
    std::vector<std::string> packageFiles;  // full paths, in directory order
    std::string suiteJsonPath;
    std::vector<PackageInfo> packages;  // shown ones first, each group by display name
    HostAppCheck hostCheck;
    XMLStringsResource strings;
    HVL::ProductData suite;
    bool loaded = false;
    Processes processes;

private:
    [[nodiscard]] bool ScanPackages();
    [[nodiscard]] bool ValidatePackages();
    void HoldSuites();
    [[nodiscard]] bool IsReleased(const std::string& path, const std::set<std::string>& releasedNames);
    void LoadStringsResource();

    Release release_;
    // Every file of the release, held from before it is tested until the process ends.
    std::vector<HeldFile> held_;
};

}  // namespace HV
