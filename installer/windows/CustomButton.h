#pragma once

#include <memory>
#include <string>

#include "platform/windows/gdiplus.h"

/// The wizard's push buttons: rounded rectangles that their owner draws. They have no pressed, hover or focus
/// appearance.
namespace HV {

/// A window that has buttons says what they are drawn on.
class CustomButtonOwner {
public:
    virtual ~CustomButtonOwner() = default;

    /// The brush that the corners of buttons are filled with, not given away; null for black.
    virtual Gdiplus::Brush* BackgroundBrush() = 0;
};

/// An owner with a brush of its own.
class WindowCustomButtonOwner final : public CustomButtonOwner {
public:
    /// Clones `brush`.
    explicit WindowCustomButtonOwner(const Gdiplus::Brush& brush) : brush_(brush.Clone()) {}

    Gdiplus::Brush* BackgroundBrush() override { return brush_.get(); }

private:
    std::unique_ptr<Gdiplus::Brush> brush_;
};

/// One push button.
struct CustomButton {
    HWND handle = nullptr;  // null until made
    std::string text;
    bool highlighted = false;
    CustomButtonOwner* owner = nullptr;  // not owned, may be null

    /// A text that differs is stored and painted. The same text again causes no painting.
    void SetText(const std::string& newText);

    /// The blue fill, seen while the button is enabled.
    void SetHighlighted(bool newHighlighted);
};

/// The styles of the wizard's buttons: child, visible, tab stop, drawn by the owner; and disabled.
constexpr DWORD kButtonStyle = 0x5001000B;
constexpr DWORD kDisabledButtonStyle = 0x5801000B;

/// Makes the control of a button, which has neither control nor text yet, as a child of `parent`.
void MakeButton(CustomButton& button, HWND parent, const std::string& text, int identifier, const RECT& place,
                DWORD style = kButtonStyle);

/// Makes a control of the class "BUTTON"; `text` is what the system calls it, letter for letter.
[[nodiscard]] HWND MakeButtonControl(HWND parent, const std::wstring& text, int identifier, const RECT& place,
                                     DWORD style);

/// Whether a control that is to be drawn is enabled.
[[nodiscard]] bool IsEnabled(const DRAWITEMSTRUCT& item);

/// Draws a button as the platform asks for it.
void DrawButton(const CustomButton& button, const DRAWITEMSTRUCT& item);

/// Fills a rounded rectangle and draws its outline one pixel wide.
void FillRoundedRect(Gdiplus::Graphics& graphics, const Gdiplus::Brush& brush, const RECT& place,
                     Gdiplus::ARGB penColor);

/// Makes `path` one rounded rectangle, which stops one pixel short of the right and bottom edges.
void AddRoundedRect(Gdiplus::GraphicsPath& path, int x, int y, int width, int height);

}  // namespace HV
