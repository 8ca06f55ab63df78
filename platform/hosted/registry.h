#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "platform/hosted/host_file.h"
#include "platform/hosted/ignoring_case.h"
#include "platform/hosted/registry_text.h"

namespace hosted {

class Faults;

struct RegistryValue {
    std::uint32_t type = 0;
    std::string data;
};

/// The machine's registry, kept in a file of REGEDIT4 text.
///
/// Key and value names are kept as they were written and compared without regard to case. A change is appended to the
/// file at once, as a section of its own, so that the file is good registry text at any moment and a change costs the
/// same whatever the registry's size; Flush() writes it anew in sorted order. Text that cannot be read ends the
/// process with exit status 1 and a message that names file and line.
///
/// HKEY_CLASSES_ROOT is `HKEY_LOCAL_MACHINE\Software\Classes` and HKEY_CURRENT_CONFIG the current hardware profile, as
/// on Windows; HKEY_CURRENT_USER is kept apart from HKEY_USERS. There is one view, the 64-bit one, and everybody may
/// write everywhere. The keys of a fresh machine are always there and stand in the text only with values of their own.
/// Thread-safe. Results are the error numbers of Windows.
class Registry {
public:
    /// Handles are numbers; those of the hives are Windows' own.
    using Handle = std::uintptr_t;

    /// Reads `file`, or makes it if there is none. `faults` is asked before every change and outlives the registry.
    Registry(std::string file, Faults& faults);
    ~Registry();
    Registry(const Registry&) = delete;
    Registry& operator=(const Registry&) = delete;

    std::int32_t CreateKey(Handle parent, std::string_view subKey, std::uint32_t access, Handle& result, bool& created);
    std::int32_t OpenKey(Handle parent, std::string_view subKey, std::uint32_t access, Handle& result);
    std::int32_t CloseKey(Handle handle);
    std::int32_t SubKeyName(Handle handle, std::size_t index, std::string& name);
    std::int32_t GetValue(Handle handle, std::string_view name, RegistryValue& value);
    std::int32_t SetValue(Handle handle, std::string_view name, RegistryValue value);
    std::int32_t DeleteTree(Handle handle, std::string_view subKey);

    /// Merges a file of registry text, or the text itself, into the registry.
    void LoadFile(const std::string& file);
    void LoadText(std::string_view text, const std::string& nameForErrors);
    /// Forgets everything and reads the file again, after another process may have changed it.
    void Reload();
    /// Everything in canonical form: keys and values sorted without regard to case.
    [[nodiscard]] std::string Text() const;
    /// Writes the file in canonical form if something changed since it was read. A file that cannot be written is left
    /// as it was, with a message on standard error.
    void Flush();

private:
    struct Key;
    using KeyPointer = std::shared_ptr<Key>;
    struct OpenedKey;

    KeyPointer Find(const KeyPointer& from, std::string_view path) const;
    KeyPointer Make(const KeyPointer& from, std::string_view path);
    KeyPointer KeyOfFullPath(std::string_view fullPath, bool make);
    std::int32_t Resolve(Handle handle, std::uint32_t access, KeyPointer& key);
    Handle AddHandle(KeyPointer key, std::uint32_t access);
    std::int32_t Prepare(const std::string& section);
    void Apply(const std::vector<RegistryChange>& changes);
    void MakeBaseKeys();
    void ReadFile();
    bool Append(const std::string& section);
    std::string TextLocked() const;

    std::string file_;
    Faults& faults_;
    mutable std::mutex mutex_;
    KeyPointer root_;
    std::unordered_map<Handle, OpenedKey> handles_;
    Handle nextHandle_ = 4;
    Descriptor appendTo_;
    bool changed_ = false;
};

}  // namespace hosted
