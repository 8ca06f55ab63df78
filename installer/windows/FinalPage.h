#pragma once

#include "platform/windows/atl.h"

namespace HV {

class WinWizardController;

/// The last page: a picture. The buttons under it are the main window's.
class FinalPage : public ATL::CWindowImpl<FinalPage> {
public:
    /// `controller` is not owned.
    explicit FinalPage(WinWizardController& controller);

    BOOL ProcessWindowMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) override;
    ~FinalPage() override;

    static ATL::CWndClassInfo& GetWndClassInfo();

private:
    HBITMAP picture_ = nullptr;
    [[maybe_unused]] WinWizardController& controller_;  // a page without buttons has nothing to ask it
};

}  // namespace HV
