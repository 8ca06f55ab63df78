#include "system/RegistryKey.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <string_view>
#include <utility>

#include "hvframework/StringUtils.h"

namespace HV {
namespace {

constexpr std::size_t kFirstBufferSize = 1024;
constexpr std::size_t kLargeBufferSize = 65536;
constexpr std::size_t kLargestValue = 65535;
constexpr std::size_t kSubkeyNameSize = 256;

constexpr std::string_view kComputerPrefix = "Computer\\";

bool IsPredefined(HKEY handle) {
    const std::array predefined = {
        HKEY_LOCAL_MACHINE,  HKEY_CURRENT_USER,     HKEY_CLASSES_ROOT,     HKEY_USERS,
        HKEY_CURRENT_CONFIG, HKEY_PERFORMANCE_DATA, HKEY_PERFORMANCE_TEXT, HKEY_PERFORMANCE_NLSTEXT};
    return std::find(predefined.begin(), predefined.end(), handle) != predefined.end();
}

std::string TextUpToNull(std::string_view data) {
    return std::string(data.substr(0, data.find('\0')));
}

std::string HexadecimalText(std::string_view data) {
    constexpr std::string_view kDigits = "0123456789abcdef";
    std::string text;
    text.reserve(data.size() * 2);
    for (const char character : data) {
        const auto byte = static_cast<unsigned char>(character);
        text += kDigits[byte >> 4U];
        text += kDigits[byte & 0x0fU];
    }
    return text;
}

std::string DecimalText(std::string_view data) {
    std::uint32_t number = 0;
    std::memcpy(&number, data.data(), std::min(data.size(), sizeof number));
    return HVL::StringUtils::ToString(number);
}

// The list ends at its first empty string, or where its data end.
std::string JoinedText(std::string_view data) {
    std::string text;
    while (!data.empty() && data.front() != '\0') {
        const std::string_view item = data.substr(0, data.find('\0'));
        text += text.empty() ? "" : ";";
        text += item;
        data.remove_prefix(std::min(data.size(), item.size() + 1));
    }
    return text;
}

std::string ValueText(DWORD type, std::string_view data) {
    switch (type) {
        case REG_SZ:
        case REG_EXPAND_SZ:
        case REG_LINK:
            return TextUpToNull(data);
        case REG_BINARY:
            return HexadecimalText(data);
        case REG_DWORD:
            return DecimalText(data);
        case REG_MULTI_SZ:
            return JoinedText(data);
        default:
            return {};
    }
}

}  // namespace

Win32RegKeyHandle::Win32RegKeyHandle(HKEY parentKey, const std::string& subkey, bool create) : parent(parentKey) {
    if (subkey.empty() && IsPredefined(parentKey)) {
        key = parentKey;
        return;
    }
    LSTATUS status = ERROR_SUCCESS;
    if (create) {
        DWORD disposition = 0;
        status = RegCreateKeyExA(parentKey, subkey.c_str(), 0, nullptr, REG_OPTION_NON_VOLATILE, KEY_ALL_ACCESS,
                                 nullptr, &key, &disposition);
        created = status == ERROR_SUCCESS && disposition == REG_CREATED_NEW_KEY;
    } else {
        status = RegOpenKeyExA(parentKey, subkey.c_str(), 0, KEY_READ, &key);
    }
    if (status != ERROR_SUCCESS) {
        key = nullptr;
    }
}

// Fixed (contracts, registry): a key directly below a hive is left open. Whoever is its only user calls Close().
Win32RegKeyHandle::~Win32RegKeyHandle() {
    if (!IsPredefined(parent)) {
        Close();
    }
    key = nullptr;
}

Win32RegKeyHandle::Win32RegKeyHandle(Win32RegKeyHandle&& other) noexcept
    : key(std::exchange(other.key, nullptr)), parent(other.parent), created(other.created) {}

Win32RegKeyHandle& Win32RegKeyHandle::operator=(Win32RegKeyHandle&& other) noexcept {
    if (this != &other) {
        Win32RegKeyHandle released(std::move(*this));
        key = std::exchange(other.key, nullptr);
        parent = other.parent;
        created = other.created;
    }
    return *this;
}

void Win32RegKeyHandle::Close() {
    if (key != nullptr && !IsPredefined(key)) {
        RegCloseKey(key);
    }
    key = nullptr;
}

void Win32RegKeyHandle::GetSubkeyNames(std::vector<std::string>& names) const {
    names.clear();
    std::array<char, kSubkeyNameSize> name;
    for (DWORD index = 0;; ++index) {
        auto length = static_cast<DWORD>(name.size());
        if (RegEnumKeyExA(key, index, name.data(), &length, nullptr, nullptr, nullptr, nullptr) != ERROR_SUCCESS) {
            return;
        }
        names.emplace_back(name.data(), length);
    }
}

std::int32_t Win32RegKeyHandle::ReadValue(const std::string& subkey, const std::string& name, std::string& text) const {
    text.clear();
    std::array<char, kFirstBufferSize> small;
    std::vector<char> large;
    char* data = small.data();
    auto size = static_cast<DWORD>(small.size());
    DWORD type = REG_NONE;
    const auto read = [&] { return RegGetValueA(key, subkey.c_str(), name.c_str(), RRF_RT_ANY, &type, data, &size); };
    LSTATUS status = read();
    if (status == ERROR_MORE_DATA && size <= kLargestValue) {
        large.resize(kLargeBufferSize);
        data = large.data();
        size = static_cast<DWORD>(large.size());
        status = read();
    }
    if (status != ERROR_SUCCESS) {
        return -1;
    }
    text = ValueText(type, std::string_view(data, size));
    return static_cast<std::int32_t>(type);
}

HKEY Win32RegKeyHandle::HiveFromName(const std::string& name) {
    const std::array<std::pair<std::string_view, HKEY>, 5> hives = {{
        {"HKEY_LOCAL_MACHINE", HKEY_LOCAL_MACHINE},
        {"HKEY_CURRENT_USER", HKEY_CURRENT_USER},
        {"HKEY_CLASSES_ROOT", HKEY_CLASSES_ROOT},
        {"HKEY_USERS", HKEY_USERS},
        {"HKEY_CURRENT_CONFIG", HKEY_CURRENT_CONFIG},
    }};
    for (const auto& [hiveName, hive] : hives) {
        if (name == hiveName) {
            return hive;
        }
    }
    return nullptr;
}

bool Win32RegKeyHandle::OpenPath(HKEY root, const std::string& path, Win32RegKeyHandle& output, bool create) {
    output = Win32RegKeyHandle();
    if (path.empty()) {
        output.key = root;
        return root != nullptr;
    }
    output.key = root;
    bool intermediate = false;
    for (const std::string& name : HVL::StringUtils::Split(path, '\\')) {
        Win32RegKeyHandle level(output.key, name, create);
        // The root is the caller's; every other handle that was passed through is closed here, also one directly below
        // a hive, which the destructor would leave open.
        if (intermediate) {
            output.Close();
        }
        output.key = nullptr;
        output = std::move(level);
        if (output.key == nullptr) {
            return false;
        }
        intermediate = true;
    }
    return true;
}

bool Win32RegKeyHandle::ParseRegistryPath(const std::string& text, HKEY& hive, std::string& path) {
    std::string_view rest = text;
    if (rest.starts_with(kComputerPrefix)) {
        rest.remove_prefix(kComputerPrefix.size());
    }
    const std::size_t separator = rest.find('\\');
    if (separator == std::string_view::npos) {
        return false;
    }
    const HKEY named = HiveFromName(std::string(rest.substr(0, separator)));
    if (named == nullptr) {
        return false;
    }
    hive = named;
    path = std::string(rest.substr(separator + 1));
    return true;
}

bool Win32RegKeyHandle::OpenUninstallKey(const std::string& entryName, Win32RegKeyHandle& output) {
    Win32RegKeyHandle list(HKEY_LOCAL_MACHINE, kInstalledProgramsPath, true);
    output = Win32RegKeyHandle(list.key, entryName, true);
    list.Close();
    return output.key != nullptr;
}

}  // namespace HV
