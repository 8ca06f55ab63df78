// Registry text, read, merged into a registry, written in canonical form and read again.
#include "platform/hosted/registry.h"

#include <cstdio>

#include "fuzz/Fuzzing.h"
#include "platform/hosted/machine.h"

namespace {

/// The canonical form of a registry in which there is this text and nothing else.
std::string Canonical(const std::string& text) {
    hosted::Machine& machine = hosted::Machine::Current();
    const std::string file = machine.HostPath(R"(C:\fuzz.reg)");
    static_cast<void>(std::remove(file.c_str()));
    hosted::Registry registry(file, machine.GetFaults());
    registry.LoadText(text, "the input");
    return registry.Text();
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzzing::UseThrowAwayMachine();
    const std::string text = fuzzing::Text(data, size);
    try {
        static_cast<void>(hosted::ParseRegistryText(text));
    } catch (const hosted::RegistryTextError&) {
        return 0;
    }
    const std::string canonical = Canonical(text);
    fuzzing::Demand(Canonical(canonical) == canonical, "what a registry writes, it reads back");
    return 0;
}
