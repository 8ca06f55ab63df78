// A package from anywhere, byte by byte.
#include "fuzz/Fuzzing.h"
#include "fuzz/PackageRun.h"

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzzing::UsePackage(fuzzing::Text(data, size));
    return 0;
}
