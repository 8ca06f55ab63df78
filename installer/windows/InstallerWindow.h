#pragma once

#include <memory>
#include <string>

#include "installer/windows/CustomButton.h"
#include "installer/windows/FocusMemory.h"
#include "platform/windows/atl.h"

namespace HV {

class InstallerModel;
class WinWizardController;

/// The wizard's one main window: a dark frame of fixed size with a banner, a title line, a strip of buttons along the
/// bottom, and room for a page.
///
/// It decides nothing. Its buttons go to the controller and so does the timer that polls the job; by itself it paints,
/// and widens when the install has finished. Belongs to the main thread and lives until the process ends.
class InstallerWindow : public ATL::CWindowImpl<InstallerWindow> {
public:
    /// `controller` is not owned. The title line is one of the model's texts.
    InstallerWindow(WinWizardController& controller, const InstallerModel& model);

    /// Makes the window, hidden and centred on its monitor, with the caption of its frame. Returns whether it is there.
    [[nodiscard]] bool CreateCentered(const std::string& caption);

    BOOL ProcessWindowMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) override;
    ~InstallerWindow() override;

    static ATL::CWndClassInfo& GetWndClassInfo();

    /// Hides the three buttons of the bottom strip, for good, and makes those of the finished wizard. The Close button
    /// lies outside the window until that has widened.
    void ShowFinalButtons();

    /// The button with this identifier, or null.
    [[nodiscard]] CustomButton* ButtonForId(int identifier);

    CustomButton continueButton;
    CustomButton backButton;
    CustomButton cancelButton;
    CustomButton closeButton;
    CustomButton whatsNewButton;
    CustomButton resourcesButton;

private:
    void CreateButtons();
    void MakeBottomButton(CustomButton& button, const std::string& text, int identifier, int left, int right,
                          DWORD style);
    void OnErase(HDC device) const;
    void OnPaint() const;
    [[nodiscard]] bool OnDrawItem(const DRAWITEMSTRUCT& item);
    void OnTimer(WPARAM timer);
    void OnCommand(WPARAM command);
    void GrowStep();

    HBITMAP banner_ = nullptr;
    WinWizardController& controller_;
    std::unique_ptr<WindowCustomButtonOwner> buttonOwner_;
    std::string title_;
    FocusMemory focus_;
};

}  // namespace HV
