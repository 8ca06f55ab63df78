#pragma once

#include "platform/windows/window.h"

namespace HV {

/// Which control of a window had the focus, so that it has it again when the user comes back to the window: from a box,
/// from another window of the wizard, from another program. By itself the system gives the focus to the window's frame,
/// where no key does anything.
class FocusMemory {
public:
    /// The control that gets the focus when its window is active next.
    void Remember(HWND control) { control_ = control; }

    /// What WM_ACTIVATE of `window` says. Returns whether a control has the focus now, so that the system must not give
    /// it away.
    [[nodiscard]] bool OnActivate(HWND window, WPARAM activation);

private:
    void RememberFocusOf(HWND window);
    [[nodiscard]] bool GiveBack(HWND window) const;

    HWND control_ = nullptr;  // null when it was the frame
};

}  // namespace HV
