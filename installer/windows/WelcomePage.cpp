#include "installer/windows/WelcomePage.h"

#include "installer/InstallerModel.h"
#include "installer/WinWizardController.h"
#include "installer/windows/WizardMetrics.h"

namespace HV {

namespace {

constexpr int kBelowButtons = 12;
constexpr int kWidth = 70;  // of Agree and Disagree

}  // namespace

WelcomePage::WelcomePage(WinWizardController& controller, const InstallerModel& model)
    : brush_(Gdiplus::Color(OpaqueOf(WizardMetrics::PageColor))), controller_(controller), model_(model) {}

void WelcomePage::OnCreate() {
    LoadTexts();
    MakeButtons();
    SetFontOfControls();
}

void WelcomePage::LoadTexts() {
    paragraph = model_.GetString("installer.welcome.p-1");
    requirementsHeading = "System Requirements";
    requirements = model_.GetString("installer.welcome.sysreq");
    // A bare return breaks the line where these lines are drawn; the blank before it belongs to the text.
    agreementNotice = "To continue with the install you must agree \rto the terms of the software license agreement.";
    agreementChoice = "Click Agree to continue or Disagree to cancel \rand quit the installation.";
}

void WelcomePage::MakeButtons() {
    const RECT client = GetClientRect();
    const LONG bottom = client.bottom - kBelowButtons;
    const LONG top = bottom - WizardMetrics::ButtonHeight;
    const LONG agreeRight = client.right - 20;
    const RECT agree{agreeRight - kWidth, top, agreeRight, bottom};
    const LONG disagreeRight = agree.left - 10;
    const RECT disagree{disagreeRight - kWidth, top, disagreeRight, bottom};
    MakeButton(readLicenseButton, m_hWnd, "Read License...", kReadLicenseCommand,
               {client.left, top, client.left + 100, bottom});
    MakeButton(disagreeButton, m_hWnd, "Disagree", kDisagreeCommand, disagree);
    MakeButton(agreeButton, m_hWnd, "Agree", kAgreeCommand, agree);
    for (CustomButton* button : {&readLicenseButton, &disagreeButton, &agreeButton}) {
        button->owner = this;
    }
}

void WelcomePage::OnErase(HDC device) const {
    FillClient(m_hWnd, device, WizardMetrics::Instance().PageBrush);
}

void WelcomePage::OnPaint(HDC device) const {
    const WizardMetrics& metrics = WizardMetrics::Instance();
    const RECT client = GetClientRect();
    const auto draw = [&](const std::string& text, LONG top, LONG bottom, HFONT font) {
        DrawPageText(device, text, {client.left, top, client.right, bottom}, font, DT_WORDBREAK);
    };
    draw(paragraph, 20, 65, metrics.BodyFont);
    draw(requirementsHeading, 85, 100, metrics.StrongFont);
    draw(requirements, 100, 150, metrics.BodyFont);
    draw(agreementNotice, 170, 200, metrics.StrongFont);
    draw(agreementChoice, 215, 245, metrics.BodyFont);
}

const CustomButton* WelcomePage::ButtonForId(int identifier) const {
    switch (identifier) {
        case kReadLicenseCommand:
            return &readLicenseButton;
        case kAgreeCommand:
            return &agreeButton;
        case kDisagreeCommand:
            return &disagreeButton;
        default:
            return nullptr;
    }
}

void WelcomePage::OnPress(int identifier) {
    if (ButtonForId(identifier) != nullptr) {
        controller_.Perform(identifier);
    }
}

}  // namespace HV
