#include "platform/hosted/registry.h"

#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <sstream>

#include "platform/hosted/failure.h"
#include "platform/hosted/faults.h"
#include "platform/hosted/host_file.h"
#include "platform/hosted/win32.h"
#include "platform/utf8.h"

namespace hosted {
namespace {

constexpr std::string_view LocalMachine = "HKEY_LOCAL_MACHINE";
constexpr std::string_view CurrentUser = "HKEY_CURRENT_USER";
constexpr std::string_view Users = "HKEY_USERS";
/// In characters of UTF-16.
constexpr std::size_t LongestKeyName = 255;
constexpr std::size_t LongestValueName = 16383;

/// Two hives are views of keys elsewhere; they are kept, and written, only there.
struct Alias {
    std::string_view hive;
    std::string_view path;
};
constexpr std::array<Alias, 2> Aliases = {
    {{"HKEY_CLASSES_ROOT", R"(HKEY_LOCAL_MACHINE\SOFTWARE\Classes)"},
     {"HKEY_CURRENT_CONFIG", R"(HKEY_LOCAL_MACHINE\SYSTEM\CurrentControlSet\Hardware Profiles\Current)"}}};

constexpr std::array<std::string_view, 10> BaseKeys = {
    LocalMachine,
    CurrentUser,
    Users,
    R"(HKEY_LOCAL_MACHINE\SOFTWARE\Classes)",
    R"(HKEY_LOCAL_MACHINE\SOFTWARE\Microsoft\Windows\CurrentVersion\Uninstall)",
    R"(HKEY_LOCAL_MACHINE\SYSTEM\CurrentControlSet\Control\Session Manager\Environment)",
    R"(HKEY_LOCAL_MACHINE\SYSTEM\CurrentControlSet\Hardware Profiles\Current)",
    R"(HKEY_CURRENT_USER\Environment)",
    R"(HKEY_CURRENT_USER\Software\Classes)",
    R"(HKEY_CURRENT_USER\Software\Microsoft\Windows\CurrentVersion\Uninstall)"};

Registry::Handle ToHandle(HKEY key) {
    return reinterpret_cast<Registry::Handle>(key);
}

std::string_view HiveName(Registry::Handle handle) {
    if (handle == ToHandle(HKEY_LOCAL_MACHINE)) {
        return LocalMachine;
    }
    if (handle == ToHandle(HKEY_CURRENT_USER)) {
        return CurrentUser;
    }
    if (handle == ToHandle(HKEY_USERS)) {
        return Users;
    }
    if (handle == ToHandle(HKEY_CLASSES_ROOT)) {
        return Aliases[0].hive;
    }
    return handle == ToHandle(HKEY_CURRENT_CONFIG) ? Aliases[1].hive : std::string_view();
}

/// The first name of a path; `path` keeps what is behind it. Empty names between separators are passed over.
std::string_view TakeName(std::string_view& path) {
    path.remove_prefix(std::min(path.find_first_not_of('\\'), path.size()));
    const std::string_view name = path.substr(0, path.find('\\'));
    path.remove_prefix(name.size());
    return name;
}

/// True when the name has more characters of UTF-16. None has more than it has bytes, so most need not be looked at.
bool IsLongerThan(std::size_t most, std::string_view name) {
    if (name.size() <= most) {
        return false;
    }
    const std::wstring wide = platform::WideFromUtf8(name);
    const auto pairs = std::count_if(wide.begin(), wide.end(), [](wchar_t c) { return c > 0xFFFF; });
    return wide.size() + static_cast<std::size_t>(pairs) > most;
}

/// A name that the registry refuses, or that a line of registry text cannot hold.
bool IsBadName(std::string_view name) {
    return IsLongerThan(LongestKeyName, name) ||
           name.find_first_of(std::string_view("\r\n\0", 3)) != std::string_view::npos;
}

bool HasBadName(std::string_view path) {
    for (std::string_view name = TakeName(path); !name.empty(); name = TakeName(path)) {
        if (IsBadName(name)) {
            return true;
        }
    }
    return false;
}

}  // namespace

struct Registry::Key {
    std::string name;
    Key* parent = nullptr;
    bool base = false;
    bool deleted = false;
    std::map<std::string, KeyPointer, LessIgnoringCase> subKeys;
    std::map<std::string, RegistryValue, LessIgnoringCase> values;
    /// Counts the changes to `subKeys`, so that an enumeration knows whether it may go on from where it was.
    std::uint64_t generation = 0;

    [[nodiscard]] std::string Path() const {
        return parent == nullptr || parent->parent == nullptr ? name : parent->Path() + '\\' + name;
    }

    void MarkDeleted() {
        deleted = true;
        for (const auto& [subName, subKey] : subKeys) {
            subKey->MarkDeleted();
        }
    }

    void DeleteSubKey(const KeyPointer& subKey) {
        subKey->MarkDeleted();
        subKeys.erase(subKeys.find(subKey->name));
        ++generation;
    }

    void DeleteContents() {
        for (const auto& [subName, subKey] : subKeys) {
            subKey->MarkDeleted();
        }
        subKeys.clear();
        values.clear();
        ++generation;
    }

    void AppendText(std::string& text) const {
        if (parent != nullptr && (!base || !values.empty())) {
            text += '\n';
            text += KeyLine(Path());
            for (const auto& [valueName, value] : values) {
                text += ValueLine(valueName, value.type, value.data);
            }
        }
        for (const auto& [subName, subKey] : subKeys) {
            subKey->AppendText(text);
        }
    }
};

struct Registry::OpenedKey {
    KeyPointer key;
    std::uint32_t access = 0;
    /// Where the last enumeration stopped: asking for one name after the other must not begin anew each time.
    std::uint64_t generation = 0;
    std::size_t index = 0;
    std::map<std::string, KeyPointer, LessIgnoringCase>::const_iterator at;
    bool enumerating = false;

    std::map<std::string, KeyPointer, LessIgnoringCase>::const_iterator SubKey(std::size_t wanted) {
        if (!enumerating || generation != key->generation || wanted < index) {
            at = key->subKeys.begin();
            index = 0;
            generation = key->generation;
            enumerating = true;
        }
        for (; index < wanted && at != key->subKeys.end(); ++index) {
            ++at;
        }
        return at;
    }
};

Registry::Registry(std::string file, Faults& faults) : file_(std::move(file)), faults_(faults) {
    const std::lock_guard guard(mutex_);
    ReadFile();
}

Registry::~Registry() = default;

std::int32_t Registry::CreateKey(Handle parent, std::string_view subKey, std::uint32_t access, Handle& result,
                                 bool& created) {
    const std::lock_guard guard(mutex_);
    KeyPointer from;
    if (const std::int32_t error = Resolve(parent, 0, from)) {
        return error;
    }
    if (!subKey.empty() && subKey[0] == '\\') {
        return ERROR_BAD_PATHNAME;
    }
    if (HasBadName(subKey) || CountNames(from->Path()) + CountNames(subKey) > DeepestKey) {
        return ERROR_INVALID_PARAMETER;
    }
    KeyPointer key = Find(from, subKey);
    created = key == nullptr;
    if (created) {
        if (const std::int32_t error = Prepare(KeyLine(from->Path() + '\\' + std::string(subKey)))) {
            return error;
        }
        key = Make(from, subKey);
    }
    result = AddHandle(std::move(key), access);
    return ERROR_SUCCESS;
}

std::int32_t Registry::OpenKey(Handle parent, std::string_view subKey, std::uint32_t access, Handle& result) {
    const std::lock_guard guard(mutex_);
    KeyPointer from;
    if (const std::int32_t error = Resolve(parent, 0, from)) {
        return error;
    }
    if (subKey.empty() && !HiveName(parent).empty()) {
        result = parent;
        return ERROR_SUCCESS;
    }
    if (!subKey.empty() && subKey[0] == '\\') {
        return ERROR_BAD_PATHNAME;
    }
    KeyPointer key = Find(from, subKey);
    if (key == nullptr) {
        return ERROR_FILE_NOT_FOUND;
    }
    result = AddHandle(std::move(key), access);
    return ERROR_SUCCESS;
}

std::int32_t Registry::CloseKey(Handle handle) {
    const std::lock_guard guard(mutex_);
    if (!HiveName(handle).empty()) {
        return ERROR_SUCCESS;
    }
    return handles_.erase(handle) == 1 ? ERROR_SUCCESS : ERROR_INVALID_HANDLE;
}

std::int32_t Registry::SubKeyName(Handle handle, std::size_t index, std::string& name) {
    const std::lock_guard guard(mutex_);
    KeyPointer key;
    if (const std::int32_t error = Resolve(handle, KEY_ENUMERATE_SUB_KEYS, key)) {
        return error;
    }
    // The handle of a hive is nobody's own and remembers nothing.
    OpenedKey passing{key, 0, 0, 0, {}, false};
    const auto opened = handles_.find(handle);
    const auto found = (opened == handles_.end() ? passing : opened->second).SubKey(index);
    if (found == key->subKeys.end()) {
        return ERROR_NO_MORE_ITEMS;
    }
    name = found->second->name;
    return ERROR_SUCCESS;
}

std::int32_t Registry::GetValue(Handle handle, std::string_view name, RegistryValue& value) {
    const std::lock_guard guard(mutex_);
    KeyPointer key;
    if (const std::int32_t error = Resolve(handle, KEY_QUERY_VALUE, key)) {
        return error;
    }
    const auto found = key->values.find(name);
    if (found == key->values.end()) {
        return ERROR_FILE_NOT_FOUND;
    }
    value = found->second;
    return ERROR_SUCCESS;
}

std::int32_t Registry::SetValue(Handle handle, std::string_view name, RegistryValue value) {
    const std::lock_guard guard(mutex_);
    KeyPointer key;
    if (const std::int32_t error = Resolve(handle, KEY_SET_VALUE, key)) {
        return error;
    }
    if (IsLongerThan(LongestValueName, name)) {
        return ERROR_INVALID_PARAMETER;
    }
    if (const std::int32_t error = Prepare(KeyLine(key->Path()) + ValueLine(name, value.type, value.data))) {
        return error;
    }
    key->values.insert_or_assign(std::string(name), std::move(value));
    return ERROR_SUCCESS;
}

std::int32_t Registry::DeleteTree(Handle handle, std::string_view subKey) {
    const std::lock_guard guard(mutex_);
    KeyPointer from;
    if (const std::int32_t error = Resolve(handle, 0, from)) {
        return error;
    }
    const KeyPointer key = Find(from, subKey);
    if (key == nullptr) {
        return ERROR_FILE_NOT_FOUND;
    }
    if (key != from) {
        const std::int32_t error = Prepare(DeletedKeyLine(key->Path()));
        if (error == ERROR_SUCCESS) {
            key->parent->DeleteSubKey(key);
        }
        return error;
    }
    std::string section;
    for (const auto& [name, child] : key->subKeys) {
        section += DeletedKeyLine(child->Path());
    }
    section += KeyLine(key->Path());
    for (const auto& [name, value] : key->values) {
        section += DeletedValueLine(name);
    }
    const std::int32_t error = Prepare(section);
    if (error == ERROR_SUCCESS) {
        key->DeleteContents();
    }
    return error;
}

void Registry::LoadFile(const std::string& file) {
    std::ifstream stream(file, std::ios::binary);
    std::ostringstream text;
    text << stream.rdbuf();
    if (!stream) {
        EndWithMessage("cannot read the registry text " + file);
    }
    LoadText(text.str(), file);
}

void Registry::LoadText(std::string_view text, const std::string& nameForErrors) {
    try {
        const std::lock_guard guard(mutex_);
        const std::vector<RegistryChange> changes = ParseRegistryText(text);
        const std::size_t behindHeader = std::min(text.find('\n'), text.size() - 1) + 1;
        if (!Append(std::string(text.substr(behindHeader)) + "\n")) {
            EndWithMessage("cannot write the registry file " + file_ + ": " + std::strerror(errno));
        }
        Apply(changes);
    } catch (const RegistryTextError& error) {
        EndWithMessage(nameForErrors + ":" + std::to_string(error.Line()) + ": " + error.what());
    }
}

void Registry::Reload() {
    const std::lock_guard guard(mutex_);
    appendTo_.Close();
    ReadFile();
}

std::string Registry::Text() const {
    const std::lock_guard guard(mutex_);
    return TextLocked();
}

void Registry::Flush() {
    const std::lock_guard guard(mutex_);
    if (!changed_) {
        return;
    }
    const std::string fresh = file_ + ".new";
    Descriptor descriptor(open(fresh.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0666));
    const bool written = descriptor.IsOpen() && WriteAll(descriptor.Get(), TextLocked()) == 0;
    descriptor.Close();
    if (!written || rename(fresh.c_str(), file_.c_str()) != 0) {
        std::fprintf(stderr, "cannot write the registry file %s: %s\n", file_.c_str(), std::strerror(errno));
        unlink(fresh.c_str());
        return;
    }
    // The old file is gone from its name; what comes next belongs into the new one.
    appendTo_.Close();
    changed_ = false;
}

Registry::KeyPointer Registry::Find(const KeyPointer& from, std::string_view path) const {
    KeyPointer key = from;
    for (std::string_view name = TakeName(path); !name.empty(); name = TakeName(path)) {
        const auto found = key->subKeys.find(name);
        if (found == key->subKeys.end()) {
            return nullptr;
        }
        key = found->second;
    }
    return key;
}

Registry::KeyPointer Registry::Make(const KeyPointer& from, std::string_view path) {
    KeyPointer key = from;
    for (std::string_view name = TakeName(path); !name.empty(); name = TakeName(path)) {
        auto found = key->subKeys.find(name);
        if (found == key->subKeys.end()) {
            auto made = std::make_shared<Key>();
            made->name = name;
            made->parent = key.get();
            found = key->subKeys.emplace(made->name, std::move(made)).first;
            ++key->generation;
        }
        key = found->second;
    }
    return key;
}

Registry::KeyPointer Registry::KeyOfFullPath(std::string_view fullPath, bool make) {
    std::string_view rest = fullPath;
    const std::string_view hive = TakeName(rest);
    for (const Alias& alias : Aliases) {
        if (alias.hive == hive) {
            const std::string resolved = std::string(alias.path) + std::string(rest);
            return make ? Make(root_, resolved) : Find(root_, resolved);
        }
    }
    return make ? Make(root_, fullPath) : Find(root_, fullPath);
}

std::int32_t Registry::Resolve(Handle handle, std::uint32_t access, KeyPointer& key) {
    if (const std::string_view hive = HiveName(handle); !hive.empty()) {
        key = KeyOfFullPath(hive, true);
        return ERROR_SUCCESS;
    }
    const auto found = handles_.find(handle);
    if (found == handles_.end()) {
        return ERROR_INVALID_HANDLE;
    }
    if (found->second.key->deleted) {
        return ERROR_KEY_DELETED;
    }
    if ((found->second.access & access) != access) {
        return ERROR_ACCESS_DENIED;
    }
    key = found->second.key;
    return ERROR_SUCCESS;
}

Registry::Handle Registry::AddHandle(KeyPointer key, std::uint32_t access) {
    const Handle handle = nextHandle_;
    nextHandle_ += 4;
    handles_[handle] = {std::move(key), access, 0, 0, {}, false};
    return handle;
}

/// Asks whether the change may happen and writes it down; the caller then makes it.
std::int32_t Registry::Prepare(const std::string& section) {
    if (faults_.Check(Operation::RegistrySet, file_) != 0) {
        return ERROR_ACCESS_DENIED;
    }
    return Append(section) ? ERROR_SUCCESS : ERROR_WRITE_FAULT;
}

void Registry::Apply(const std::vector<RegistryChange>& changes) {
    for (const RegistryChange& change : changes) {
        const bool deletes = change.kind == RegistryChange::Kind::DeleteKey;
        const KeyPointer key = KeyOfFullPath(change.key, !deletes);
        if (deletes && key != nullptr) {
            key->parent->DeleteSubKey(key);
        } else if (change.kind == RegistryChange::Kind::SetValue) {
            key->values.insert_or_assign(change.name, RegistryValue{change.type, change.data});
        } else if (change.kind == RegistryChange::Kind::DeleteValue) {
            if (const auto value = key->values.find(change.name); value != key->values.end()) {
                key->values.erase(value);
            }
        }
    }
}

void Registry::MakeBaseKeys() {
    root_ = std::make_shared<Key>();
    for (const std::string_view path : BaseKeys) {
        for (Key* key = Make(root_, path).get(); key != nullptr; key = key->parent) {
            key->base = true;
        }
    }
}

void Registry::ReadFile() {
    if (root_ != nullptr) {
        root_->MarkDeleted();
    }
    MakeBaseKeys();
    changed_ = false;
    if (access(file_.c_str(), F_OK) != 0) {
        if (!Append({})) {
            EndWithMessage("cannot make the registry file " + file_ + ": " + std::strerror(errno));
        }
        changed_ = false;
        return;
    }
    std::ifstream stream(file_, std::ios::binary);
    std::ostringstream text;
    text << stream.rdbuf();
    try {
        Apply(ParseRegistryText(text.str()));
    } catch (const RegistryTextError& error) {
        EndWithMessage(file_ + ":" + std::to_string(error.Line()) + ": " + error.what());
    }
}

bool Registry::Append(const std::string& section) {
    changed_ = true;
    if (!appendTo_.IsOpen()) {
        appendTo_ = Descriptor(open(file_.c_str(), O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC, 0666));
        if (!appendTo_.IsOpen()) {
            return false;
        }
        if (lseek(appendTo_.Get(), 0, SEEK_END) == 0 && WriteAll(appendTo_.Get(), RegistryTextHeader()) != 0) {
            return false;
        }
    }
    return section.empty() || WriteAll(appendTo_.Get(), "\n" + section) == 0;
}

std::string Registry::TextLocked() const {
    std::string text = RegistryTextHeader();
    root_->AppendText(text);
    return text;
}

}  // namespace hosted
