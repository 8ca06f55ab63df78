#include "installer/windows/EULAWindow.h"

#include <algorithm>

#include "installer/WizardArithmetic.h"
#include "installer/windows/EULAWindowController.h"
#include "installer/windows/Painting.h"
#include "installer/windows/WizardMetrics.h"

namespace HV {

namespace {

constexpr int kIcon = 129;
constexpr int kAgreement = 137;
constexpr DWORD kStyle = 0x00C80000;  // caption and system menu: no resizing
constexpr RECT kWindowRect{0, 0, kViewerWidth, kViewerHeight};
constexpr int kCloseControl = 161;
constexpr int kSaveControl = 1184;
constexpr DWORD kRichTextStyle = 0x50A10844;
constexpr LONG kInset = 10;

// The window where the screen has room for it; else as much as there is room for, so that its buttons can be reached.
RECT CutToScreen(const RECT& window) {
    const RECT area = ATL::WorkAreaAt(window);
    return {window.left, window.top, window.left + std::min(window.right - window.left, area.right - area.left),
            window.top + std::min(window.bottom - window.top, area.bottom - area.top)};
}

ViewerPlaces PlacesIn(HWND viewer) {
    RECT frame{};
    ::GetWindowRect(viewer, &frame);
    return PlacesInViewer(frame.right - frame.left, frame.bottom - frame.top);
}

}  // namespace

std::string LoadAgreementText() {
    const HRSRC found = ::FindResourceA(nullptr, MAKEINTRESOURCEA(kAgreement), "RICHTEXTFORMAT");
    const HGLOBAL loaded = found == nullptr ? nullptr : ::LoadResource(nullptr, found);
    const auto* const bytes = loaded == nullptr ? nullptr : static_cast<const char*>(::LockResource(loaded));
    // It does not end in a zero: its size is the only end that it has.
    std::string text = bytes == nullptr ? std::string() : std::string(bytes, ::SizeofResource(nullptr, found));
    if (loaded != nullptr) {
        ::FreeResource(loaded);
    }
    return text.empty() ? "ERROR: license agreement data failed to load from resource." : text;
}

EULAWindow::EULAWindow(EULAWindowController& controller) : controller_(controller) {}

ATL::CWndClassInfo& EULAWindow::GetWndClassInfo() {
    static ATL::CWndClassInfo info{kIcon};
    return info;
}

bool EULAWindow::CreateCentered() {
    if (Create(nullptr, CutToScreen(kWindowRect), "Halvorn Software License", kStyle) == nullptr) {
        return false;
    }
    CenterWindow();
    return true;
}

BOOL EULAWindow::ProcessWindowMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) {
    switch (message) {
        case WM_CREATE:
            OnCreate();
            return TRUE;
        case WM_ERASEBKGND:
            // NOLINTNEXTLINE(performance-no-int-to-ptr): messages carry handles as numbers.
            FillClient(window, reinterpret_cast<HDC>(wParam), WizardMetrics::Instance().LightBrush);
            result = TRUE;
            return TRUE;
        case WM_PAINT: {
            const PaintDevice nothing(window);
            return TRUE;
        }
        case WM_ACTIVATE:
            return focus_.OnActivate(window, wParam) ? TRUE : FALSE;
        case WM_CLOSE:
            ::DestroyWindow(window);
            return TRUE;
        case WM_DRAWITEM:
            // NOLINTNEXTLINE(performance-no-int-to-ptr): messages carry pointers as numbers.
            result = OnDrawItem(*reinterpret_cast<const DRAWITEMSTRUCT*>(lParam)) ? TRUE : FALSE;
            return result != FALSE;
        case WM_COMMAND:
            OnCommand(wParam);
            return TRUE;
        default:
            return FALSE;
    }
}

void EULAWindow::OnFinalMessage(HWND) {
    controller_.Forget(*this);
    delete this;
}

void EULAWindow::OnCreate() {
    const ViewerPlaces places = PlacesIn(m_hWnd);
    MakeButton(closeButton_, m_hWnd, "Close", kCloseControl, places.closeButton);
    saveButton_.highlighted = true;
    MakeButton(saveButton_, m_hWnd, "Save License", kSaveControl, places.saveButton);
    const RECT& text = places.text;
    richText_ =
        ::CreateWindowExW(0, L"RICHEDIT50W", L"License", kRichTextStyle, text.left, text.top, text.right - text.left,
                          text.bottom - text.top, m_hWnd, nullptr, ::GetModuleHandleW(nullptr), nullptr);
    agreementText_ = LoadAgreementText();
    InsetText();
    ShowText();
    // There is one thing to do at first, and the keys are to do it: to read.
    focus_.Remember(richText_);
}

void EULAWindow::InsetText() const {
    RECT text{};
    ::SendMessageW(richText_, EM_GETRECT, 0, reinterpret_cast<LPARAM>(&text));
    text.left += kInset;
    text.top += kInset;
    text.right -= kInset;
    // The bottom stays: text that is scrolled runs down to the edge.
    ::SendMessageW(richText_, EM_SETRECT, 0, reinterpret_cast<LPARAM>(&text));
}

void EULAWindow::ShowText() const {
    SETTEXTEX as{};
    as.flags = ST_DEFAULT;
    as.codepage = CP_ACP;
    ::SendMessageA(richText_, EM_SETTEXTEX, reinterpret_cast<WPARAM>(&as),
                   reinterpret_cast<LPARAM>(agreementText_.c_str()));
}

bool EULAWindow::OnDrawItem(const DRAWITEMSTRUCT& item) const {
    if (item.CtlID != kCloseControl && item.CtlID != kSaveControl) {
        return false;
    }
    DrawButton(item.CtlID == kCloseControl ? closeButton_ : saveButton_, item);
    return true;
}

void EULAWindow::OnCommand(WPARAM command) {
    if (!IsPress(command)) {
        // The text has notifications of its own.
        return;
    }
    switch (LOWORD(command)) {
        case kCloseControl:
        case IDCANCEL:  // the Escape key
            ::DestroyWindow(m_hWnd);
            return;
        case kSaveControl:
            controller_.SaveAgreement(agreementText_, *this);
            return;
        default:
            return;
    }
}

}  // namespace HV
