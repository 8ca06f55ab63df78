#pragma once

#include <gtest/gtest.h>
#include <windows.h>

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "tests/wizard/Look.h"

/// The identifiers of the wizard's controls and timers. They stand here a second time on purpose: taken from the
/// program they would prove nothing.
namespace id {
constexpr int Continue = 1124;
constexpr int Back = 1125;
constexpr int Cancel = 1126;
constexpr int ReadLicense = 1127;
constexpr int Agree = 1128;
constexpr int Disagree = 1129;
constexpr int DeselectAll = 1130;
constexpr int SelectAll = 1131;
constexpr int WhatsNew = 1133;
constexpr int Resources = 1134;
constexpr int FirstProduct = 1144;
constexpr int Close = 1165;
constexpr int CloseViewer = 161;
constexpr int SaveLicense = 1184;
constexpr unsigned GrowTimer = 62018;
}  // namespace id

/// Asks again every 20 ms until the answer is yes; whether it came within a minute, the time that a busy machine may
/// take for anything.
bool Eventually(const std::function<bool()>& question);

/// A control as another process sees it. The rectangle is that of its parent's client area.
struct Control {
    HWND handle = nullptr;
    int id = 0;
    std::string kind;  // the window class
    RECT part{};
    DWORD style = 0;  // without "visible" and "disabled"
    bool visible = false;
    bool enabled = false;
};

/// A modal box.
struct Box {
    HWND handle = nullptr;
    std::string title;
    std::string text;
    std::vector<int> buttons;  // identifiers, in ascending order
    HWND owner = nullptr;
    bool hasIcon = false;
};

/// A wizard that a user has started: another process, seen and handled from outside as far as its windows allow.
///
/// Waits are questions asked again; see Eventually(). What does not come about fails the test. A wizard that still runs
/// at the end is ended.
class RunningWizard {
public:
    /// Starts hvinstaller.exe in this folder.
    explicit RunningWizard(const std::string& folder);
    ~RunningWizard();
    RunningWizard(const RunningWizard&) = delete;
    RunningWizard& operator=(const RunningWizard&) = delete;

    /// The main window, once it is to be seen and listens. It is the one with the buttons.
    HWND Window();
    /// Whether it is to be seen already.
    [[nodiscard]] bool HasWindow();
    /// The page that is visible now; null between two pages.
    [[nodiscard]] HWND Page();
    /// Waits for a visible page that has, or has not, a control of this identifier.
    HWND PageWith(int id);
    HWND PageWithoutControls();

    /// Every agreement viewer that is open, in the order of their handles.
    [[nodiscard]] std::vector<HWND> Viewers() const;

    /// The direct children of a window which are controls (pages are not), in the order in which they were made.
    [[nodiscard]] static std::vector<Control> Controls(HWND parent);
    [[nodiscard]] static Control ControlOf(HWND parent, int id);

    /// Presses a button as a user could: it must be there, visible and enabled, or becomes so. Press() is over when the
    /// program has dealt with it; PressForBox() at once, since a modal box keeps the program in there.
    void Press(HWND parent, int id);
    void PressForBox(HWND parent, int id);
    /// Two presses, one straight after the other, before the program has time for anything else.
    void PressBoth(HWND parent, int first, int second);
    /// Clicks with the mouse, so many times within the time of a double click. Over before the program has dealt with
    /// it.
    static void ClickQuickly(HWND parent, int id, int times);
    /// Gives a command as its control would, whether or not that can be pressed.
    static void Command(HWND parent, int id);
    /// The control that has the focus, or the window itself; null when the program has no focus.
    [[nodiscard]] HWND Focus();
    /// The identifier of the control that comes to have the focus; waits until it is this one.
    [[nodiscard]] bool ComesToFocus(int id);
    /// A key that goes down and up, at what has the focus now. Over before the program has dealt with it.
    void Type(WPARAM key);
    /// The close box of a window's title bar.
    static void CloseFromTitleBar(HWND window);

    /// Waits for a modal box with this title.
    Box WaitForBox(const std::string& title);
    void Answer(const Box& box, int button);
    /// A box with one button.
    void AnswerOk(const Box& box);
    [[nodiscard]] bool HasBox() const;
    /// The modal box that is open now, whatever its title is.
    [[nodiscard]] std::optional<Box> OpenBox() const;

    /// Whether the client area comes to show all of these, and, when not, which ones it does not.
    testing::AssertionResult Shows(HWND window, const std::vector<look::Mark>& marks);

    /// Waits for the end of the process, and gives its exit status.
    std::optional<DWORD> ExitStatus();
    [[nodiscard]] bool IsRunning() const;
    /// The folder that is current in the wizard, without a separator at its end.
    [[nodiscard]] std::string CurrentFolder() const;
    [[nodiscard]] DWORD Id() const { return process_.dwProcessId; }

private:
    [[nodiscard]] std::vector<HWND> TopWindows() const;

    PROCESS_INFORMATION process_{};
    HWND window_ = nullptr;
};

/// In UTF-8.
std::string TextOf(HWND window);
std::string ClassOf(HWND window);
/// Outer rectangle on the screen, and the part of a parent's client area that a child takes.
RECT OnScreen(HWND window);
RECT InParent(HWND window);
