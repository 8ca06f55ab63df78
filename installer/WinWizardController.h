#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "installer/WizardToolkit.h"

namespace HV {

class DeployJob;
class InstallerModel;
struct ProductItem;

enum class WizardState : std::int32_t { Welcome = 0, Selection = 1, Installing = 2, Finished = 3, Failed = 4 };

/// The sequence of the wizard: which checks run, which button does what in which state, what line the engine is given,
/// and how its progress and its end come back.
///
/// One object lives for the whole run, on the main thread, which alone calls it. It touches windows through the toolkit
/// and nothing else. Pages and job, once made, are kept until the process ends: Back hides a page, so the user's choice
/// survives a trip.
class WinWizardController {
public:
    /// Neither is owned, and both must outlive this object. The model is loaded before Initialize().
    WinWizardController(WizardToolkit& toolkit, InstallerModel& model);
    virtual ~WinWizardController();

    WinWizardController(const WinWizardController&) = delete;
    WinWizardController& operator=(const WinWizardController&) = delete;

    /// Shows the window (`showCommand` as the program was started with) and the first page, and reports bad packages
    /// and missing hosts. Ends the process where the run cannot go on.
    void Initialize(int showCommand);

    /// Whether a command may run now: none before Initialize() has returned. Tells the user when no product is chosen.
    [[nodiscard]] bool CanPerform(int commandId);

    /// Runs a command that may run now; others do nothing. The identifiers are those of WizardCommand.
    void Perform(int commandId);

    /// One poll of the job: shows its progress, and ends the install when it has finished or failed.
    void OnProgressTimer();

    /// Makes the page with the products to choose from. Throws std::runtime_error when there is one already.
    void CreateSelectionPage();

    InstallerWindow* window = nullptr;
    WizardState state = WizardState::Welcome;
    bool agreed = false;
    bool hasProductChoice = false;  // whether any package is a product that the user sees
    WelcomePage* welcomePage = nullptr;
    SelectionPage* selectionPage = nullptr;
    InstallingPage* installingPage = nullptr;
    FinalPage* finalPage = nullptr;
    DeployJob* job = nullptr;  // lives until the process ends: its thread may outlive the controller
    EULAWindowController* eulaController = nullptr;
    bool initialized = false;  // Initialize() has returned: commands are listened to

private:
    // The way to the first page.
    void MakeWindow(const std::string& caption, int showCommand);
    void CheckPackagesAndHosts();

    // The commands, and the steps that Continue takes.
    [[nodiscard]] bool CanContinue();
    [[nodiscard]] bool HasChoice() const;
    void AgreeCommand();
    void BackCommand();
    void CancelCommand();
    void ReadLicenseCommand();
    void ContinueCommand();
    void EnterSelection();
    void EnterInstalling();

    // What has to be quit before an install.
    void RequireManagerClosed();
    void RequireHostsClosed();
    [[nodiscard]] bool AskToRetry(const std::string& title, const std::string& text);

    // The install.
    void CreateInstallingPage();
    void StartInstall();
    void RefuseWhatHasChanged();
    void ShowPercent(std::uint32_t percent);
    void ShowStatus(const std::string& text);
    void ShowFinalPage();

    // The links of the last page.
    void OpenWhatsNew();
    void OpenResources();
    void OpenUrl(const std::string& url);

    [[noreturn]] void EndWithInvalidPackages();
    [[noreturn]] void EndWith(InstallerWindow* owner, const std::string& title, const std::string& text);
    [[nodiscard]] const char* FirstContinueText() const;

    WizardToolkit& toolkit_;
    InstallerModel& model_;
};

}  // namespace HV
