#pragma once

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "installer/InstallerModel.h"
#include "installer/WinWizardController.h"
#include "installer/windows/WindowSystem.h"
#include "installer/windows/WindowsToolkit.h"
#include "platform/windows/window.h"
#include "tests/support/Rectangles.h"

/// The real toolkit, but for what would wait for a user or end the test.
class QuietToolkit : public HV::WindowsToolkit {
public:
    void PostQuitMessage(int status) override { quits.push_back(status); }
    void ShellExecuteA(HV::InstallerWindow& /*owner*/, const std::string& url) override { urls.push_back(url); }

    std::vector<int> quits;
    std::vector<std::string> urls;
};

/// A control as its parent sees it.
struct Control {
    int identifier = 0;
    std::wstring kind;  // the name of its class
    std::wstring text;
    RECT place{};
    DWORD style = 0;
    bool operator==(const Control&) const = default;
};
std::ostream& operator<<(std::ostream& stream, const Control& control);

/// The windows directly in `parent`, from the top one down: controls in the order in which they were made, the page
/// that was made last before them.
std::vector<Control> ControlsOf(HWND parent);

/// The name of the font that the window says it writes in.
HFONT FontOf(HWND window);

/// Has what a test of windows needs. The windows of a test are gone when it ends, and so is what they posted.
class WindowTest : public testing::Test {
protected:
    /// The controller listens to commands, as it does once a wizard has come up: these tests make windows one by one.
    WindowTest() { controller.initialized = true; }
    ~WindowTest() override;

    /// A window for controls and pages, of 700 by 500, which is visible.
    HWND Parent();

    /// Presses the control, as a mouse would, with this notification.
    static void Press(HWND parent, int identifier, unsigned code = BN_CLICKED);

    HV::WindowSystem system;
    QuietToolkit toolkit;
    HV::InstallerModel model{{}};  // not loaded: the windows of these tests have no texts of their release
    HV::WinWizardController controller{toolkit, model};

private:
    HWND parent_ = nullptr;
};

/// A picture in memory that controls are drawn into.
class Canvas {
public:
    Canvas(int width, int height);
    ~Canvas();
    Canvas(const Canvas&) = delete;
    Canvas& operator=(const Canvas&) = delete;

    [[nodiscard]] HDC Device() const { return device_; }
    /// Red, green, blue.
    [[nodiscard]] unsigned At(int x, int y) const;
    /// How many points have this colour.
    [[nodiscard]] int Count(unsigned rgb) const;
    /// Whether every point of the area has this colour.
    [[nodiscard]] bool IsFilled(const RECT& area, unsigned rgb) const;

private:
    int width_;
    int height_;
    HDC device_ = nullptr;
    HBITMAP bitmap_ = nullptr;
    HGDIOBJ before_ = nullptr;
    const unsigned* points_ = nullptr;
};

/// How the platform asks for a control to be drawn, over a whole picture.
DRAWITEMSTRUCT DrawRequest(const Canvas& canvas, HWND control, const RECT& place, UINT state = 0);
