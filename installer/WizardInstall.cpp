// The install: the line for the engine, the job that runs it, and the polls until its end.
#include <ctime>
#include <deque>
#include <memory>

#include "hvdeploy/src/DeployJob.h"
#include "hvframework/FileUtils.h"
#include "installer/InstallLine.h"
#include "installer/InstallerModel.h"
#include "installer/WinWizardController.h"
#include "installer/WizardBoxes.h"
#include "platform/command_processor.h"
#include "platform/shared_directory.h"
#include "system/SystemDirectories.h"

namespace HV {
namespace {

constexpr unsigned kMillisecondsBetweenPolls = 333;
constexpr unsigned kMillisecondsBetweenGrowths = 50;
constexpr std::uint32_t kWholePercent = 100;
constexpr int kEmptyBar = -1;

// Nobody joins the job's thread, so the job outlives whatever made it: the process keeps it.
DeployJob* KeptJob(std::string commandLine) {
    static auto& jobs = *new std::deque<std::unique_ptr<DeployJob>>();
    jobs.push_back(std::make_unique<DeployJob>(std::move(commandLine)));
    return jobs.back().get();
}

std::string SharedSubdirectory(const std::string& directory, const char* name) {
    std::string path = HVL::FileUtils::JoinPath(directory, name);
    platform::CreateSharedDirectory(path);
    return path;
}

std::string LogPathPrefix(const std::string& suiteIdentifier) {
    const std::string halvorn = SharedSubdirectory(GetSystemDirectory(SysDir::ProgramData).string(), "Halvorn");
    return HVL::FileUtils::JoinPath(SharedSubdirectory(halvorn, "logs"), suiteIdentifier + "-");
}

struct Report {
    std::string text;
    std::uint32_t percent;
    std::int32_t error;
};

Report LatestReport(DeployJob& job) {
    const boost::mutex::scoped_lock guard(job.lock);
    return {job.text, job.percent, job.error};
}

}  // namespace

void WinWizardController::CreateInstallingPage() {
    installingPage = toolkit_.CreateInstallingPage(*this, model_, *window, "Detecting host applications...", 0);
}

// Minutes may have gone by since the packages were tested.
void WinWizardController::RefuseWhatHasChanged() {
    if (!model_.PackagesAreUntouched()) {
        EndWithInvalidPackages();
    }
}

// Packages that the user does not see are not on the page, so the line never skips them.
void WinWizardController::StartInstall() {
    // Where the wizard was started is where the release lies, often a folder of downloads: no script is to find its
    // programs there. All paths of the line are whole ones.
    platform::EnterSystemFolder();
    RefuseWhatHasChanged();
    job =
        KeptJob(InstallLine({toolkit_.UncheckedIdentifiers(*selectionPage), LogPathPrefix(model_.suite.GetIdentifier()),
                             std::time(nullptr), model_.packagesDirectory}));
    job->AcceptOnly(model_.NamesOfRelease());
    job->Start();
    toolkit_.SetTimer(*window, kProgressTimer, kMillisecondsBetweenPolls);
}

void WinWizardController::OnProgressTimer() {
    if (state != WizardState::Installing || job == nullptr) {
        toolkit_.KillTimer(*window, kProgressTimer);
        return;
    }
    const Report report = LatestReport(*job);
    if (report.error != 0) {
        state = WizardState::Failed;
        toolkit_.SetPercent(*installingPage, kEmptyBar);
    } else {
        // A failing run reports a hundred just before its failure. A poll that lands there takes it for a success, and
        // that is accepted: the job's thread has no other result to ask for.
        if (report.percent == kWholePercent) {
            state = WizardState::Finished;
        }
        ShowPercent(report.percent);
    }
    ShowStatus(report.text);
    if (state == WizardState::Installing) {
        return;
    }
    toolkit_.KillTimer(*window, kProgressTimer);
    if (state == WizardState::Finished) {
        ShowFinalPage();
        return;
    }
    EndWith(window, "Installation Failed",
            "An error prevented the install from completing. The installation log has been written to the Halvorn logs "
            "directory in ProgramData.");
}

void WinWizardController::ShowPercent(std::uint32_t percent) {
    const int shown = static_cast<int>(percent);
    if (toolkit_.Percent(*installingPage) != shown) {
        toolkit_.SetPercent(*installingPage, shown);
    }
}

// An empty text never blanks the line: the last thing told stays until there is another.
void WinWizardController::ShowStatus(const std::string& text) {
    if (!text.empty() && toolkit_.StatusText(*installingPage) != text) {
        toolkit_.SetStatusText(*installingPage, text);
    }
}

void WinWizardController::ShowFinalPage() {
    if (finalPage == nullptr) {
        finalPage = toolkit_.CreateFinalPage(*this, *window);
    }
    toolkit_.ShowWindow(WizardPart::InstallingPage, kHide);
    toolkit_.ShowFinalButtons(*window);
    toolkit_.ShowWindow(WizardPart::FinalPage, kShow);
    toolkit_.SetTimer(*window, kGrowTimer, kMillisecondsBetweenGrowths);
}

}  // namespace HV
