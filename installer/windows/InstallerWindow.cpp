#include "installer/windows/InstallerWindow.h"

#include "installer/InstallerModel.h"
#include "installer/WinWizardController.h"
#include "installer/WizardArithmetic.h"
#include "installer/windows/Painting.h"
#include "installer/windows/WizardMetrics.h"

namespace HV {

namespace {

constexpr int kIcon = 129;
constexpr int kBanner = 134;
constexpr DWORD kStyle = 0x00C80000;  // caption and system menu: no resizing, no minimise or maximise box
constexpr int kButtonTop = 358;
constexpr unsigned kTitleFormat = DT_SINGLELINE | DT_BOTTOM;

}  // namespace

InstallerWindow::InstallerWindow(WinWizardController& controller, const InstallerModel& model)
    : banner_(LoadOwnBitmap(kBanner)), controller_(controller), title_(model.GetString("installer.title")) {
    const Gdiplus::SolidBrush strip(Gdiplus::Color(OpaqueOf(WizardMetrics::BarColor)));
    buttonOwner_ = std::make_unique<WindowCustomButtonOwner>(strip);
}

InstallerWindow::~InstallerWindow() {
    ::DeleteObject(banner_);
}

ATL::CWndClassInfo& InstallerWindow::GetWndClassInfo() {
    static ATL::CWndClassInfo info{kIcon};
    return info;
}

bool InstallerWindow::CreateCentered(const std::string& caption) {
    if (Create(nullptr, WizardMetrics::WindowRect, caption, kStyle) == nullptr) {
        return false;
    }
    CenterWindow();
    return true;
}

BOOL InstallerWindow::ProcessWindowMessage(HWND, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) {
    switch (message) {
        case WM_CREATE:
            CreateButtons();
            return TRUE;
        case WM_ACTIVATE:
            return focus_.OnActivate(m_hWnd, wParam) ? TRUE : FALSE;
        case WM_CLOSE:
            // Ends the run without raising the engine's cancel, even during an install. The Cancel button raises it;
            // the difference is intended.
            ::DestroyWindow(m_hWnd);
            return TRUE;
        case WM_DESTROY:
            ::PostQuitMessage(0);
            return TRUE;
        case WM_ERASEBKGND:
            // NOLINTNEXTLINE(performance-no-int-to-ptr): messages carry handles as numbers.
            OnErase(reinterpret_cast<HDC>(wParam));
            result = TRUE;
            return TRUE;
        case WM_PAINT:
            OnPaint();
            return TRUE;
        case WM_DRAWITEM:
            // NOLINTNEXTLINE(performance-no-int-to-ptr): messages carry pointers as numbers.
            result = OnDrawItem(*reinterpret_cast<const DRAWITEMSTRUCT*>(lParam)) ? TRUE : FALSE;
            return result != FALSE;
        case WM_TIMER:
            OnTimer(wParam);
            return TRUE;
        case WM_COMMAND:
            OnCommand(wParam);
            return TRUE;
        default:
            return FALSE;
    }
}

CustomButton* InstallerWindow::ButtonForId(int identifier) {
    switch (identifier) {
        case kContinueCommand:
            return &continueButton;
        case kBackCommand:
            return &backButton;
        case kCancelCommand:
            return &cancelButton;
        case kWhatsNewCommand:
            return &whatsNewButton;
        case kResourcesCommand:
            return &resourcesButton;
        case kCloseCommand:
            return &closeButton;
        default:
            return nullptr;
    }
}

void InstallerWindow::CreateButtons() {
    MakeBottomButton(continueButton, "Continue", kContinueCommand, 495, 575, kDisabledButtonStyle);
    MakeBottomButton(backButton, "Back", kBackCommand, 405, 485, kDisabledButtonStyle);
    MakeBottomButton(cancelButton, "Cancel", kCancelCommand, 195, 275, kButtonStyle);
    SendMessageToDescendants(WM_SETFONT, reinterpret_cast<WPARAM>(WizardMetrics::Instance().BodyFont), FALSE);
}

void InstallerWindow::ShowFinalButtons() {
    for (const CustomButton* button : {&continueButton, &backButton, &cancelButton}) {
        ::ShowWindow(button->handle, SW_HIDE);
    }
    MakeBottomButton(whatsNewButton, "What's New...", kWhatsNewCommand, 145, 275, kButtonStyle);
    MakeBottomButton(resourcesButton, "Resources...", kResourcesCommand, 280, 410, kButtonStyle);
    MakeBottomButton(closeButton, "Close", kCloseCommand, 645, 775, kButtonStyle);
    SendMessageToDescendants(WM_SETFONT, reinterpret_cast<WPARAM>(WizardMetrics::Instance().BodyFont), FALSE);
}

void InstallerWindow::MakeBottomButton(CustomButton& button, const std::string& text, int identifier, int left,
                                       int right, DWORD style) {
    button.owner = buttonOwner_.get();
    MakeButton(button, m_hWnd, text, identifier, {left, kButtonTop, right, kButtonTop + WizardMetrics::ButtonHeight},
               style);
}

void InstallerWindow::OnErase(HDC device) const {
    const WizardMetrics& metrics = WizardMetrics::Instance();
    RECT upper = GetClientRect();
    RECT strip = upper;
    upper.bottom = WizardMetrics::BottomRect.top;
    strip.top = WizardMetrics::BottomRect.top;
    ::FillRect(device, &upper, metrics.PageBrush);
    ::FillRect(device, &strip, metrics.BarBrush);
}

void InstallerWindow::OnPaint() const {
    const PaintDevice device(m_hWnd);
    DrawBitmap(device, banner_, 0, 0);
    RECT line = GetClientRect();
    line.left += WizardMetrics::PageRect.left;
    line.bottom = line.top + WizardMetrics::TitleHeight - 4;
    DrawPageText(device, title_, line, WizardMetrics::Instance().TitleFont, kTitleFormat);
}

bool InstallerWindow::OnDrawItem(const DRAWITEMSTRUCT& item) {
    const CustomButton* const button = ButtonForId(static_cast<int>(item.CtlID));
    if (button != nullptr) {
        DrawButton(*button, item);
    }
    return button != nullptr;
}

void InstallerWindow::OnTimer(WPARAM timer) {
    if (timer == kProgressTimer) {
        controller_.OnProgressTimer();
    } else if (timer == kGrowTimer) {
        GrowStep();
    }
}

void InstallerWindow::OnCommand(WPARAM command) {
    const int identifier = LOWORD(command);
    if (IsPress(command) && ButtonForId(identifier) != nullptr) {
        controller_.Perform(identifier);
    }
}

void InstallerWindow::GrowStep() {
    RECT frame{};
    ::GetWindowRect(m_hWnd, &frame);
    constexpr LONG kWidth = WizardMetrics::WideWindowRect.right - WizardMetrics::WideWindowRect.left;
    const Growth step = Grow(frame, kWidth);
    if (step.finished) {
        ::KillTimer(m_hWnd, kGrowTimer);
    }
    // The Close button comes into view at the right: a window that the user has moved to the side grows inwards.
    const RECT place = KeptOnScreen(step.window, ATL::WorkAreaAt(frame));
    ::MoveWindow(m_hWnd, place.left, place.top, place.right - place.left, place.bottom - place.top, TRUE);
}

}  // namespace HV
