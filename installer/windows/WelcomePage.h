#pragma once

#include <string>

#include "installer/windows/CustomButton.h"
#include "platform/windows/atl.h"

namespace HV {

class InstallerModel;
class WinWizardController;

/// The first page: what will be installed, and the decision about the licence agreement. Its buttons go to the
/// controller.
class WelcomePage : public ATL::CWindowImpl<WelcomePage>, public CustomButtonOwner {
public:
    /// Neither is owned. The model has the texts.
    WelcomePage(WinWizardController& controller, const InstallerModel& model);

    BOOL ProcessWindowMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) override;
    ~WelcomePage() override = default;

    static ATL::CWndClassInfo& GetWndClassInfo();

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
    void OnCreate();
    void LoadTexts();
    void MakeButtons();
    void OnPaint() const;
    [[nodiscard]] const CustomButton* ButtonForId(int identifier) const;
    [[nodiscard]] bool OnDrawItem(const DRAWITEMSTRUCT& item) const;
    void OnCommand(WPARAM command);

    Gdiplus::SolidBrush brush_;
    WinWizardController& controller_;
    const InstallerModel& model_;
};

}  // namespace HV
