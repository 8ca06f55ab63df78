#pragma once

#include <string>

#include "platform/windows/window.h"

/// What several windows of the wizard do when they paint, and when they are pressed.
namespace HV {

/// The device of a window that is being painted, from BeginPaint to EndPaint.
class PaintDevice {
public:
    explicit PaintDevice(HWND window) : window_(window), device_(::BeginPaint(window, &paint_)) {}
    ~PaintDevice() { ::EndPaint(window_, &paint_); }

    PaintDevice(const PaintDevice&) = delete;
    PaintDevice& operator=(const PaintDevice&) = delete;

    operator HDC() const { return device_; }

private:
    HWND window_;
    PAINTSTRUCT paint_{};
    HDC device_;
};

/// Draws text, which is UTF-8, in the wizard's text colour on its page colour: exactly its characters, ampersands
/// included. What finds no room in `place` ends in an ellipsis. `format` is that of the platform's DrawText.
void DrawPageText(HDC device, const std::string& text, RECT place, HFONT font, unsigned format);

/// The same in a colour of its own, on a background that shows through or is painted, as the device is set.
void DrawColoredText(HDC device, const std::string& text, RECT place, HFONT font, unsigned format, unsigned rgb);

/// Copies a bitmap at its own size. Without a bitmap nothing is drawn.
void DrawBitmap(HDC device, HBITMAP bitmap, int left, int top);

/// A bitmap that this program carries, or null.
[[nodiscard]] HBITMAP LoadOwnBitmap(int number);

/// Fills the client area of a window.
void FillClient(HWND window, HDC device, HBRUSH brush);

/// Whether a WM_COMMAND means that a push button was pressed. The second click of a double click arrives under a code
/// of its own and is no press: by then the button may mean something else, as Continue does that has become Install.
[[nodiscard]] bool IsPress(WPARAM command);

}  // namespace HV
