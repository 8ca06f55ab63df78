#include "installer/windows/FocusMemory.h"

namespace HV {

bool FocusMemory::OnActivate(HWND window, WPARAM activation) {
    if (LOWORD(activation) == WA_INACTIVE) {
        RememberFocusOf(window);
        return false;
    }
    return GiveBack(window);
}

// A window that a box has disabled may have lost the focus before it hears of it. Then the last that is known holds.
void FocusMemory::RememberFocusOf(HWND window) {
    const HWND focus = ::GetFocus();
    if (focus != nullptr) {
        control_ = ::IsChild(window, focus) != FALSE ? focus : nullptr;
    }
}

// A control that has been hidden or disabled meanwhile would swallow the keys.
bool FocusMemory::GiveBack(HWND window) const {
    if (control_ == nullptr || ::IsChild(window, control_) == FALSE || ::IsWindowVisible(control_) == FALSE ||
        ::IsWindowEnabled(control_) == FALSE) {
        return false;
    }
    ::SetFocus(control_);
    return true;
}

}  // namespace HV
