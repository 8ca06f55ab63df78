// How the wizard comes up: the window first, then what speaks against a run.
#include "installer/WinWizardController.h"

#include <cstdlib>

#include "installer/InstallerModel.h"
#include "installer/WizardBoxes.h"

namespace HV {

WinWizardController::WinWizardController(WizardToolkit& toolkit, InstallerModel& model)
    : toolkit_(toolkit), model_(model) {}
WinWizardController::~WinWizardController() = default;

void WinWizardController::Initialize(int showCommand) {
    MakeWindow(model_.GetString("installer.title.noversion"), showCommand);
    CheckPackagesAndHosts();
    hasProductChoice = !model_.ShownIdentifiers().empty();
    toolkit_.SetContinueText(*window, FirstContinueText());
    initialized = true;
}

void WinWizardController::MakeWindow(const std::string& caption, int showCommand) {
    window = toolkit_.CreateInstallerWindow(*this, model_, caption);
    welcomePage = toolkit_.CreateWelcomePage(*this, model_, *window);
    toolkit_.ShowWindow(WizardPart::MainWindow, showCommand);
}

// These boxes have no owner, so the window behind them takes presses. None of these is a command yet: packages that
// have been refused must not be installed while the box that refuses them is open.
void WinWizardController::CheckPackagesAndHosts() {
    if (!model_.valid) {
        EndWithInvalidPackages();
    }
    if (model_.AllProductsLackHosts()) {
        EndWith(nullptr, "Error: no hosts found.",
                "This installer's products require host applications which are not installed on this computer.");
    }
    if (model_.SomeProductLacksHost()) {
        toolkit_.MessageBeep(kWarningBox);
        toolkit_.MessageBoxA(nullptr,
                             "Some products require host applications which are not installed on this computer. "
                             "Selection of these products for install will be disabled.",
                             "Warning: missing hosts.", kWarningBox);
    }
}

const char* WinWizardController::FirstContinueText() const {
    return hasProductChoice ? "Continue" : "Install";
}

void WinWizardController::EndWithInvalidPackages() {
    EndWith(nullptr, "Error: invalid installer packages.",
            "This installer contains invalid packages and cannot be run.");
}

// Status 0 says that the wizard itself did its part, whatever it had to tell.
void WinWizardController::EndWith(InstallerWindow* owner, const std::string& title, const std::string& text) {
    toolkit_.MessageBeep(kStopBox);
    toolkit_.MessageBoxA(owner, text, title, kStopBox);
    toolkit_.ExitProcess(0);
    std::abort();  // not reached: the compiler forgets of a virtual operation that it does not return
}

}  // namespace HV
