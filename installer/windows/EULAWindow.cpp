#include "installer/windows/EULAWindow.h"

#include <algorithm>

#include "installer/WizardArithmetic.h"
#include "installer/windows/EULAWindowController.h"
#include "installer/windows/WizardMetrics.h"
#include "platform/program.h"

namespace HV {

namespace {

constexpr int kAgreement = 137;
constexpr RECT kWindowRect{0, 0, kViewerWidth, kViewerHeight};
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
    const std::string text = platform::CompiledResource(kAgreement, "RICHTEXTFORMAT");
    return text.empty() ? "ERROR: license agreement data failed to load from resource." : text;
}

EULAWindow::EULAWindow(EULAWindowController& controller) : controller_(controller) {}

bool EULAWindow::CreateCentered() {
    return WizardFrame::CreateCentered("Halvorn Software License", CutToScreen(kWindowRect));
}

void EULAWindow::OnFinalMessage(HWND) {
    controller_.Forget(*this);
    delete this;
}

void EULAWindow::OnCreate() {
    const ViewerPlaces places = PlacesIn(m_hWnd);
    MakeButton(closeButton_, m_hWnd, "Close", kCloseViewerControl, places.closeButton);
    saveButton_.highlighted = true;
    MakeButton(saveButton_, m_hWnd, "Save License", kSaveLicenseControl, places.saveButton);
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

void EULAWindow::OnErase(HDC device) const {
    FillClient(m_hWnd, device, WizardMetrics::Instance().LightBrush);
}

const CustomButton* EULAWindow::ButtonForId(int identifier) const {
    switch (identifier) {
        case kCloseViewerControl:
            return &closeButton_;
        case kSaveLicenseControl:
            return &saveButton_;
        default:
            return nullptr;
    }
}

void EULAWindow::OnPress(int identifier) {
    switch (identifier) {
        case kCloseViewerControl:
        case IDCANCEL:  // the Escape key
            ::DestroyWindow(m_hWnd);
            return;
        case kSaveLicenseControl:
            controller_.SaveAgreement(agreementText_, *this);
            return;
        default:
            return;
    }
}

}  // namespace HV
