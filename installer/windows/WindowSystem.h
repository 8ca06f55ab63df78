#pragma once

#include "platform/windows/window.h"

namespace HV {

/// What the wizard's windows need of the process: COM, the common controls, the rich text control, GDI+. To be made
/// before the first window, by its thread.
class WindowSystem {
public:
    WindowSystem();
    ~WindowSystem();

    WindowSystem(const WindowSystem&) = delete;
    WindowSystem& operator=(const WindowSystem&) = delete;

private:
    ULONG_PTR gdiplus_ = 0;
};

}  // namespace HV
