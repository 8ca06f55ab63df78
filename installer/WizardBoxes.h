#pragma once

/// The numbers by which the platform knows boxes and their buttons. A beep and its box often share one.
namespace HV {

enum WizardBoxType : unsigned {
    kPlainBox = 0,
    kStopBox = 16,
    kWarningBox = 48,
    kRetryBox = 0x2035,  // warning icon, Retry and Cancel, in front of every window of the program
};

enum WizardBoxButton : int { kCancelButton = 2, kRetryButton = 4 };

/// Commands of WizardToolkit::ShowWindow.
enum WizardShowCommand : int { kHide = 0, kShow = 5 };

}  // namespace HV
