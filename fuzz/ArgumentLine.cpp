// The line of arguments: split and read, and nothing is run. Logging stays out of it, for the line names its file.
#include "hvdeploy/src/ArgumentLine.h"

#include "fuzz/Fuzzing.h"
#include "hvdeploy/src/HVDeployCLI.h"

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzzing::UseThrowAwayMachine();
    std::vector<std::string> arguments;
    const HV::LineSplit split = HV::SplitArgumentLine(fuzzing::Text(data, size), arguments);
    fuzzing::Demand(split != HV::LineSplit::Done || !arguments.empty(), "a line that is not blank has arguments");
    std::vector<const char*> words{"hvdeploy"};
    for (const std::string& argument : arguments) {
        words.push_back(argument.c_str());
    }
    HV::DeployCLI line(nullptr);
    static_cast<void>(line.ParseArgs(static_cast<int>(words.size()), words.data()));
    static_cast<void>(HV::ErrorCodeFromText(fuzzing::Text(data, size)));
    return 0;
}
