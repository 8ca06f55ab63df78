#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

/// What the fuzzers share. Each source beside this one is a fuzzer for one reader of strangers' bytes: it reads the
/// bytes that it is given, lets pass what the reader promises to do with bad ones, and ends the program for everything
/// else.

/// The one entry that a fuzzer defines; it returns 0.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

namespace fuzzing {

/// The input as the readers take it.
inline std::string Text(const std::uint8_t* data, std::size_t size) {
    return size == 0 ? std::string() : std::string(reinterpret_cast<const char*>(data), size);
}

/// Ends the program, with the claim on standard error, when a reader does not keep what it promises.
void Demand(bool kept, const char* claim);

/// Makes a machine current that serves all runs of this program and is removed when it ends well: a folder below
/// TMPDIR, or below `/tmp`. Calls after the first do nothing.
void UseThrowAwayMachine();

/// Replaces the file of the machine; its folder has to be there.
void WriteFile(const std::string& windowsPath, const std::string& bytes);

/// Removes the folder of the machine with all that is in it.
void RemoveFolder(const std::string& windowsPath);

/// How many items the folder of the machine holds; 0 where there is none.
[[nodiscard]] std::size_t CountItems(const std::string& windowsPath);

}  // namespace fuzzing
