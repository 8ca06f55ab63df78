#include "installer/windows/CustomButton.h"

#include <cstdint>

#include "installer/WizardArithmetic.h"
#include "installer/windows/Painting.h"
#include "installer/windows/WizardMetrics.h"
#include "platform/utf8.h"

namespace HV {

namespace {

// Neither colour nor opacity: the outline is drawn and does not show. A colour here would put a frame around every
// button of the wizard.
constexpr Gdiplus::ARGB kInvisible = 0x00FFFFFF;
constexpr float kPenWidth = 1.0F;
constexpr int kTextInset = 3;
constexpr unsigned kCentred = DT_CENTER | DT_VCENTER | DT_SINGLELINE;

int WidthOf(const RECT& place) {
    return static_cast<int>(place.right - place.left);
}

int HeightOf(const RECT& place) {
    return static_cast<int>(place.bottom - place.top);
}

void Fill(Gdiplus::Graphics& graphics, const Gdiplus::Brush& brush, const RECT& place) {
    graphics.FillRectangle(&brush, static_cast<int>(place.left), static_cast<int>(place.top), WidthOf(place),
                           HeightOf(place));
}

void FillBackground(Gdiplus::Graphics& graphics, CustomButtonOwner* owner, const RECT& place) {
    const Gdiplus::Brush* const background = owner == nullptr ? nullptr : owner->BackgroundBrush();
    if (background != nullptr) {
        return Fill(graphics, *background, place);
    }
    const Gdiplus::SolidBrush black(Gdiplus::Color(OpaqueOf(0x000000)));
    Fill(graphics, black, place);
}

// A disabled button is grey whether it is highlighted or not.
unsigned FaceOf(const CustomButton& button, bool enabled) {
    if (!enabled) {
        return WizardMetrics::DisabledFaceColor;
    }
    return button.highlighted ? WizardMetrics::HighlightColor : WizardMetrics::FaceColor;
}

// In the text of a control an ampersand makes the letter after it a key that presses the control. Two stand for one.
std::wstring ControlText(const std::wstring& text) {
    std::wstring doubled;
    for (const wchar_t letter : text) {
        doubled.append(letter == L'&' ? 2 : 1, letter);
    }
    return doubled;
}

}  // namespace

void CustomButton::SetText(const std::string& newText) {
    if (newText == text) {
        return;
    }
    text = newText;
    if (handle != nullptr) {
        // What the control itself is called is not painted, and is what screen readers say.
        ::SetWindowTextW(handle, ControlText(platform::WideFromUtf8(text)).c_str());
        ::InvalidateRect(handle, nullptr, TRUE);
    }
}

void CustomButton::SetHighlighted(bool newHighlighted) {
    if (newHighlighted == highlighted) {
        return;
    }
    highlighted = newHighlighted;
    if (handle != nullptr) {
        ::InvalidateRect(handle, nullptr, TRUE);
    }
}

void MakeButton(CustomButton& button, HWND parent, const std::string& text, int identifier, const RECT& place,
                DWORD style) {
    button.text = text;
    button.handle = MakeButtonControl(parent, platform::WideFromUtf8(text), identifier, place, style);
}

HWND MakeButtonControl(HWND parent, const std::wstring& text, int identifier, const RECT& place, DWORD style) {
    // NOLINTNEXTLINE(performance-no-int-to-ptr): where a menu would be, a control has its identifier.
    const auto menu = reinterpret_cast<HMENU>(static_cast<std::intptr_t>(identifier));
    return ::CreateWindowExW(0, L"BUTTON", ControlText(text).c_str(), style, place.left, place.top,
                             place.right - place.left, place.bottom - place.top, parent, menu,
                             ::GetModuleHandleW(nullptr), nullptr);
}

bool IsEnabled(const DRAWITEMSTRUCT& item) {
    // The state as a whole: disabled and anything else besides is left to the second question.
    return item.itemState != ODS_DISABLED && ::IsWindowEnabled(item.hwndItem) != FALSE;
}

void DrawButton(const CustomButton& button, const DRAWITEMSTRUCT& item) {
    const bool enabled = IsEnabled(item);
    {
        Gdiplus::Graphics graphics(item.hDC);
        FillBackground(graphics, button.owner, item.rcItem);
        graphics.SetSmoothingMode(Gdiplus::SmoothingModeHighQuality);
        const Gdiplus::SolidBrush face(Gdiplus::Color(OpaqueOf(FaceOf(button, enabled))));
        FillRoundedRect(graphics, face, item.rcItem, kInvisible);
    }
    RECT inside = item.rcItem;
    ::InflateRect(&inside, -kTextInset, -kTextInset);
    ::SetBkMode(item.hDC, TRANSPARENT);
    DrawColoredText(item.hDC, button.text, inside, WizardMetrics::Instance().BodyFont, kCentred,
                    enabled ? WizardMetrics::TextColor : WizardMetrics::DisabledTextColor);
}

void FillRoundedRect(Gdiplus::Graphics& graphics, const Gdiplus::Brush& brush, const RECT& place,
                     Gdiplus::ARGB penColor) {
    const Gdiplus::Unit unit = graphics.GetPageUnit();
    graphics.SetPageUnit(Gdiplus::UnitPixel);
    Gdiplus::Pen pen(Gdiplus::Color(penColor), kPenWidth);
    pen.SetAlignment(Gdiplus::PenAlignmentCenter);
    Gdiplus::GraphicsPath path;
    AddRoundedRect(path, static_cast<int>(place.left), static_cast<int>(place.top), WidthOf(place), HeightOf(place));
    graphics.FillPath(&brush, &path);
    graphics.DrawPath(&pen, &path);
    graphics.SetPageUnit(unit);
}

void AddRoundedRect(Gdiplus::GraphicsPath& path, int x, int y, int width, int height) {
    const int diameter = CornerDiameter(width, height);
    // One pixel short, so that a strip of the background shows on the right and below.
    const int right = x + width - diameter - 1;
    const int bottom = y + height - diameter - 1;
    path.Reset();
    path.AddArc(x, y, diameter, diameter, 180, 90);
    path.AddArc(right, y, diameter, diameter, 270, 90);
    path.AddArc(right, bottom, diameter, diameter, 0, 90);
    path.AddArc(x, bottom, diameter, diameter, 90, 90);
    path.CloseFigure();
}

}  // namespace HV
