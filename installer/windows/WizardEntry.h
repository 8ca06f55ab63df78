#pragma once

#include "platform/windows/window.h"

namespace HV {

/// The wizard from its start to its end: prepares the process and logging, insists on the packages folder beside the
/// program, shows the window (`showCommand` as the program was started with) and serves it. Gives the value that the
/// message loop ended with. Where the run cannot go on, the process ends in here. An error that nothing catches is
/// logged and passed on.
[[nodiscard]] int RunWizard(HINSTANCE instance, int showCommand);

}  // namespace HV
