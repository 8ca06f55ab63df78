#include "installer/windows/InstallerWindow.h"

#include "installer/InstallerModel.h"
#include "installer/WinWizardController.h"
#include "installer/WizardArithmetic.h"
#include "installer/windows/WizardMetrics.h"

namespace HV {

namespace {

constexpr int kBanner = 134;
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

bool InstallerWindow::CreateCentered(const std::string& caption) {
    return WizardFrame::CreateCentered(caption, WizardMetrics::WindowRect);
}

const CustomButton* InstallerWindow::ButtonForId(int identifier) const {
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

void InstallerWindow::OnCreate() {
    MakeBottomButton(continueButton, "Continue", kContinueCommand, 495, 575, kDisabledButtonStyle);
    MakeBottomButton(backButton, "Back", kBackCommand, 405, 485, kDisabledButtonStyle);
    MakeBottomButton(cancelButton, "Cancel", kCancelCommand, 195, 275, kButtonStyle);
    SetFontOfControls();
}

void InstallerWindow::ShowFinalButtons() {
    for (const CustomButton* button : {&continueButton, &backButton, &cancelButton}) {
        ::ShowWindow(button->handle, SW_HIDE);
    }
    MakeBottomButton(whatsNewButton, "What's New...", kWhatsNewCommand, 145, 275, kButtonStyle);
    MakeBottomButton(resourcesButton, "Resources...", kResourcesCommand, 280, 410, kButtonStyle);
    MakeBottomButton(closeButton, "Close", kCloseCommand, 645, 775, kButtonStyle);
    SetFontOfControls();
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

void InstallerWindow::OnPaint(HDC device) const {
    DrawBitmap(device, banner_, 0, 0);
    RECT line = GetClientRect();
    line.left += WizardMetrics::PageRect.left;
    line.bottom = line.top + WizardMetrics::TitleHeight - 4;
    DrawPageText(device, title_, line, WizardMetrics::Instance().TitleFont, kTitleFormat);
}

void InstallerWindow::OnPress(int identifier) {
    if (ButtonForId(identifier) != nullptr) {
        controller_.Perform(identifier);
    }
}

bool InstallerWindow::OnOther(UINT message, WPARAM wParam) {
    switch (message) {
        case WM_DESTROY:
            // The close box in the title bar leads here. It does not raise the engine's cancel, even during an install,
            // as the Cancel button does; the difference is intended.
            ::PostQuitMessage(0);
            return true;
        case WM_TIMER:
            OnTimer(wParam);
            return true;
        default:
            return WizardFrame::OnOther(message, wParam);
    }
}

void InstallerWindow::OnTimer(WPARAM timer) {
    if (timer == kProgressTimer) {
        controller_.OnProgressTimer();
    } else if (timer == kGrowTimer) {
        GrowStep();
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
