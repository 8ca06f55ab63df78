#pragma once

#include <memory>
#include <string>
#include <vector>

#include "installer/WizardToolkit.h"
#include "platform/windows/window.h"

namespace HV {

/// The wizard's toolkit over real windows.
///
/// Windows and pages that it has made are not released before the process ends. Throws std::runtime_error when the
/// system refuses a window.
class WindowsToolkit : public WizardToolkit {
public:
    InstallerWindow* CreateInstallerWindow(WinWizardController& controller, const InstallerModel& model,
                                           const std::string& caption) override;
    WelcomePage* CreateWelcomePage(WinWizardController& controller, const InstallerModel& model,
                                   InstallerWindow& window) override;
    SelectionPage* CreateSelectionPage(WinWizardController& controller, InstallerWindow& window,
                                       const std::vector<ProductItem>& items) override;
    InstallingPage* CreateInstallingPage(WinWizardController& controller, const InstallerModel& model,
                                         InstallerWindow& window, const std::string& status, int percent) override;
    FinalPage* CreateFinalPage(WinWizardController& controller, InstallerWindow& window) override;

    EULAWindowController* CreateEULAWindowController() override;
    void ShowAgreement(EULAWindowController& viewers) override;

    [[nodiscard]] int CheckedCount(const SelectionPage& page) const override;
    [[nodiscard]] std::vector<std::string> UncheckedIdentifiers(const SelectionPage& page) const override;

    [[nodiscard]] int Percent(const InstallingPage& page) const override;
    [[nodiscard]] std::string StatusText(const InstallingPage& page) const override;
    void SetPercent(InstallingPage& page, int percent) override;
    void SetStatusText(InstallingPage& page, const std::string& text) override;

    void SetContinueText(InstallerWindow& window, const std::string& text) override;
    void SetContinueHighlighted(InstallerWindow& window, bool highlighted) override;
    void ShowFinalButtons(InstallerWindow& window) override;

    void ShowWindow(WizardPart part, int command) override;
    void EnableWindow(WizardPart part, bool enabled) override;
    void RedrawWindow(WizardPart part) override;

    void MessageBeep(unsigned type) override;
    int MessageBoxA(InstallerWindow* owner, const std::string& text, const std::string& title, unsigned type) override;

    void SetTimer(InstallerWindow& window, unsigned timer, unsigned milliseconds) override;
    void KillTimer(InstallerWindow& window, unsigned timer) override;

    void ShellExecuteA(InstallerWindow& owner, const std::string& url) override;

    void PostQuitMessage(int status) override;
    [[noreturn]] void ExitProcess(unsigned status) override;

private:
    [[nodiscard]] HWND HandleOf(WizardPart part) const;
    void KeepFocusUsable() const;

    InstallerWindow* window_ = nullptr;
    WelcomePage* welcomePage_ = nullptr;
    SelectionPage* selectionPage_ = nullptr;
    InstallingPage* installingPage_ = nullptr;
    FinalPage* finalPage_ = nullptr;
};

/// Ends the process from where it stands, with this status, whatever other threads are doing.
[[noreturn]] void EndProcess(unsigned status);

}  // namespace HV
