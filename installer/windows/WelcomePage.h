#pragma once

#include <string>

#include "installer/windows/CustomButton.h"
#include "installer/windows/WizardWindow.h"

namespace HV {

class InstallerModel;
class WinWizardController;

/// The first page: what will be installed, and the decision about the licence agreement. Its buttons go to the
/// controller.
class WelcomePage : public WizardWindow<WelcomePage>, public CustomButtonOwner {
public:
    /// Neither is owned. The model has the texts.
    WelcomePage(WinWizardController& controller, const InstallerModel& model);

    ~WelcomePage() override = default;

    /// The page's own colour: corners of buttons blend into it.
    Gdiplus::Brush* BackgroundBrush() override { return &brush_; }

    std::string paragraph;
    std::string requirementsHeading;
    std::string requirements;
    std::string agreementNotice;
    std::string agreementChoice;
    CustomButton readLicenseButton;
    CustomButton disagreeButton;
    CustomButton agreeButton;

private:
    friend WizardWindow;

    void OnCreate();
    void LoadTexts();
    void MakeButtons();
    void OnErase(HDC device) const;
    void OnPaint(HDC device) const;
    [[nodiscard]] const CustomButton* ButtonForId(int identifier) const;
    void OnPress(int identifier);

    Gdiplus::SolidBrush brush_;
    WinWizardController& controller_;
    const InstallerModel& model_;
};

}  // namespace HV
