// The wizard's program, as far as its tests are concerned: it lies on the test's machine.
#include "installer/StartUp.h"

std::string HV::ProgramPath() {
    return R"(C:\Setup\hvinstaller.exe)";
}
