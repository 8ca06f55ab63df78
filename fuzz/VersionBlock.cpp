// An executable of somebody else, asked for its version.
#include "fuzz/Fuzzing.h"
#include "hvframework/FileVersion.h"

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzzing::UseThrowAwayMachine();
    fuzzing::WriteFile(R"(C:\program.exe)", fuzzing::Text(data, size));
    HVL::Version version;
    const bool found = HVL::GetFileVersion(R"(C:\program.exe)", version);
    fuzzing::Demand(found != version.text.empty(), "there is a text exactly when there is a version");
    return 0;
}
