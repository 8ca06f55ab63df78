#include "platform/program.h"

#include <filesystem>

#include "platform/hosted/ignoring_case.h"
#include "platform/hosted/machine.h"
#include "platform/hosted/program.h"
#include "platform/utf8.h"

namespace hosted {
namespace {

// Set before any constructor runs, so resources of other sources can enter themselves.
constinit const CompiledResource* first = nullptr;

}  // namespace

CompiledResource::CompiledResource(std::uint16_t itsNumber, const char* itsType, const char* begin, const char* end)
    : number(itsNumber), type(itsType), bytes(begin, end), next(first) {
    first = this;
}

// The host marks the name of a file that has been deleted; a file may also be named so.
std::string ProgramOfProcess(const std::string& process) {
    constexpr std::string_view mark = " (deleted)";
    const std::filesystem::path link = "/proc/" + process + "/exe";
    std::error_code error;
    std::string name = std::filesystem::read_symlink(link, error).string();
    if (name.ends_with(mark) && !std::filesystem::equivalent(name, link, error)) {
        name.resize(name.size() - mark.size());
    }
    return platform::Utf8FromWide(Machine::Current().WindowsPath(name));
}

}  // namespace hosted

namespace platform {

std::string ProgramPath() {
    constexpr std::size_t longest = 260;
    return hosted::ProgramOfProcess("self").substr(0, longest);
}

std::string CompiledResource(std::uint16_t number, const char* type) {
    const hosted::CompiledResource* resource = hosted::first;
    while (resource != nullptr && (resource->number != number || !hosted::EqualsIgnoringCase(resource->type, type))) {
        resource = resource->next;
    }
    return resource != nullptr ? std::string(resource->bytes) : std::string();
}

}  // namespace platform
