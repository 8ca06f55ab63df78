#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "installer/WizardToolkit.h"

namespace HV {

class DeployJob;
struct ProductItem;

enum class WizardState : std::int32_t { Welcome = 0, Selection = 1, Installing = 2, Finished = 3, Failed = 4 };

/// The sequence of the wizard: which checks run, which button does what in which state, what line the engine is given,
/// and how its progress and its end come back.
///
/// One object lives for the whole run, on the main thread, which alone calls it. It touches windows through the toolkit
/// and nothing else, and works on InstallerModel::Instance(). Pages and job, once made, are kept until the process
/// ends: Back hides a page, so the user's choice survives a trip.
class WinWizardController {
public:
    /// `toolkit` is not owned and must outlive this object.
    explicit WinWizardController(WizardToolkit& toolkit);
    virtual ~WinWizardController();

    WinWizardController(const WinWizardController&) = delete;
    WinWizardController& operator=(const WinWizardController&) = delete;

    /// Loads the model, shows the window (`showCommand` as the program was started with) and the first page, and
    /// reports bad packages and missing hosts. Ends the process where the run cannot go on.
    void Initialize(int showCommand);

    /// Whether a command may run now. Tells the user when no product is chosen.
    [[nodiscard]] bool CanPerform(int commandId);

    /// Runs a command that may run now; others do nothing. The identifiers are those of WizardCommand.
    void Perform(int commandId);

    /// One poll of the job: shows its progress, and ends the install when it has finished or failed.
    void OnProgressTimer();

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

private:
    WizardToolkit& toolkit_;
};

}  // namespace HV
