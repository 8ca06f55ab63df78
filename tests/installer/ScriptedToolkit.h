#pragma once

#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "installer/WizardToolkit.h"

// The windows of these tests: records of what would stand on the screen. The controller never looks into them.
namespace HV {

class InstallerWindow {
public:
    std::string caption;
    std::string continueText;
    bool continueHighlighted = false;
    bool hasFinalButtons = false;
};

class WelcomePage {};

class SelectionPage {
public:
    std::vector<ProductItem> items;
};

class InstallingPage {
public:
    std::string status;
    int percent = 0;
};

class FinalPage {};

class EULAWindowController {
public:
    int opened = 0;
};

}  // namespace HV

/// A box as the user saw it.
struct ShownBox {
    std::string title;
    std::string text;
    std::optional<unsigned> beep;  // the beep just before it
    unsigned type = 0;
    bool ownedByWindow = false;
    bool operator==(const ShownBox&) const = default;
};
std::ostream& operator<<(std::ostream& stream, const ShownBox& box);

/// Thrown where the process would end.
struct WizardEnded {
    unsigned status;
};

/// A toolkit without a screen: a test is its user and its clock.
///
/// Boxes are answered from a script; one that the script does not have, and an answer that no box came for, fail the
/// test. Nothing is pressed that a user could not press. Everything that the controller does stands in `calls`, in
/// order.
class ScriptedToolkit : public HV::WizardToolkit {
public:
    ScriptedToolkit();
    ~ScriptedToolkit() override;

    // The user's side

    /// The next box is answered with this button, after `meanwhile`.
    void AnswerNext(int button, std::function<void()> meanwhile = {});
    /// Whether the control that gives this command stands on the screen and can be pressed.
    [[nodiscard]] bool CanPress(int command) const;
    /// Presses it. Fails the test when that cannot be done.
    void Press(int command);
    /// Clicks a product's box on the selection page. Fails the test when that cannot be done.
    void Toggle(const std::string& identifier);
    void DeselectAll();
    void SelectAll();
    /// One tick of a running timer. Fails the test when it does not run.
    void Tick(unsigned timer);

    // What there is to see

    [[nodiscard]] bool IsVisible(HV::WizardPart part) const;
    [[nodiscard]] bool IsEnabled(HV::WizardPart part) const;
    /// The visible pages.
    [[nodiscard]] std::vector<HV::WizardPart> VisiblePages() const;
    [[nodiscard]] HV::InstallerWindow& Window() { return *window_; }
    [[nodiscard]] HV::SelectionPage& Selection() { return *selectionPage_; }
    [[nodiscard]] HV::InstallingPage& Installing() { return *installingPage_; }
    [[nodiscard]] HV::EULAWindowController& Viewers() { return *viewers_; }
    /// The titles of the boxes so far.
    [[nodiscard]] std::vector<std::string> BoxTitles() const;
    /// The calls from the first one that is `first` on; none when there is no such call.
    [[nodiscard]] std::vector<std::string> CallsFrom(const std::string& first) const;

    std::vector<std::string> calls;
    std::vector<ShownBox> boxes;
    std::map<unsigned, unsigned> timers;  // the running ones, with their milliseconds
    std::vector<std::string> urls;
    std::vector<int> quits;  // the statuses that the message loop was ended with
    std::vector<unsigned> exits;

    // The controller's side

    HV::InstallerWindow* CreateInstallerWindow(HV::WinWizardController& controller, const HV::InstallerModel& model,
                                               const std::string& caption) override;
    HV::WelcomePage* CreateWelcomePage(HV::WinWizardController& controller, const HV::InstallerModel& model,
                                       HV::InstallerWindow& window) override;
    HV::SelectionPage* CreateSelectionPage(HV::WinWizardController& controller, HV::InstallerWindow& window,
                                           const std::vector<HV::ProductItem>& items) override;
    HV::InstallingPage* CreateInstallingPage(HV::WinWizardController& controller, const HV::InstallerModel& model,
                                             HV::InstallerWindow& window, const std::string& status,
                                             int percent) override;
    HV::FinalPage* CreateFinalPage(HV::WinWizardController& controller, HV::InstallerWindow& window) override;
    HV::EULAWindowController* CreateEULAWindowController() override;
    void ShowAgreement(HV::EULAWindowController& viewers) override;
    [[nodiscard]] int CheckedCount(const HV::SelectionPage& page) const override;
    [[nodiscard]] std::vector<std::string> UncheckedIdentifiers(const HV::SelectionPage& page) const override;
    [[nodiscard]] int Percent(const HV::InstallingPage& page) const override;
    [[nodiscard]] std::string StatusText(const HV::InstallingPage& page) const override;
    void SetPercent(HV::InstallingPage& page, int percent) override;
    void SetStatusText(HV::InstallingPage& page, const std::string& text) override;
    void SetContinueText(HV::InstallerWindow& window, const std::string& text) override;
    void SetContinueHighlighted(HV::InstallerWindow& window, bool highlighted) override;
    void ShowFinalButtons(HV::InstallerWindow& window) override;
    void ShowWindow(HV::WizardPart part, int command) override;
    void EnableWindow(HV::WizardPart part, bool enabled) override;
    void RedrawWindow(HV::WizardPart part) override;
    void MessageBeep(unsigned type) override;
    int MessageBoxA(HV::InstallerWindow* owner, const std::string& text, const std::string& title,
                    unsigned type) override;
    void SetTimer(HV::InstallerWindow& window, unsigned timer, unsigned milliseconds) override;
    void KillTimer(HV::InstallerWindow& window, unsigned timer) override;
    void ShellExecuteA(HV::InstallerWindow& owner, const std::string& url) override;
    void PostQuitMessage(int status) override;
    [[noreturn]] void ExitProcess(unsigned status) override;

private:
    struct Part {
        bool made = false;
        bool visible = false;
        bool enabled = true;
    };
    struct Answer {
        int button;
        std::function<void()> meanwhile;
    };

    void Note(const std::string& call);
    /// Fails the test when this part has been made before.
    void Make(HV::WizardPart part, bool enabled = true);
    void ExpectWindow(const HV::InstallerWindow& window) const;
    [[nodiscard]] const Part& At(HV::WizardPart part) const;
    void CheckAll(bool checked);

    HV::WinWizardController* controller_ = nullptr;
    std::map<HV::WizardPart, Part> parts_;
    std::unique_ptr<HV::InstallerWindow> window_;
    std::unique_ptr<HV::WelcomePage> welcomePage_;
    std::unique_ptr<HV::SelectionPage> selectionPage_;
    std::unique_ptr<HV::InstallingPage> installingPage_;
    std::unique_ptr<HV::FinalPage> finalPage_;
    std::unique_ptr<HV::EULAWindowController> viewers_;
    std::deque<Answer> answers_;
    std::optional<unsigned> beep_;
};
