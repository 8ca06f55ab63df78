#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace hosted {

/// The Windows path of the program that a process runs, the one under which it was started also when the file has gone
/// since; empty when it may not be known. The process is named as /proc has it: by its number, or "self".
[[nodiscard]] std::string ProgramOfProcess(const std::string& process);

/// A resource that is compiled into this program: a static object enters it into the program's list, and lives as long
/// as the program. The type and the bytes are not copied.
struct CompiledResource {
    CompiledResource(std::uint16_t itsNumber, const char* itsType, const char* begin, const char* end);
    CompiledResource(const CompiledResource&) = delete;
    CompiledResource& operator=(const CompiledResource&) = delete;

    const std::uint16_t number;
    const std::string_view type;
    const std::string_view bytes;
    const CompiledResource* const next;
};

}  // namespace hosted
