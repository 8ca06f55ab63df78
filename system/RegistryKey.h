#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "platform/win32.h"

namespace HV {

/// The machine's list of installed programs, below HKEY_LOCAL_MACHINE: a key for each.
inline constexpr const char* kInstalledProgramsPath = "SOFTWARE\\Microsoft\\Windows\\CurrentVersion\\Uninstall";

/// An owned registry key, with opening by path and reading of values as text.
///
/// Everything goes through the ANSI forms of the registry interface and sees the program's native view. Nothing raises
/// or prints: an empty `key` or a return value tells of a failure. Values are written by the callers, through `key`.
///
/// A key opened directly below a hive is not closed by the destructor but stays open until the process ends; who minds
/// calls Close().
class Win32RegKeyHandle {
public:
    /// An empty handle, to be filled by OpenPath or OpenUninstallKey.
    Win32RegKeyHandle() = default;

    /// Opens `subkey` below `parentKey` for reading; with `create`, makes it if needed, with its missing parents, and
    /// opens it with all access. A hive with an empty `subkey` is taken as it is. On failure `key` is empty.
    Win32RegKeyHandle(HKEY parentKey, const std::string& subkey, bool create);

    /// Closes the key unless it or its parent is a hive.
    virtual ~Win32RegKeyHandle();

    Win32RegKeyHandle(const Win32RegKeyHandle&) = delete;
    Win32RegKeyHandle& operator=(const Win32RegKeyHandle&) = delete;
    Win32RegKeyHandle(Win32RegKeyHandle&& other) noexcept;
    /// Lets go of the key held so far as the destructor does, and takes over that of `other`.
    Win32RegKeyHandle& operator=(Win32RegKeyHandle&& other) noexcept;

    /// Closes the key, also one directly below a hive, and empties `key`. A hive itself is only let go.
    void Close();

    /// The names of the direct subkeys, in the system's order. `names` is cleared first. The first name that is
    /// refused, as one of more than 255 bytes is, ends the list.
    void GetSubkeyNames(std::vector<std::string>& names) const;

    /// Reads the value `name` of the key's `subkey` (empty: of the key itself) as text: strings up to their first null,
    /// the strings of a list joined by ";", bytes as lower-case hexadecimal digits, a 32-bit number in decimal, any
    /// other type as an empty text. Returns the registry type, or -1 and an empty text when the value cannot be read or
    /// takes more than 65,535 bytes.
    [[nodiscard]] std::int32_t ReadValue(const std::string& subkey, const std::string& name, std::string& text) const;

    /// The hive of that name ("HKEY_LOCAL_MACHINE"), in exactly this case; empty for any other text.
    [[nodiscard]] static HKEY HiveFromName(const std::string& name);

    /// Opens or creates each level of the `\`-separated `path` below `root` in turn, and leaves the last key in
    /// `output`, with the handle that it was opened through as `output.parent`. That handle is closed by then, unless
    /// it is `root`: it only tells the destructor what to do. `root` is not the key that `output` holds on entry. An
    /// empty path puts `root` itself into `output`, and with it the duty to close it. Returns false, with `output`
    /// empty, as soon as a level fails; levels that were created before it stay.
    [[nodiscard]] static bool OpenPath(HKEY root, const std::string& path, Win32RegKeyHandle& output, bool create);

    /// Takes `Computer\HKEY_CURRENT_USER\Software\x` apart into its hive and the path below it; the leading
    /// "Computer\" may be missing. Returns false, with the outputs as they were, when there is no `\` after the hive's
    /// name or the name is unknown.
    [[nodiscard]] static bool ParseRegistryPath(const std::string& text, HKEY& hive, std::string& path);

    /// Opens or creates `entryName` in the machine's list of installed programs, with all access. Returns false, with
    /// `output` empty, on failure.
    [[nodiscard]] static bool OpenUninstallKey(const std::string& entryName, Win32RegKeyHandle& output);

    /// The handle; empty when nothing is open.
    HKEY key = nullptr;
    /// The handle through which `key` was opened.
    HKEY parent = nullptr;
    /// Whether opening `key` made it.
    bool created = false;
};

}  // namespace HV
