#pragma once

#include <memory>
#include <string>

#include "installer/windows/CustomButton.h"
#include "installer/windows/WizardWindow.h"

namespace HV {

class InstallerModel;
class WinWizardController;

/// The wizard's one main window: a dark frame of fixed size with a banner, a title line, a strip of buttons along the
/// bottom, and room for a page.
///
/// It decides nothing. Its buttons go to the controller and so does the timer that polls the job; by itself it paints,
/// and widens when the install has finished. Belongs to the main thread and lives until the process ends.
class InstallerWindow : public WizardFrame<InstallerWindow> {
public:
    /// `controller` is not owned. The title line is one of the model's texts.
    InstallerWindow(WinWizardController& controller, const InstallerModel& model);

    /// Makes the window, hidden and centred on its monitor, with the caption of its frame. Returns whether it is there.
    [[nodiscard]] bool CreateCentered(const std::string& caption);

    ~InstallerWindow() override;

    /// Hides the three buttons of the bottom strip, for good, and makes those of the finished wizard. The Close button
    /// lies outside the window until that has widened.
    void ShowFinalButtons();

    /// The button with this identifier, or null.
    [[nodiscard]] const CustomButton* ButtonForId(int identifier) const;

    CustomButton continueButton;
    CustomButton backButton;
    CustomButton cancelButton;
    CustomButton closeButton;
    CustomButton whatsNewButton;
    CustomButton resourcesButton;

private:
    friend WizardWindow;

    void OnCreate();
    void MakeBottomButton(CustomButton& button, const std::string& text, int identifier, int left, int right,
                          DWORD style);
    void OnErase(HDC device) const;
    void OnPaint(HDC device) const;
    void OnPress(int identifier);
    [[nodiscard]] bool OnOther(UINT message, WPARAM wParam);
    void OnTimer(WPARAM timer);
    void GrowStep();

    HBITMAP banner_ = nullptr;
    WinWizardController& controller_;
    std::unique_ptr<WindowCustomButtonOwner> buttonOwner_;
    std::string title_;
};

}  // namespace HV
