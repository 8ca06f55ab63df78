#include <iostream>

#include "tools/hvpack/Commands.h"

int main(int argc, char** argv) {
    return HVPack::RunCommand(std::vector<std::string>(argv + 1, argv + argc), std::cout, std::cerr);
}
