// What must not run during an install: the manager application and the hosts.
#include "installer/InstallerModel.h"
#include "installer/RunningHostsText.h"
#include "installer/WinWizardController.h"
#include "installer/WizardBoxes.h"

namespace HV {

void WinWizardController::RequireManagerClosed() {
    while (model_.ManagerIsRunning() &&
           AskToRetry("Halvorn Application Manager is running.",
                      "Please quit Halvorn Application Manager and retry, or cancel to exit the installer.")) {
    }
}

// The hosts of all packages count, those of unchecked products too. A process without a name, which the search for
// HitFilm finds, makes RunningHostsText() throw, and nothing catches that: there is no name to ask the user about.
void WinWizardController::RequireHostsClosed() {
    std::vector<ProcessRecord> running;
    while (model_.FindRunningHosts(running) && AskToRetry("Host applications running.", RunningHostsText(running))) {
    }
}

// Whether the user wants the check repeated. Cancel ends the process; whatever else closes the box lets the run go on.
bool WinWizardController::AskToRetry(const std::string& title, const std::string& text) {
    toolkit_.MessageBeep(kWarningBox);
    const int button = toolkit_.MessageBoxA(nullptr, text, title, kRetryBox);
    if (button == kCancelButton) {
        toolkit_.ExitProcess(0);
    }
    return button == kRetryButton;
}

}  // namespace HV
