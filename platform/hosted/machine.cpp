#include "platform/hosted/machine.h"

#include <pwd.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <atomic>
#include <cerrno>
#include <climits>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <mutex>
#include <stdexcept>
#include <type_traits>
#include <vector>

#include "platform/hosted/failure.h"
#include "platform/hosted/held_folders.h"
#include "platform/utf8.h"

namespace hosted {
namespace {

constexpr const char* FolderVariable = "HV_MACHINE";
constexpr const char* FaultsVariable = "HV_MACHINE_FAULTS";
constexpr const char* DefaultFolderName = ".hvmachine";
constexpr const char* RegistryFileName = "registry.reg";

/// Below it nothing exists and nothing can be made, whoever asks.
constexpr const char* Nowhere = "/dev/null/nowhere";

/// What stands for a name that Windows refuses: longer than any that the host takes, so the host refuses it as well,
/// and in words that it has for nothing else.
const std::string& RefusedName() {
    static const std::string name(PATH_MAX, '?');
    return name;
}

/// Characters that no name on a drive of Windows may hold, by their ASCII code. Looked up for every character of a
/// path.
constexpr std::array<bool, 128> RefusedCharacters = [] {
    std::array<bool, 128> refused{};
    for (std::size_t code = 0; code < ' '; ++code) {
        refused[code] = true;
    }
    for (const char c : {'<', '>', ':', '"', '|', '?', '*'}) {
        refused[static_cast<std::size_t>(c)] = true;
    }
    return refused;
}();

std::atomic<Machine*> current{nullptr};
std::mutex makingFirst;

void FlushCurrent() {
    if (Machine* machine = current.load()) {
        machine->GetRegistry().Flush();
    }
}

const passwd& PasswordEntry() {
    const passwd* entry = getpwuid(getuid());
    if (entry == nullptr) {
        EndWithMessage("the account of this process has no name");
    }
    return *entry;
}

std::string FolderFromEnvironment() {
    if (const char* folder = std::getenv(FolderVariable); folder != nullptr && *folder != '\0') {
        return folder;
    }
    const char* home = std::getenv("HOME");
    return std::string(home != nullptr && *home != '\0' ? home : PasswordEntry().pw_dir) + "/" + DefaultFolderName;
}

void MakeFolder(const std::string& hostPath) {
    if (mkdir(hostPath.c_str(), 0777) != 0 && errno != EEXIST) {
        EndWithMessage("cannot make the machine's folder " + hostPath + ": " + std::strerror(errno));
    }
}

/// The folder without links in its name; made, with its parents, when it is missing.
std::string MadeAndResolved(const std::string& folder) {
    for (std::size_t at = folder.find('/', 1); at != std::string::npos; at = folder.find('/', at + 1)) {
        MakeFolder(folder.substr(0, at));
    }
    MakeFolder(folder);
    char resolved[PATH_MAX];
    if (realpath(folder.c_str(), resolved) == nullptr) {
        EndWithMessage("cannot find the machine's folder " + folder + ": " + std::strerror(errno));
    }
    return resolved;
}

/// Nearly every name is plain ASCII, which needs no conversion.
template <class Char>
bool IsPlain(std::basic_string_view<Char> part) {
    return std::all_of(part.begin(), part.end(), [](Char c) { return c >= 0 && c <= 0x7F; });
}

/// One that is malformed is the same name in both kinds of text.
void AppendAsUtf8(std::string& text, std::string_view part) {
    if (IsPlain(part)) {
        text.append(part);
    } else {
        text += platform::Utf8FromWide(platform::WideFromUtf8(part));
    }
}

void AppendAsUtf8(std::string& text, std::wstring_view part) {
    if (!IsPlain(part)) {
        text += platform::Utf8FromWide(part);
        return;
    }
    const std::size_t start = text.size();
    text.resize(start + part.size());
    std::transform(part.begin(), part.end(), text.begin() + static_cast<std::ptrdiff_t>(start),
                   [](wchar_t c) { return static_cast<char>(c); });
}

template <class Char>
bool IsSeparator(Char c) {
    return c == Char('\\') || c == Char('/');
}

template <class Char>
bool IsLetter(Char c) {
    return (c >= Char('a') && c <= Char('z')) || (c >= Char('A') && c <= Char('Z'));
}

template <class Char>
Char LowerCase(Char c) {
    return c >= Char('A') && c <= Char('Z') ? static_cast<Char>(c - Char('A') + Char('a')) : c;
}

template <class Char>
bool EqualsName(const std::string& name, std::basic_string_view<Char> text) {
    if (name.size() != text.size()) {
        return false;
    }
    for (std::size_t at = 0; at < name.size(); ++at) {
        if (LowerCase(static_cast<Char>(name[at])) != LowerCase(text[at])) {
            return false;
        }
    }
    return true;
}

/// Neither a drive nor a separator at its beginning.
template <class Char>
bool IsRelative(std::basic_string_view<Char> path) {
    return !path.empty() && !IsSeparator(path[0]) && !(path.size() >= 2 && path[1] == Char(':') && IsLetter(path[0]));
}

template <class Char>
bool IsRefused(Char c) {
    const auto code = static_cast<std::make_unsigned_t<Char>>(c);
    return code < RefusedCharacters.size() && RefusedCharacters[code];
}

/// Windows takes these for devices in every folder, whatever follows the first dot; COM and LPT have a number more.
template <class Char>
bool NamesADevice(std::basic_string_view<Char> name) {
    name = name.substr(0, name.find(Char('.')));
    name = name.substr(0, name.find_last_not_of(Char(' ')) + 1);
    if (name.size() < 3 || name.size() > 7) {
        return false;
    }
    for (const char* device : {"NUL", "CON", "PRN", "AUX", "CONIN$", "CONOUT$"}) {
        if (EqualsName(device, name)) {
            return true;
        }
    }
    const bool numbered = name.size() == 4 && name[3] >= Char('1') && name[3] <= Char('9');
    return numbered && (EqualsName("COM", name.substr(0, 3)) || EqualsName("LPT", name.substr(0, 3)));
}

bool IsFolder(const std::string& hostPath) {
    struct stat found {};
    return stat(hostPath.c_str(), &found) == 0 && S_ISDIR(found.st_mode);
}

bool IsThere(const std::string& hostPath) {
    return access(hostPath.c_str(), F_OK) == 0;
}

bool IsBelowOrEqual(std::string_view path, std::string_view folder) {
    return path.substr(0, folder.size()) == folder && (path.size() == folder.size() || path[folder.size()] == '/');
}

}  // namespace

/// One of the folders that every machine has, and those in it.
struct Machine::BaseFolder {
    std::string name;
    const BaseFolder* parent = nullptr;
    std::vector<std::unique_ptr<BaseFolder>> folders;

    BaseFolder& Folder(const std::string& path) {
        const std::size_t end = path.find('/');
        BaseFolder& first = Child(path.substr(0, end));
        return end == std::string::npos ? first : first.Folder(path.substr(end + 1));
    }

    BaseFolder& Child(const std::string& childName) {
        for (const auto& folder : folders) {
            if (folder->name == childName) {
                return *folder;
            }
        }
        folders.push_back(std::make_unique<BaseFolder>());
        folders.back()->name = childName;
        folders.back()->parent = this;
        return *folders.back();
    }

    template <class Char>
    const BaseFolder* Find(std::basic_string_view<Char> childName) const {
        for (const auto& folder : folders) {
            if (EqualsName(folder->name, childName)) {
                return folder.get();
            }
        }
        return nullptr;
    }
};

std::unique_ptr<const Machine::BaseFolder> Machine::BaseFoldersOf(const std::string& account) {
    auto root = std::make_unique<BaseFolder>();
    for (const char* path : {"Program Files/Common Files", "Program Files (x86)/Common Files", "windows/Fonts",
                             "windows/system32", "windows/temp", "ProgramData/Microsoft/Windows/Start Menu/Programs",
                             "users/Public/Desktop", "users/Public/Documents"}) {
        root->Folder(path);
    }
    for (const char* path : {"AppData/Local/Temp", "AppData/LocalLow",
                             "AppData/Roaming/Microsoft/Windows/Start Menu/Programs", "Desktop", "Documents"}) {
        root->Folder("users/" + account + "/" + path);
    }
    return root;
}

/// Builds the host's name of one Windows path, component by component.
template <class Char>
class Machine::HostName {
public:
    HostName(const Machine& machine, std::basic_string_view<Char> path) : machine_(machine), rest_(path) {
        name_.reserve(machine.driveC_.size() + path.size() + 8);
    }

    std::string Build() {
        if (rest_.empty() || !TakeRoot()) {
            return rest_.empty() && name_.empty() ? std::string() : Nowhere;
        }
        const bool endsInSeparator = !rest_.empty() && IsSeparator(rest_.back());
        while (!rest_.empty()) {
            if (!TakeComponent()) {
                return RefusedName();
            }
        }
        if (name_.empty()) {
            return relative_ ? "." : "/";
        }
        return endsInSeparator && checked_ && !IsFolder(name_) ? NameOfNoFolder() : std::move(name_);
    }

private:
    using Text = std::basic_string_view<Char>;

    /// With a separator at its end a file's name names nothing; what is missing can be made as a folder, and only so.
    std::string NameOfNoFolder() { return IsThere(name_) ? RefusedName() : name_ + '/'; }

    /// Takes the drive or the leading separator. False for what no machine has.
    bool TakeRoot() {
        TakeLongPathMark();
        if (rest_.size() >= 2 && rest_[1] == Char(':') && IsLetter(rest_[0])) {
            const char letter = static_cast<char>(LowerCase(rest_[0]));
            rest_.remove_prefix(2);
            return StartAtDrive(letter);
        }
        if (rest_.size() >= 2 && IsSeparator(rest_[0]) && IsSeparator(rest_[1])) {
            return false;
        }
        // Nothing but Z: leads out of the machine, so a path without a drive is on C:, as it is on a Windows machine
        // with one drive.
        if (IsSeparator(rest_[0])) {
            return StartAtDrive('c');
        }
        relative_ = true;
        return true;
    }

    void TakeLongPathMark() {
        constexpr Char mark[] = {'\\', '\\', '?', '\\'};
        if (rest_.substr(0, 4) == Text(mark, 4)) {
            rest_.remove_prefix(4);
        }
        if (rest_.empty()) {
            rest_ = Text(mark, 2);
        }
    }

    bool StartAtDrive(char letter) {
        if (letter == 'z') {
            return true;
        }
        checked_ = true;
        if (letter == 'c') {
            name_ = machine_.driveC_;
            base_ = machine_.baseFolders_.get();
            return true;
        }
        name_ = machine_.folder_ + "/drive_" + letter;
        return IsThere(name_);
    }

    /// Takes one component and the separators around it. False for a name that Windows refuses.
    bool TakeComponent() {
        std::size_t start = 0;
        while (start < rest_.size() && IsSeparator(rest_[start])) {
            ++start;
        }
        std::size_t end = start;
        bool refused = false;
        while (end < rest_.size() && !IsSeparator(rest_[end])) {
            refused = refused || (checked_ && IsRefused(rest_[end]));
            ++end;
        }
        const bool last = end == rest_.size();
        const Text component = rest_.substr(start, end - start);
        rest_.remove_prefix(end);
        Enter(component, last);
        return !refused && !(checked_ && last && NamesADevice(component));
    }

    void Enter(Text component, bool last) {
        if (component.size() == 2 && component[0] == Char('.') && component[1] == Char('.')) {
            Leave();
            return;
        }
        component = WithoutTrailingDots(component, last);
        if (component.empty()) {
            return;
        }
        const BaseFolder* known = base_ != nullptr && below_ == 0 ? base_->Find(component) : nullptr;
        AddSeparator();
        if (known != nullptr) {
            base_ = known;
            name_ += known->name;
        } else {
            ++below_;
            AppendAsUtf8(name_, component);
        }
        ++depth_;
    }

    /// Windows drops all dots and blanks at the end of a path, and one dot at the end of a component before that.
    Text WithoutTrailingDots(Text component, bool last) const {
        if (component == Text(&dot_, 1)) {
            return {};
        }
        if (!checked_) {
            return component;
        }
        if (!last) {
            return component.empty() || component.back() != dot_ ? component
                                                                 : component.substr(0, component.size() - 1);
        }
        while (!component.empty() && (component.back() == dot_ || component.back() == Char(' '))) {
            component.remove_suffix(1);
        }
        return component;
    }

    void AddSeparator() {
        if (!relative_ || !name_.empty()) {
            name_ += '/';
        }
    }

    /// Back out of the last component; a drive's root stays where it is, a relative path climbs.
    void Leave() {
        if (depth_ == 0) {
            if (relative_) {
                AddSeparator();
                name_ += "..";
            }
            return;
        }
        const std::size_t separator = name_.rfind('/');
        name_.resize(separator == std::string::npos ? 0 : separator);
        --depth_;
        if (below_ > 0) {
            --below_;
        } else if (base_ != nullptr) {
            base_ = base_->parent;
        }
    }

    static constexpr Char dot_ = Char('.');
    const Machine& machine_;
    Text rest_;
    std::string name_;
    bool relative_ = false;
    /// On the machine's own drives names are Windows names; elsewhere they are the host's.
    bool checked_ = false;
    const BaseFolder* base_ = nullptr;
    std::size_t below_ = 0;
    std::size_t depth_ = 0;
};

Machine& Machine::Current() {
    Machine* machine = current.load(std::memory_order_acquire);
    return machine != nullptr ? *machine : First();
}

Machine& Machine::First() {
    const std::lock_guard guard(makingFirst);
    if (current.load() == nullptr) {
        Use(FolderFromEnvironment());
    }
    return *current.load();
}

// The machine outlives main() on purpose: a thread that is never joined may still be using it when the process ends.
void Machine::Use(const std::string& folder) {
    static const int registered = std::atexit(FlushCurrent);
    static_cast<void>(registered);
    FlushCurrent();
    auto machine = std::make_unique<Machine>(folder);
    delete current.exchange(machine.release());
}

void Machine::Abandon() {
    delete current.exchange(nullptr);
}

Machine::Machine(const std::string& folder)
    : folder_(MadeAndResolved(folder)),
      driveC_(folder_ + "/drive_c"),
      account_(PasswordEntry().pw_name),
      baseFolders_(BaseFoldersOf(account_)),
      environment_(account_),
      registry_(folder_ + "/" + RegistryFileName, faults_) {
    MakeFolders(*baseFolders_, driveC_);
    ArmFromEnvironment();
}

Machine::~Machine() = default;

void Machine::MakeFolders(const BaseFolder& folder, const std::string& hostPath) {
    MakeFolder(hostPath);
    for (const auto& child : folder.folders) {
        MakeFolders(*child, hostPath + "/" + child->name);
    }
}

void Machine::ArmFromEnvironment() {
    const char* orders = std::getenv(FaultsVariable);
    if (orders == nullptr) {
        return;
    }
    try {
        faults_.Arm(orders, [this](const std::string& path) { return HostPath(path); });
    } catch (const std::invalid_argument& error) {
        EndWithMessage(std::string(FaultsVariable) + ": " + error.what());
    }
}

std::wstring Machine::CurrentFolderOnC() const {
    char folder[PATH_MAX];
    const bool isOnC = getcwd(folder, sizeof folder) != nullptr && IsBelowOrEqual(folder, driveC_);
    return isOnC ? WindowsPath(folder) : std::wstring();
}

std::string Machine::HostPath(std::wstring_view windowsPath) const {
    if (IsRelative(windowsPath)) {
        if (const std::wstring folder = CurrentFolderOnC(); !folder.empty()) {
            return HeldFolders::All().Through(
                HostName<wchar_t>(*this, folder + L'\\' + std::wstring(windowsPath)).Build());
        }
    }
    return HeldFolders::All().Through(HostName<wchar_t>(*this, windowsPath).Build());
}

std::string Machine::HostPath(std::string_view windowsPath) const {
    if (IsRelative(windowsPath)) {
        if (const std::wstring folder = CurrentFolderOnC(); !folder.empty()) {
            return HeldFolders::All().Through(
                HostName<char>(*this, platform::Utf8FromWide(folder) + '\\' + std::string(windowsPath)).Build());
        }
    }
    return HeldFolders::All().Through(HostName<char>(*this, windowsPath).Build());
}

std::wstring Machine::WindowsPath(std::string_view hostPath) const {
    std::wstring path;
    if (IsBelowOrEqual(hostPath, driveC_)) {
        path = L"C:";
        hostPath.remove_prefix(driveC_.size());
    } else if (!hostPath.empty() && hostPath[0] == '/') {
        path = L"Z:";
    }
    if (!path.empty() && hostPath.empty()) {
        path += L'\\';
    }
    for (const wchar_t c : platform::WideFromUtf8(hostPath)) {
        path += c == L'/' ? L'\\' : c;
    }
    return path;
}

}  // namespace hosted
