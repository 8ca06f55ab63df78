#pragma once

#include <cstdint>
#include <string>

#include "installer/windows/WizardWindow.h"

namespace HV {

class InstallerModel;
class WinWizardController;

/// The page of a running install: a title, a bar and a line of status.
class InstallingPage : public WizardWindow<InstallingPage> {
public:
    /// Neither is owned. The model has the title.
    InstallingPage(WinWizardController& controller, const InstallerModel& model, std::string status,
                   std::int32_t percent);

    ~InstallingPage() override = default;

    /// Each setting has the part of the page painted that shows it, and no other. A percent of -1 is an empty bar.
    void SetPercent(std::int32_t percent);
    void SetStatusText(const std::string& text);

    [[nodiscard]] std::int32_t Percent() const { return percent_; }
    [[nodiscard]] const std::string& StatusText() const { return status_; }

private:
    friend WizardWindow;

    void OnCreate();
    void OnErase(HDC device) const;
    void OnPaint(HDC device);
    void PaintBar(HDC device);

    RECT titleRect_{};
    RECT statusRect_{};
    RECT barRect_{};
    std::int32_t percent_;
    std::string title_;
    std::string status_;
    [[maybe_unused]] WinWizardController& controller_;  // a page without buttons has nothing to ask it
    const InstallerModel& model_;
};

}  // namespace HV
