// The buttons: which may be pressed when, and what each does.
#include <stdexcept>

#include "hvdeploy/src/DeployJob.h"
#include "installer/InstallerModel.h"
#include "installer/WinWizardController.h"
#include "installer/WizardBoxes.h"

namespace HV {

bool WinWizardController::CanPerform(int commandId) {
    if (!initialized) {
        return false;
    }
    switch (commandId) {
        case kContinueCommand:
            return CanContinue();
        case kBackCommand:
            return state == WizardState::Selection;
        case kCancelCommand:
        case kCloseCommand:
        case kReadLicenseCommand:
        case kAgreeCommand:
        case kDisagreeCommand:
        case kWhatsNewCommand:
        case kResourcesCommand:
            return true;
        default:
            return false;
    }
}

bool WinWizardController::CanContinue() {
    if (state != WizardState::Selection) {
        return state != WizardState::Installing;
    }
    if (!agreed) {
        return false;
    }
    if (!HasChoice()) {
        toolkit_.MessageBoxA(window, "Please select at least one plugin to install.", "No Products Selected",
                             kPlainBox);
        return false;
    }
    return true;
}

// A page without products has nothing to check, and that is a choice too.
bool WinWizardController::HasChoice() const {
    return toolkit_.CheckedCount(*selectionPage) >= 1 || toolkit_.UncheckedIdentifiers(*selectionPage).empty();
}

void WinWizardController::Perform(int commandId) {
    if (!CanPerform(commandId)) {
        return;
    }
    switch (commandId) {
        case kContinueCommand:
            return ContinueCommand();
        case kBackCommand:
            return BackCommand();
        case kCancelCommand:
        case kCloseCommand:
            return CancelCommand();
        case kReadLicenseCommand:
            return ReadLicenseCommand();
        case kAgreeCommand:
            return AgreeCommand();
        case kDisagreeCommand:
            return toolkit_.PostQuitMessage(0);
        case kWhatsNewCommand:
            return OpenWhatsNew();
        case kResourcesCommand:
            return OpenResources();
        default:
            return;
    }
}

void WinWizardController::AgreeCommand() {
    agreed = true;
    toolkit_.EnableWindow(WizardPart::ContinueButton, true);
    toolkit_.SetContinueHighlighted(*window, true);
    toolkit_.SetContinueText(*window, FirstContinueText());
    for (const WizardPart button : {WizardPart::AgreeButton, WizardPart::DisagreeButton}) {
        toolkit_.EnableWindow(button, false);
        toolkit_.RedrawWindow(button);
    }
}

// The Continue button goes on reading "Install" on the first page: the user has seen the products, and the next two
// presses are an install.
void WinWizardController::BackCommand() {
    toolkit_.ShowWindow(WizardPart::SelectionPage, kHide);
    toolkit_.ShowWindow(WizardPart::WelcomePage, kShow);
    toolkit_.EnableWindow(WizardPart::BackButton, false);
    state = WizardState::Welcome;
}

// The engine is asked to stop and not waited for: a user who cancels wants to be out now. The end of the process may
// cut the undoing off.
void WinWizardController::CancelCommand() {
    if (state == WizardState::Installing && job != nullptr && job->cli != nullptr) {
        job->cli->Cancel();
    }
    toolkit_.PostQuitMessage(0);
}

void WinWizardController::ReadLicenseCommand() {
    if (eulaController == nullptr) {
        eulaController = toolkit_.CreateEULAWindowController();
    }
    toolkit_.ShowAgreement(*eulaController);
}

void WinWizardController::ContinueCommand() {
    switch (state) {
        case WizardState::Welcome:
            return agreed ? EnterSelection() : void();
        case WizardState::Selection:
            return agreed && HasChoice() ? EnterInstalling() : void();
        case WizardState::Finished:
            return toolkit_.PostQuitMessage(0);
        case WizardState::Installing:
        case WizardState::Failed:
            return;
    }
}

void WinWizardController::EnterSelection() {
    if (selectionPage == nullptr) {
        CreateSelectionPage();
    }
    toolkit_.SetContinueText(*window, "Install");
    toolkit_.ShowWindow(WizardPart::WelcomePage, kHide);
    toolkit_.ShowWindow(WizardPart::SelectionPage, kShow);
    toolkit_.EnableWindow(WizardPart::BackButton, true);
    state = WizardState::Selection;
    // With nothing to choose the empty page only flashes by.
    if (!hasProductChoice) {
        ContinueCommand();
    }
}

void WinWizardController::CreateSelectionPage() {
    if (selectionPage != nullptr) {
        // Fixed (contracts, wizard): the sentence lacks a word.
        throw std::runtime_error("This program not be allocating the selection page twice.");
    }
    std::vector<ProductItem> items;
    for (const std::string& identifier : model_.ShownIdentifiers()) {
        const PackageInfo package = model_.FindPackage(identifier);
        const bool usable = !package.requiresHost || package.hostFound;
        items.push_back({package.displayName, package.identifier, usable, usable});
    }
    selectionPage = toolkit_.CreateSelectionPage(*this, *window, items);
}

void WinWizardController::EnterInstalling() {
    RequireManagerClosed();
    RequireHostsClosed();
    if (installingPage == nullptr) {
        CreateInstallingPage();
    }
    toolkit_.ShowWindow(WizardPart::SelectionPage, kHide);
    toolkit_.ShowWindow(WizardPart::InstallingPage, kShow);
    toolkit_.EnableWindow(WizardPart::BackButton, false);
    toolkit_.EnableWindow(WizardPart::ContinueButton, false);
    state = WizardState::Installing;
    StartInstall();
}

}  // namespace HV
