#include "platform/program.h"

#include "installer/StartUp.h"

namespace HV {

std::string ProgramPath() {
    return platform::ProgramPath();
}

}  // namespace HV
