#pragma once

#include <string>

#include "installer/windows/CustomButton.h"
#include "installer/windows/WizardWindow.h"

namespace HV {

class EULAWindowController;

/// The identifiers of the viewer's buttons.
enum ViewerControl : int {
    kCloseViewerControl = 161,
    kSaveLicenseControl = 1184,
};

/// A viewer of the licence agreement: a window of its own, beside the wizard and independent of it.
///
/// Made with new; it deletes itself when the user has closed it.
class EULAWindow : public WizardFrame<EULAWindow> {
public:
    /// `controller` is not owned and must outlive the window. Its text is the one that this program carries.
    explicit EULAWindow(EULAWindowController& controller);

    /// Makes the window, hidden and centred on its monitor, no larger than that has room for. Returns whether it is
    /// there.
    [[nodiscard]] bool CreateCentered();

    ~EULAWindow() override = default;
    void OnFinalMessage(HWND window) override;

private:
    friend WizardWindow;

    void OnCreate();
    void InsetText() const;
    void ShowText() const;
    void OnErase(HDC device) const;
    [[nodiscard]] const CustomButton* ButtonForId(int identifier) const;
    void OnPress(int identifier);

    // Fixed (contracts, wizard): without an owner, so the corners of these buttons are black.
    CustomButton closeButton_;
    CustomButton saveButton_;
    HWND richText_ = nullptr;
    EULAWindowController& controller_;
    std::string agreementText_;  // as the program carries it
};

/// The agreement that this program carries, as raw rich text; a line that says so when it cannot be had.
[[nodiscard]] std::string LoadAgreementText();

}  // namespace HV
