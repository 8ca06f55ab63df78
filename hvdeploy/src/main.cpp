#include "hvdeploy/src/StandAlone.h"
#include "platform/arguments.h"

int main(int argc, char** argv) {
    return HV::RunStandAlone(platform::ProgramArguments(argc, argv));
}
