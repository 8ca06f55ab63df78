#include <iostream>

#include "platform/arguments.h"
#include "tools/hvpack/Commands.h"

int main(int argc, char** argv) {
    return HVPack::RunCommand(platform::ProgramArguments(argc, argv), std::cout, std::cerr);
}
