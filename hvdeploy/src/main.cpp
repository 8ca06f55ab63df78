#include <string>
#include <vector>

#include "hvdeploy/src/StandAlone.h"

int main(int argc, char** argv) {
    return HV::RunStandAlone(std::vector<std::string>(argv + (argc > 0 ? 1 : 0), argv + argc));
}
