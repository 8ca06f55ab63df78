#pragma once

#include "installer/windows/WizardWindow.h"

namespace HV {

class WinWizardController;

/// The last page: a picture. The buttons under it are the main window's.
class FinalPage : public WizardWindow<FinalPage> {
public:
    /// `controller` is not owned.
    explicit FinalPage(WinWizardController& controller);

    ~FinalPage() override;

private:
    friend WizardWindow;

    void OnCreate();
    void OnPaint(HDC device) const;

    HBITMAP picture_ = nullptr;
    [[maybe_unused]] WinWizardController& controller_;  // a page without buttons has nothing to ask it
};

}  // namespace HV
