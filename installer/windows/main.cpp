#include "installer/windows/WindowsToolkit.h"
#include "installer/windows/WizardEntry.h"

int WINAPI WinMain(HINSTANCE instance, HINSTANCE /*previous*/, LPSTR /*line*/, int showCommand) {
    HV::EndProcess(static_cast<unsigned>(HV::RunWizard(instance, showCommand)));
}
