#pragma once

#include <boost/thread/mutex.hpp>
#include <cstdint>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "hosts/HostAppCheck.h"
#include "hvdeploy/src/DeployRollback.h"
#include "hvdeploy/src/EngineResult.h"
#include "hvdeploy/src/InstalledHistory.h"
#include "hvdeploy/src/PackagesFolder.h"
#include "hvdeploy/src/Placement.h"
#include "hvdeploy/src/RunProgress.h"
#include "hvdeploy/src/UninstallScripts.h"
#include "hvframework/ProductData.h"
#include "package/Package.h"
#include "package/ValidationTable.h"
#include "platform/filesystem.h"

namespace HV {

/// The engine: a folder of packages becomes an installed suite, or the files that a failing package and those before it
/// replaced come back. Registry entries, shortcuts and what scripts did stay, and after some failures the files of
/// earlier packages too (contracts, results).
///
/// One object serves one run and is used by one thread, the deployment's; Cancel() alone may come from another. Every
/// operation reports what went wrong by its result and in the log. What it throws is what the filesystem library and a
/// package's constructor throw; its caller ends the run then.
class Deploy {
public:
    /// Makes the stash (and throws std::runtime_error when it cannot) and reports "Preparing to install..." to
    /// `listener`, which may be null, is not owned and must outlive this object.
    explicit Deploy(ProgressListenerInterface* listener);

    Deploy(const Deploy&) = delete;
    Deploy& operator=(const Deploy&) = delete;

    /// Installs the packages of `dir` in three phases: those named "preflight-...", the others, those named
    /// "postflight-...". `skipList` names packages to leave out, by product identifier or by whole file name.
    /// Returns the result of the last phase that ran.
    EngineResult DeployPackagesFromDirectory(const fs::path& dir, const std::vector<std::string>& skipList);

    /// Installs `paths` one after the other, as one phase. Stops at the first failure; else the result is that of the
    /// last package, or -1 when a dependency is missing.
    EngineResult DeployPackages(const std::vector<fs::path>& paths);

    /// Installs one package. A failing payload, script or registry entry, a package that is not sound and a cancel have
    /// put back the files of the whole run so far. A package that does not extract has put back nothing.
    EngineResult DeployPackage(const fs::path& path);

    /// Whether a package is to be installed: it is not in the skip list, and no newer version of it is installed.
    /// The spelling is the operation's name.
    bool ShouldInstallPacakge(const Package& package);

    /// 0, or -2 when a package of this phase needs a product that neither this phase nor the machine has.
    EngineResult EnsureDependencies();

    /// Whether the conditions of `payload` let it be placed: 0 passes it over, 1 and -1 (none held) place it.
    static int CheckPayloadPreconditions(const Payload& payload);

    /// Runs the script file and then the command of `script`. Gives 1 when one of them succeeded, 0 when there is
    /// neither or none succeeded and none had to, -2 as soon as one that has to succeed fails. Waits without a limit.
    static EngineResult RunPreOrPostflight(const PayloadScript& script, const Package& package);

    /// Writes one registry value. Gives 0 when it is written or not meant for this system, -1 when its key cannot be
    /// opened, else the registry's own code.
    static EngineResult MakeRegistryEntry(const RegistryEntry& entry);

    /// Makes a shortcut onto one of `placedFiles` and appends it to `installedFiles`. Gives 1, 0 when there is one of
    /// that name already, which is kept, or a failure.
    static EngineResult MakeShortcut(const Shortcut& shortcut, const std::vector<std::string>& placedFiles,
                                     std::vector<std::string>& installedFiles);

    /// 0, or -1 when the package's own check fails.
    static EngineResult ValidatePackage(Package& package);

    /// Builds the suite's JSON text from the product data of the first package that names a suite. False when none
    /// does.
    static bool SynthesizeSuiteInfoFromProducts(const std::vector<fs::path>& packages, std::string& suiteText);

    /// Raises the cancel switch, which is never lowered. Returns at once; the engine looks at it between payloads and
    /// between packages. Any thread may call this.
    void Cancel();

    /// Adds to the percentage, which this way never passes 97.
    void AddProgress(float points) { progress.Add(points); }

    /// Tells the listener and the log how far the run has come. `message` may be null.
    void ReportProgress(const char* message, std::int32_t error) { progress.Report(message, error); }

    /// The share of one package in the 90 points that packages have, by the size of its file.
    float PackageProgressPoints(const fs::path& path) const { return progress.PointsOf(path); }

    /// Lets a folder be installed from only when all that is read of it are files of these names. Another one fails the
    /// run before anything is done.
    void AcceptOnly(std::set<std::string> fileNames) { acceptedNames = std::move(fileNames); }

    void SetVerbose(bool on);
    void SetLegacyUninstall(bool on) { legacyUninstall = on; }
    void SetFatalErrorTest(bool on) { fatalErrorTest = on; }
    void SetListener(ProgressListenerInterface* listener) { progress.SetListener(listener); }

    /// The hosts that payloads are placed for. Detectors can be added until the first payload is placed.
    HostAppCheck& HostCheck() { return hostCheck; }
    DeployRollback& Rollback() { return rollback; }

    /// Whether the system has refused to copy something, which is no failure of the run.
    bool HasLeftOut() const { return leftOut; }

    /// The rows of the build validation table by file name. The engine installs what is not among them as well.
    const std::map<std::string, ValidationInfo>& KnownPackages() const { return validationInfo; }

private:
    // The run over a folder.
    void ReadSuiteInfo(const PackagesFolder& folder);
    EngineResult RunPreflightPhase(const std::vector<fs::path>& packages);
    EngineResult RunMainPhases(const PackagesFolder& folder);
    EngineResult DeployEach(const std::vector<fs::path>& paths);
    bool LoadValidationInfo();

    // One package.
    EngineResult DeployPackage(Package& package, float progressPoints);
    EngineResult InstallValidated(Package& package, float progressPoints, std::string message);
    EngineResult PlacePackage(const Package& package, float progressPoints, const std::string& message);
    EngineResult RollBack(EngineResult result);
    void HandOverToUninstall(const Package& package, const std::vector<std::string>& installedFiles);
    bool WriteUninstallScript(const Package& package, const std::vector<std::string>& installedFiles);
    bool IsCancelled();
    static int RegisterLegacyUninstall();

    // The payloads of a package.
    Placed DeployPackagePayloads(const Package& package, float progressPoints, const std::string& message);
    Placed DeployPayload(const Payload& payload, const Package& package);

    std::uint32_t lastError = 0;  // stays 0: the report "An error has occured" carries no number of its own
    DeployRollback rollback;
    HostAppCheck hostCheck;
    InstalledHistory history;
    HVL::ProductData suiteInfo;
    std::string uninstallPath;
    UninstallScripts uninstallScripts;
    bool verbose = false;
    bool legacyUninstall = false;
    bool cancelled = false;
    bool leftOut = false;
    bool serviceUninstall = false;  // nothing sets it: the standalone script is the one that is written
    boost::mutex cancelMutex;       // guards `cancelled`; never held across a call
    bool fatalErrorTest = false;
    std::vector<std::string> installedIdentifiers;
    std::vector<Package> deployedPackages;
    std::vector<std::string> skipList;
    std::optional<std::set<std::string>> acceptedNames;  // all are, unless somebody has said which
    std::map<std::string, ValidationInfo> validationInfo;
    RunProgress progress;
};

}  // namespace HV
