#pragma once

#include <string>
#include <vector>

#include "installer/ProductItems.h"

/// All that the wizard's controller asks of a window toolkit, under the platform's own names where it has one.
///
/// The controller decides what happens; a toolkit shows it. So the controller runs with any toolkit, a scripted one
/// among them. Windows and pages are named by pointers that the toolkit gives out and the controller only hands back:
/// it never looks into them. Texts are UTF-8 and show exactly their characters.
namespace HV {

class EULAWindowController;
class FinalPage;
class InstallerModel;
class InstallerWindow;
class InstallingPage;
class SelectionPage;
class WelcomePage;
class WinWizardController;

/// The commands of the wizard: the identifiers of the controls that give them.
enum WizardCommand : int {
    kContinueCommand = 1124,
    kBackCommand = 1125,
    kCancelCommand = 1126,
    kReadLicenseCommand = 1127,
    kAgreeCommand = 1128,
    kDisagreeCommand = 1129,
    kWhatsNewCommand = 1133,
    kResourcesCommand = 1134,
    kCloseCommand = 1165,
};

/// The timers of the main window.
enum WizardTimer : unsigned {
    kProgressTimer = 62017,  // polls the job
    kGrowTimer = 62018,      // widens the window when the install has finished
};

/// What can be shown, hidden, enabled and disabled.
enum class WizardPart {
    MainWindow,
    WelcomePage,
    SelectionPage,
    InstallingPage,
    FinalPage,
    ContinueButton,
    BackButton,
    AgreeButton,
    DisagreeButton,
};

/// Belongs to the main thread, as every window does. What it makes lives until the process ends.
class WizardToolkit {
public:
    virtual ~WizardToolkit() = default;

    /// Makes the main window, hidden and centred on its monitor, with the caption of its frame. Its buttons go to
    /// Perform() of the controller, the timer kProgressTimer to OnProgressTimer(). There is one in a process.
    virtual InstallerWindow* CreateInstallerWindow(WinWizardController& controller, const InstallerModel& model,
                                                   const std::string& caption) = 0;

    /// The pages, children of the main window, each visible from the start.
    virtual WelcomePage* CreateWelcomePage(WinWizardController& controller, const InstallerModel& model,
                                           InstallerWindow& window) = 0;
    virtual SelectionPage* CreateSelectionPage(WinWizardController& controller, InstallerWindow& window,
                                               const std::vector<ProductItem>& items) = 0;
    virtual InstallingPage* CreateInstallingPage(WinWizardController& controller, const InstallerModel& model,
                                                 InstallerWindow& window, const std::string& status, int percent) = 0;
    virtual FinalPage* CreateFinalPage(WinWizardController& controller, InstallerWindow& window) = 0;

    /// What opens agreement viewers, and one more viewer.
    virtual EULAWindowController* CreateEULAWindowController() = 0;
    virtual void ShowAgreement(EULAWindowController& viewers) = 0;

    /// The choice as it stands on the page: see ProductItems.h.
    [[nodiscard]] virtual int CheckedCount(const SelectionPage& page) const = 0;
    [[nodiscard]] virtual std::vector<std::string> UncheckedIdentifiers(const SelectionPage& page) const = 0;

    /// What the installing page shows. A percent of -1 is an empty bar.
    [[nodiscard]] virtual int Percent(const InstallingPage& page) const = 0;
    [[nodiscard]] virtual std::string StatusText(const InstallingPage& page) const = 0;
    virtual void SetPercent(InstallingPage& page, int percent) = 0;
    virtual void SetStatusText(InstallingPage& page, const std::string& text) = 0;

    /// The text of the Continue button and its blue fill.
    virtual void SetContinueText(InstallerWindow& window, const std::string& text) = 0;
    virtual void SetContinueHighlighted(InstallerWindow& window, bool highlighted) = 0;

    /// Puts the buttons of the finished wizard in the place of the others.
    virtual void ShowFinalButtons(InstallerWindow& window) = 0;

    /// `command` is the platform's: 0 hides, 5 shows, others as a program was started with. A part that has not been
    /// made is passed over.
    virtual void ShowWindow(WizardPart part, int command) = 0;
    virtual void EnableWindow(WizardPart part, bool enabled) = 0;
    /// Lets the part paint again: the redraw message with 1.
    virtual void RedrawWindow(WizardPart part) = 0;

    /// A beep, and a modal box; `owner` is null or the main window. Gives the platform's number of the button: 1 OK,
    /// 2 Cancel, 4 Retry.
    virtual void MessageBeep(unsigned type) = 0;
    virtual int MessageBoxA(InstallerWindow* owner, const std::string& text, const std::string& title,
                            unsigned type) = 0;

    /// A repeating timer on the main window; setting one that runs starts it anew.
    virtual void SetTimer(InstallerWindow& window, unsigned timer, unsigned milliseconds) = 0;
    virtual void KillTimer(InstallerWindow& window, unsigned timer) = 0;

    /// Opens a URL with the verb "open"; failures are the user's to see, not the wizard's.
    virtual void ShellExecuteA(InstallerWindow& owner, const std::string& url) = 0;

    /// Ends the message loop, and the process from where it stands.
    virtual void PostQuitMessage(int status) = 0;
    [[noreturn]] virtual void ExitProcess(unsigned status) = 0;
};

}  // namespace HV
