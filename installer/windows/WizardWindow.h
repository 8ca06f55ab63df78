#pragma once

#include <cstdint>
#include <string>

#include "installer/windows/CustomButton.h"
#include "installer/windows/FocusMemory.h"
#include "installer/windows/Painting.h"
#include "installer/windows/WizardMetrics.h"
#include "platform/windows/atl.h"

namespace HV {

/// What the windows and pages of the wizard have in common: it tells T, which derives from it, what the platform's
/// messages mean.
///
/// T declares, under the names below, what it does in its own way, and declares this base its friend. The rest is done
/// as it stands here. These operations are bound when T is compiled: none of them is virtual.
template <class T>
class WizardWindow : public ATL::CWindowImpl<T> {
public:
    static ATL::CWndClassInfo& GetWndClassInfo() {
        static ATL::CWndClassInfo info{T::kIcon};
        return info;
    }

    BOOL ProcessWindowMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) override {
        switch (message) {
            case WM_CREATE:
                Own().OnCreate();
                return TRUE;
            case WM_ERASEBKGND:
                // NOLINTNEXTLINE(performance-no-int-to-ptr): messages carry handles as numbers.
                Own().OnErase(reinterpret_cast<HDC>(wParam));
                result = TRUE;
                return TRUE;
            case WM_PAINT:
                Own().OnPaint(PaintDevice(window));
                return TRUE;
            case WM_DRAWITEM:
                // NOLINTNEXTLINE(performance-no-int-to-ptr): messages carry pointers as numbers.
                result = Own().OnDrawItem(*reinterpret_cast<const DRAWITEMSTRUCT*>(lParam)) ? TRUE : FALSE;
                return result != FALSE;
            case WM_COMMAND:
                Own().OnCommand(wParam);
                return TRUE;
            default:
                return Own().OnOther(message, wParam) ? TRUE : FALSE;
        }
    }

protected:
    /// The number of the icon in the title bar, 0 for none.
    static constexpr std::uint16_t kIcon = 0;

    /// The window has been made and is not shown yet.
    void OnCreate() {}

    /// Fills the background. A page that does not shows the colour of the main window, which has been painted before.
    void OnErase(HDC /*device*/) {}
    void OnPaint(HDC /*device*/) {}

    /// The push button with this identifier, or null.
    [[nodiscard]] const CustomButton* ButtonForId(int /*identifier*/) const { return nullptr; }

    /// Draws a control; whether there is one of this identifier.
    [[nodiscard]] bool OnDrawItem(const DRAWITEMSTRUCT& item) const {
        const CustomButton* const button = Own().ButtonForId(static_cast<int>(item.CtlID));
        if (button != nullptr) {
            DrawButton(*button, item);
        }
        return button != nullptr;
    }

    /// `command` is that of WM_COMMAND.
    void OnCommand(WPARAM command) {
        if (IsPress(command)) {
            Own().OnPress(LOWORD(command));
        }
    }

    /// A button with this identifier, of whatever window, was pressed.
    void OnPress(int /*identifier*/) {}

    /// Any other message; whether it is dealt with.
    [[nodiscard]] bool OnOther(UINT /*message*/, WPARAM /*wParam*/) { return false; }

    /// Gives every control in the window the font of the wizard's text.
    void SetFontOfControls() const {
        this->SendMessageToDescendants(WM_SETFONT, reinterpret_cast<WPARAM>(WizardMetrics::Instance().BodyFont), FALSE);
    }

private:
    [[nodiscard]] T& Own() { return static_cast<T&>(*this); }
    [[nodiscard]] const T& Own() const { return static_cast<const T&>(*this); }
};

/// A window with a frame of its own, of fixed size: caption and system menu, no minimise or maximise box. When the user
/// comes back to it, the control that had the focus has it again.
template <class T>
class WizardFrame : public WizardWindow<T> {
protected:
    static constexpr std::uint16_t kIcon = 129;

    /// Makes the window, hidden and centred on its monitor. Returns whether it is there.
    [[nodiscard]] bool CreateCentered(const std::string& caption, const RECT& place) {
        constexpr DWORD kStyle = 0x00C80000;
        if (this->Create(nullptr, place, caption, kStyle) == nullptr) {
            return false;
        }
        this->CenterWindow();
        return true;
    }

    /// The close box and Alt+F4 destroy the window.
    [[nodiscard]] bool OnOther(UINT message, WPARAM wParam) {
        switch (message) {
            case WM_ACTIVATE:
                return focus_.OnActivate(*this, wParam);
            case WM_CLOSE:
                ::DestroyWindow(*this);
                return true;
            default:
                return false;
        }
    }

    FocusMemory focus_;
};

}  // namespace HV
