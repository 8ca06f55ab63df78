#include "fuzz/Fuzzing.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>

#include "platform/hosted/machine.h"

namespace fuzzing {
namespace {

/// The folder of the machine while the program lives.
class MachineFolder {
public:
    MachineFolder() {
        const char* parent = std::getenv("TMPDIR");
        name_ = std::string(parent != nullptr ? parent : "/tmp") + "/hv-fuzz-XXXXXX";
        Demand(mkdtemp(name_.data()) != nullptr, "a folder for the machine can be made");
        hosted::Machine::Use(name_);
    }
    ~MachineFolder() {
        hosted::Machine::Abandon();
        std::error_code ignored;
        std::filesystem::remove_all(name_, ignored);
    }
    MachineFolder(const MachineFolder&) = delete;
    MachineFolder& operator=(const MachineFolder&) = delete;

private:
    std::string name_;
};

std::filesystem::path HostPath(const std::string& windowsPath) {
    return hosted::Machine::Current().HostPath(windowsPath);
}

}  // namespace

void Demand(bool kept, const char* claim) {
    if (!kept) {
        std::fprintf(stderr, "not kept: %s\n", claim);
        std::abort();
    }
}

void UseThrowAwayMachine() {
    static const MachineFolder folder;
}

void WriteFile(const std::string& windowsPath, const std::string& bytes) {
    std::ofstream file(HostPath(windowsPath), std::ios::binary | std::ios::trunc);
    file.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    file.close();
    Demand(file.good(), "the machine's files can be written");
}

void RemoveFolder(const std::string& windowsPath) {
    std::filesystem::remove_all(HostPath(windowsPath));
}

std::size_t CountItems(const std::string& windowsPath) {
    std::error_code missing;
    const std::filesystem::directory_iterator items(HostPath(windowsPath), missing);
    return missing ? 0 : static_cast<std::size_t>(std::distance(begin(items), end(items)));
}

}  // namespace fuzzing
