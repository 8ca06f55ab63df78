// Where Windows looks for the libraries of a program: in the system's folder, and nowhere else. Part of every program
// by itself, not by way of a room's archive, since nobody calls it.
//
// A program that is started from a folder of downloads would otherwise run whatever lies there under the name of a
// system library, with its own rights. Two things stand against that. The record below speaks to the loader, before the
// first instruction of the program: what is imported comes from the system's folder (from Windows 10 version 1607 on).
// The call speaks for everything that is loaded later, delayed imports included.
#include <cstddef>
#include <cstdint>

#include "platform/windows/win32.h"

namespace {

// The loader's own layout (IMAGE_LOAD_CONFIG_DIRECTORY64) up to its guard flags; everything else in it is nothing.
struct LoadConfiguration {
    std::uint32_t size;
    std::uint8_t unused[0x4A];
    std::uint16_t dependentLoadFlags;
    std::uint8_t alsoUnused[0x44];
};
static_assert(offsetof(LoadConfiguration, dependentLoadFlags) == 0x4E && sizeof(LoadConfiguration) == 0x94);

// The linker leaves the directory of the program without an entry for this section; finish_program enters it.
[[gnu::section(".loadcfg"), gnu::used]] const LoadConfiguration kLoadConfiguration{
    sizeof(LoadConfiguration), {}, LOAD_LIBRARY_SEARCH_SYSTEM32, {}};

int SearchSystemFolderAlone() {
    ::SetDefaultDllDirectories(LOAD_LIBRARY_SEARCH_SYSTEM32);
    // For the few loads that ask for the old search order: at least not in the current folder.
    ::SetDllDirectoryW(L"");
    return 0;
}

// The runtime's initialisers in C come before those in C++, and so before every constructor of the program.
[[gnu::section(".CRT$XIB"), gnu::used]] int (*const kFirstAct)() = &SearchSystemFolderAlone;

}  // namespace
