#include "installer/StartUp.h"

#include <log4cpp/Appender.hh>

#include "hvdeploy/src/Logging.h"
#include "hvframework/FileUtils.h"
#include "hvframework/Log.h"
#include "hvframework/StringUtils.h"
#include "installer/WizardBoxes.h"
#include "installer/WizardToolkit.h"

namespace HV {
namespace {

using namespace HVL;

constexpr const char* kLogFileName = "Tessaly Suite Installer.log";

std::string PropertyFileOfTheMachine() {
    const std::string company = FileUtils::JoinPath(StringUtils::GetEnvironmentValue("ProgramData"), "Halvorn");
    return FileUtils::JoinPath(FileUtils::JoinPath(company, "Installer"), "halvorn.logging.config");
}

// What fails here is reported by ConfigureLogging: a property file that is not there, or a log file that it cannot
// open.
std::string MakePropertyFile() {
    const std::string folder = FileUtils::MakeTempPath("tmp", FileUtils::GetTempDirectory());
    (void)FileUtils::CreateDirectories(folder);
    const std::string file = folder + "\\hvinstaller.cfg";
    (void)WriteLoggingConfig(file, kLogFileName, "");
    return file;
}

// A folder of that name is nobody's configuration.
std::string ChoosePropertyFile() {
    const std::string file = PropertyFileOfTheMachine();
    return FileUtils::FileExists(file) ? file : MakePropertyFile();
}

}  // namespace

std::string PackagesDirectoryPath(const std::string& programPath) {
    return FileUtils::JoinPath(FileUtils::GetParentPath(programPath), "packages");
}

void StartLogging() {
    const std::string file = ChoosePropertyFile();
    // Fixed (contracts, log): configured twice. A property file that lets the test lines through gets each of them
    // twice, and what cannot be done is reported twice. The second round puts new appenders in the place of the
    // first's, which the library then forgets: a file that such a one held open could not be rolled over.
    (void)ConfigureLogging(file);
    log4cpp::Appender::closeAll();
    (void)ConfigureLogging(file);
    Log::General().setPriority(log4cpp::Priority::DEBUG);
    Log::Detail().setPriority(log4cpp::Priority::DEBUG);
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
