#include "installer/windows/InstallingPage.h"

#include <algorithm>
#include <utility>

#include "installer/InstallerModel.h"
#include "installer/WizardArithmetic.h"
#include "installer/windows/WizardMetrics.h"

namespace HV {

InstallingPage::InstallingPage(WinWizardController& controller, const InstallerModel& model, std::string status,
                               std::int32_t percent)
    : percent_(percent), status_(std::move(status)), controller_(controller), model_(model) {}

void InstallingPage::OnCreate() {
    title_ = model_.GetString("installer.wait.message");
    const RECT client = GetClientRect();
    titleRect_ = {client.left + 1, client.top + 46, client.right - 20, client.top + 68};
    barRect_ = {client.left, titleRect_.bottom + 8, client.right - 20,
                titleRect_.bottom + 8 + WizardMetrics::ProgressHeight};
    statusRect_ = {client.left + 1, barRect_.bottom + 6, client.right - 40, barRect_.bottom + 25};
}

void InstallingPage::SetPercent(std::int32_t percent) {
    percent_ = percent;
    ::InvalidateRect(m_hWnd, &barRect_, TRUE);
}

void InstallingPage::SetStatusText(const std::string& text) {
    status_ = text;
    ::InvalidateRect(m_hWnd, &statusRect_, TRUE);
}

void InstallingPage::OnErase(HDC device) const {
    FillClient(m_hWnd, device, WizardMetrics::Instance().PageBrush);
}

void InstallingPage::OnPaint(HDC device) {
    const WizardMetrics& metrics = WizardMetrics::Instance();
    DrawPageText(device, title_, titleRect_, metrics.WaitFont, DT_SINGLELINE);
    DrawPageText(device, status_, statusRect_, metrics.BodyFont, DT_SINGLELINE);
    PaintBar(device);
}

void InstallingPage::PaintBar(HDC device) {
    const WizardMetrics& metrics = WizardMetrics::Instance();
    ::FillRect(device, &barRect_, metrics.TrackBrush);
    if (percent_ <= 0) {
        return;
    }
    percent_ = std::min(percent_, 100);
    RECT filled = barRect_;
    filled.right = filled.left + FillWidth(percent_, barRect_.right - barRect_.left);
    ::FillRect(device, &filled, metrics.FillBrush);
}

}  // namespace HV
