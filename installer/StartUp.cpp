#include "installer/StartUp.h"

#include <log4cpp/Appender.hh>

#include "hvdeploy/src/GuardedFolders.h"
#include "hvdeploy/src/Logging.h"
#include "hvframework/FileUtils.h"
#include "hvframework/Log.h"
#include "hvframework/TempFolder.h"
#include "installer/WizardBoxes.h"
#include "installer/WizardToolkit.h"

namespace HV {
namespace {

using namespace HVL;

constexpr const char* kLogFileName = "Tessaly Suite Installer.log";

/// A property file that this run has written for itself, in a folder where nobody else can put another one in its
/// place while logging is configured from it. The file stays.
class OwnPropertyFile {
public:
    // What fails here is reported by ConfigureLogging: a property file that is not there, or a log file that it cannot
    // open.
    OwnPropertyFile() : folder_("tmp") {
        if (folder_.IsThere()) {
            path_ = FileUtils::JoinPath(folder_.Path(), "hvinstaller.cfg");
            (void)WriteLoggingConfig(path_, kLogFileName, "");
        }
    }

    [[nodiscard]] const std::string& Path() const { return path_; }

private:
    TempFolder folder_;
    std::string path_;
};

// Fixed (contracts, log): configured twice. A property file that lets the test lines through gets each of them
// twice, and what cannot be done is reported twice. The second round puts new appenders in the place of the
// first's, which the library then forgets: a file that such a one held open could not be rolled over.
void ConfigureTwice(const std::string& file) {
    (void)ConfigureLogging(file);
    log4cpp::Appender::closeAll();
    (void)ConfigureLogging(file);
}

// A folder of that name is nobody's configuration.
void ConfigureFromWhatIsThere() {
    const std::string file = LoggingConfigOfTheMachine();
    ConfigureTwice(FileUtils::FileExists(file) && !IsRefused(file) ? file : OwnPropertyFile().Path());
}

}  // namespace

std::string PackagesDirectoryPath(const std::string& programPath) {
    return FileUtils::JoinPath(FileUtils::GetParentPath(programPath), "packages");
}

void StartLogging() {
    const GuardedFolders guarded;
    ConfigureFromWhatIsThere();
    Log::General().setPriority(log4cpp::Priority::DEBUG);
    Log::Detail().setPriority(log4cpp::Priority::DEBUG);
    guarded.LogWarnings();
}

void RequirePackagesDirectory(WizardToolkit& toolkit, const std::string& packagesDirectory) {
    if (FileUtils::DirectoryExists(packagesDirectory)) {
        return;
    }
    toolkit.MessageBeep(kStopBox);
    toolkit.MessageBoxA(nullptr,
                        "This installer application has been moved. It must be run from its original folder "
                        "containing a packages directory. The installer will now exit.",
                        "Packages Directory Not Found", kStopBox);
    toolkit.ExitProcess(0);
}

}  // namespace HV
