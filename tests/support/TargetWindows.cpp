#include <fcntl.h>
#include <gtest/gtest.h>
#include <io.h>
#include <sys/stat.h>

#include <cstdlib>
#include <optional>

#include "platform/utf8.h"
#include "platform/win32.h"
#include "tests/support/RunProgram.h"
#include "tests/support/ScratchFile.h"
#include "tests/support/Target.h"

namespace {

using hosted::RegistryChange;

struct Hive {
    const char* name;
    HKEY key;
};
const Hive hives[] = {{"HKEY_LOCAL_MACHINE", HKEY_LOCAL_MACHINE},
                      {"HKEY_CURRENT_USER", HKEY_CURRENT_USER},
                      {"HKEY_USERS", HKEY_USERS},
                      {"HKEY_CLASSES_ROOT", HKEY_CLASSES_ROOT},
                      {"HKEY_CURRENT_CONFIG", HKEY_CURRENT_CONFIG}};

/// Which of a fresh machine's own keys are looked into. The others are many, a call into another process each, and
/// nobody here changes them. The longest path that fits decides: all below it is looked into, or only what is new
/// directly in it.
struct Region {
    std::string key;
    bool isWhole;
};
const Region regions[] = {{"HKEY_LOCAL_MACHINE", false},
                          {R"(HKEY_LOCAL_MACHINE\SOFTWARE)", true},
                          {R"(HKEY_LOCAL_MACHINE\SOFTWARE\Classes)", false},
                          {R"(HKEY_LOCAL_MACHINE\SOFTWARE\Microsoft)", false},
                          {R"(HKEY_LOCAL_MACHINE\SOFTWARE\Microsoft\Windows\CurrentVersion\Uninstall)", true},
                          {R"(HKEY_LOCAL_MACHINE\SOFTWARE\Wow6432Node)", false},
                          {R"(HKEY_LOCAL_MACHINE\SYSTEM\CurrentControlSet\Control\Session Manager\Environment)", true},
                          {R"(HKEY_LOCAL_MACHINE\SYSTEM\CurrentControlSet\Hardware Profiles\Current)", true},
                          {"HKEY_CURRENT_USER", false},
                          {R"(HKEY_CURRENT_USER\Environment)", true},
                          {R"(HKEY_CURRENT_USER\Software)", true},
                          {R"(HKEY_CURRENT_USER\Software\Classes)", false},
                          {R"(HKEY_CURRENT_USER\Software\Wine)", false},
                          {"HKEY_USERS", false}};

/// The display's own keys, made with the first window that anybody opens.
constexpr const char* DisplayKey = R"(HKEY_LOCAL_MACHINE\SYSTEM\CurrentControlSet\Control\Video)";

bool IsSameOrBelow(const std::string& path, const std::string& key) {
    return hosted::EqualsIgnoringCase(path.substr(0, key.size()), key) &&
           (path.size() == key.size() || path[key.size()] == '\\');
}

bool IsLookedInto(const std::string& path) {
    const Region* longest = nullptr;
    for (const Region& region : regions) {
        if (IsSameOrBelow(region.key, path)) {
            return true;
        }
        if (IsSameOrBelow(path, region.key) && (longest == nullptr || region.key.size() > longest->key.size())) {
            longest = &region;
        }
    }
    return longest != nullptr && longest->isWhole;
}

/// Wine spells two keys of the machine in its own way.
std::string AsWindowsSpells(const std::string& parent, const std::string& name) {
    for (const char* spelling : {"SOFTWARE", "SYSTEM"}) {
        if (parent == "HKEY_LOCAL_MACHINE" && hosted::EqualsIgnoringCase(name, spelling)) {
            return spelling;
        }
    }
    return name;
}

class OpenKey {
public:
    OpenKey(HKEY parent, const std::string& path, REGSAM access) {
        if (RegOpenKeyExA(parent, path.c_str(), 0, access, &key_) != ERROR_SUCCESS) {
            key_ = nullptr;
        }
    }
    ~OpenKey() {
        if (key_ != nullptr) {
            RegCloseKey(key_);
        }
    }
    OpenKey(const OpenKey&) = delete;
    OpenKey& operator=(const OpenKey&) = delete;
    [[nodiscard]] HKEY Get() const { return key_; }

private:
    HKEY key_ = nullptr;
};

RegistryValues ValuesOf(HKEY key) {
    RegistryValues values;
    std::string name(16384, '\0');
    std::string data(65536, '\0');
    for (DWORD index = 0;; ++index) {
        auto nameLength = static_cast<DWORD>(name.size());
        auto dataSize = static_cast<DWORD>(data.size());
        DWORD type = 0;
        const LSTATUS error = RegEnumValueA(key, index, name.data(), &nameLength, nullptr, &type,
                                            reinterpret_cast<BYTE*>(data.data()), &dataSize);
        if (error == ERROR_MORE_DATA) {
            data.resize(data.size() * 2);
            --index;
        } else if (error != ERROR_SUCCESS) {
            return values;
        } else {
            values[name.substr(0, nameLength)] = {type, data.substr(0, dataSize)};
        }
    }
}

std::vector<std::string> SubKeysOf(HKEY key) {
    std::vector<std::string> names;
    char name[1024];
    for (DWORD index = 0;; ++index) {
        DWORD length = sizeof name;
        if (RegEnumKeyExA(key, index, name, &length, nullptr, nullptr, nullptr, nullptr) != ERROR_SUCCESS) {
            return names;
        }
        names.emplace_back(name, length);
    }
}

class RegistryLister {
public:
    RegistryLister(const RegistryContent* base, RegistryContent& content) : base_(base), content_(content) {}

    void List(HKEY parent, const std::string& name, const std::string& path) {
        if (IsSameOrBelow(path, DisplayKey)) {
            return;
        }
        const bool isBase = base_ == nullptr || base_->count(path) > 0;
        RegistryValues& values = content_[path];
        if (isBase && !IsLookedInto(path)) {
            return;
        }
        const OpenKey key(parent, name, KEY_READ);
        values = ValuesOf(key.Get());
        for (const std::string& subKey : SubKeysOf(key.Get())) {
            List(key.Get(), subKey, path + '\\' + AsWindowsSpells(path, subKey));
        }
    }

private:
    const RegistryContent* base_;
    RegistryContent& content_;
};

RegistryContent ListRegistry(const RegistryContent* base) {
    RegistryContent content;
    RegistryLister lister(base, content);
    // The other two hives are views of keys of these.
    for (const Hive& hive : {hives[0], hives[1], hives[2]}) {
        lister.List(hive.key, "", hive.name);
    }
    return content;
}

/// Every machine starts as this one was when the program first asked for one.
const RegistryContent& BaseRegistry() {
    static const RegistryContent base = ListRegistry(nullptr);
    return base;
}

HKEY SplitHive(const std::string& path, std::string& rest) {
    const std::size_t separator = path.find('\\');
    rest = separator == std::string::npos ? std::string() : path.substr(separator + 1);
    for (const Hive& hive : hives) {
        if (path.substr(0, separator) == hive.name) {
            return hive.key;
        }
    }
    ADD_FAILURE() << path << " begins with no hive";
    return nullptr;
}

LSTATUS ApplyToKey(HKEY key, const RegistryChange& change) {
    if (change.kind == RegistryChange::Kind::SetValue) {
        return RegSetValueExA(key, change.name.c_str(), 0, change.type,
                              reinterpret_cast<const BYTE*>(change.data.data()),
                              static_cast<DWORD>(change.data.size()));
    }
    if (change.kind == RegistryChange::Kind::DeleteValue) {
        RegDeleteValueA(key, change.name.c_str());
    }
    return ERROR_SUCCESS;
}

void Apply(const RegistryChange& change) {
    std::string path;
    const HKEY hive = SplitHive(change.key, path);
    if (change.kind == RegistryChange::Kind::DeleteKey) {
        RegDeleteTreeA(hive, path.c_str());
        return;
    }
    HKEY key = nullptr;
    LSTATUS error = RegCreateKeyExA(hive, path.c_str(), 0, nullptr, 0, KEY_ALL_ACCESS, nullptr, &key, nullptr);
    if (error == ERROR_SUCCESS) {
        error = ApplyToKey(key, change);
        RegCloseKey(key);
    }
    if (error != ERROR_SUCCESS) {
        ADD_FAILURE() << "cannot change " << change.key << " " << change.name << ": error " << error;
    }
}

void PutRegistryBack() {
    const RegistryContent& base = BaseRegistry();
    for (const auto& [path, values] : ListRegistry(&base)) {
        const auto before = base.find(path);
        if (before == base.end()) {
            Apply({RegistryChange::Kind::DeleteKey, path, {}, 0, {}});
            continue;
        }
        for (const auto& [name, value] : values) {
            const auto old = before->second.find(name);
            if (old == before->second.end()) {
                Apply({RegistryChange::Kind::DeleteValue, path, name, 0, {}});
            } else if (old->second != value) {
                Apply({RegistryChange::Kind::SetValue, path, name, old->second.type, old->second.data});
            }
        }
    }
}

void RemoveItem(const std::filesystem::path& item) {
    std::error_code error;
    // A read-only file would refuse.
    std::filesystem::permissions(item, std::filesystem::perms::owner_write, std::filesystem::perm_options::add, error);
    std::filesystem::remove(item, error);
    if (error) {
        ADD_FAILURE() << "cannot remove " << item << ": " << error.message();
    }
}

void RemoveTree(const std::filesystem::path& item) {
    std::error_code error;
    if (std::filesystem::is_directory(item, error) && !std::filesystem::is_symlink(item, error)) {
        std::vector<std::filesystem::path> entries;
        for (const auto& entry : std::filesystem::directory_iterator(item, error)) {
            entries.push_back(entry.path());
        }
        for (const std::filesystem::path& entry : entries) {
            RemoveTree(entry);
        }
    }
    RemoveItem(item);
}

std::filesystem::path PathOf(const std::string& path) {
    return platform::WideFromUtf8(path);
}

}  // namespace

MachineTarget::MachineTarget() : environment_(Environment()) {
    static const Items items = ListItems({});
    static const std::set<std::string> temp = ListTemp();
    baseItems_ = items;
    baseTemp_ = temp;
    BaseRegistry();
}

MachineTarget::~MachineTarget() {
    const Items added = AddedItems();
    // The items of a folder come after the folder, so backwards they go before it.
    for (auto item = added.rbegin(); item != added.rend(); ++item) {
        RemoveItem(PathOf(item->first));
    }
    for (const std::string& name : AddedTempEntries()) {
        RemoveTree(PathOf(Variable("TEMP")) / PathOf(name));
    }
    PutRegistryBack();
    for (const auto& [name, value] : Environment()) {
        if (environment_.count(name) == 0) {
            SetEnvironmentVariableA(name.c_str(), nullptr);
        }
    }
    for (const auto& [name, value] : environment_) {
        SetEnvironmentVariableA(name.c_str(), value.c_str());
    }
}

std::map<std::string, std::string> MachineTarget::Environment() {
    std::map<std::string, std::string> variables;
    char* const block = GetEnvironmentStringsA();
    for (const char* entry = block; *entry != '\0'; entry += std::string(entry).size() + 1) {
        const std::string text(entry);
        // Names that begin with an equals sign are the drives' current folders.
        const std::size_t equals = text.find('=', 1);
        if (text[0] != '=') {
            variables.emplace(text.substr(0, equals), text.substr(equals + 1));
        }
    }
    FreeEnvironmentStringsA(block);
    return variables;
}

std::filesystem::path MachineTarget::HostPath(const std::string& path) const {
    return PathOf(path);
}

std::filesystem::path MachineTarget::DriveC() const {
    return "C:\\";
}

std::string MachineTarget::Variable(const std::string& name) const {
    char value[8192];
    const DWORD length = GetEnvironmentVariableA(name.c_str(), value, sizeof value);
    return {value, length};
}

void MachineTarget::LoadRegistry(const std::vector<RegistryChange>& changes, const std::string&) {
    for (const RegistryChange& change : changes) {
        Apply(change);
    }
}

RegistryContent MachineTarget::AddedRegistry() const {
    const RegistryContent& base = BaseRegistry();
    RegistryContent added;
    for (const auto& [path, values] : ListRegistry(&base)) {
        const auto before = base.find(path);
        if (before == base.end()) {
            added[path] = values;
            continue;
        }
        for (const auto& [name, value] : values) {
            const auto old = before->second.find(name);
            if (old == before->second.end() || old->second != value) {
                added[path][name] = value;
            }
        }
    }
    return added;
}

int OpenScratchFile() {
    static int number = 0;
    const std::string name =
        R"(C:\windows\temp\scratch-)" + std::to_string(GetCurrentProcessId()) + "-" + std::to_string(++number) + ".txt";
    const int descriptor = _open(name.c_str(), _O_CREAT | _O_EXCL | _O_RDWR | _O_BINARY | _O_TEMPORARY | _O_NOINHERIT,
                                 _S_IREAD | _S_IWRITE);
    if (descriptor < 0) {
        std::fprintf(stderr, "cannot make the scratch file %s\n", name.c_str());
        std::exit(1);
    }
    return descriptor;
}

namespace {

/// One argument as the runtime of the started program takes it apart again.
std::wstring Quoted(const std::string& argument) {
    std::wstring quoted = L"\"";
    std::size_t backslashes = 0;
    for (const wchar_t c : platform::WideFromUtf8(argument)) {
        if (c == L'"') {
            quoted.append(backslashes + 1, L'\\');
        }
        backslashes = c == L'\\' ? backslashes + 1 : 0;
        quoted += c;
    }
    quoted.append(backslashes, L'\\');
    return quoted + L'"';
}

std::wstring CommandLine(const std::string& program, const std::vector<std::string>& arguments) {
    std::wstring line = Quoted(program);
    for (const std::string& argument : arguments) {
        line += L' ' + Quoted(argument);
    }
    return line;
}

HANDLE InheritableHandle(int descriptor) {
    const auto handle = reinterpret_cast<HANDLE>(_get_osfhandle(descriptor));
    SetHandleInformation(handle, HANDLE_FLAG_INHERIT, HANDLE_FLAG_INHERIT);
    return handle;
}

/// Starts the program and waits; nothing when it does not start.
std::optional<int> Run(std::wstring line, int output, int errors) {
    STARTUPINFOW start{};
    start.cb = sizeof start;
    start.dwFlags = STARTF_USESTDHANDLES;
    start.hStdInput = GetStdHandle(STD_INPUT_HANDLE);
    start.hStdOutput = InheritableHandle(output);
    start.hStdError = InheritableHandle(errors);
    PROCESS_INFORMATION process{};
    if (!CreateProcessW(nullptr, line.data(), nullptr, nullptr, TRUE, 0, nullptr, nullptr, &start, &process)) {
        return std::nullopt;
    }
    WaitForSingleObject(process.hProcess, INFINITE);
    DWORD status = 0;
    GetExitCodeProcess(process.hProcess, &status);
    CloseHandle(process.hThread);
    CloseHandle(process.hProcess);
    return static_cast<int>(status);
}

/// Sets variables for as long as it lives; a child inherits them.
class PassingEnvironment {
public:
    explicit PassingEnvironment(const std::map<std::string, std::string>& variables) {
        for (const auto& [name, value] : variables) {
            char old[8192];
            const DWORD length = GetEnvironmentVariableA(name.c_str(), old, sizeof old);
            before_.emplace(name, length > 0 ? std::optional<std::string>(old) : std::nullopt);
            SetEnvironmentVariableA(name.c_str(), value.c_str());
        }
    }
    ~PassingEnvironment() {
        for (const auto& [name, value] : before_) {
            SetEnvironmentVariableA(name.c_str(), value ? value->c_str() : nullptr);
        }
    }
    PassingEnvironment(const PassingEnvironment&) = delete;
    PassingEnvironment& operator=(const PassingEnvironment&) = delete;

private:
    std::map<std::string, std::optional<std::string>> before_;
};

}  // namespace

ProgramResult RunProgram(const std::string& program, const std::vector<std::string>& arguments,
                         const std::map<std::string, std::string>& environment) {
    // The folder is the host's, which a Windows program finds on drive Z.
    const std::string file = "Z:" + std::string(HV_PROGRAM_FOLDER) + "/" + program + ".exe";
    const PassingEnvironment passing(environment);
    const int output = OpenScratchFile();
    const int errors = OpenScratchFile();
    const std::optional<int> status = Run(CommandLine(file, arguments), output, errors);
    if (!status) {
        ADD_FAILURE() << "cannot start " << file << ": error " << GetLastError();
    }
    ProgramResult result{status.value_or(-1), ReadScratchFile(output), ReadScratchFile(errors)};
    _close(output);
    _close(errors);
    return result;
}
