#include <algorithm>
#include <array>
#include <cstring>
#include <string>
#include <string_view>

#include "platform/hosted/machine.h"
#include "platform/hosted/win32.h"

namespace {

using hosted::Machine;
using hosted::Registry;
using hosted::RegistryValue;

Registry& CurrentRegistry() {
    return Machine::Current().GetRegistry();
}

Registry::Handle ToHandle(HKEY key) {
    return reinterpret_cast<Registry::Handle>(key);
}

std::string_view OrEmpty(LPCSTR text) {
    return text != nullptr ? std::string_view(text) : std::string_view();
}

/// Closes a key that was opened for one call.
class PassingKey {
public:
    explicit PassingKey(HKEY key) : key_(key) {}
    ~PassingKey() { RegCloseKey(key_); }
    PassingKey(const PassingKey&) = delete;
    PassingKey& operator=(const PassingKey&) = delete;

private:
    HKEY key_;
};

bool IsText(DWORD type) {
    return type == REG_SZ || type == REG_EXPAND_SZ || type == REG_MULTI_SZ;
}

/// A list of strings ends in an empty one, so that it takes two terminators unless it is empty itself.
void Terminate(RegistryValue& value) {
    if (value.data.empty() || value.data.back() != '\0') {
        value.data += '\0';
    }
    if (value.type == REG_MULTI_SZ && value.data.size() > 1 && value.data[value.data.size() - 2] != '\0') {
        value.data += '\0';
    }
}

/// As a caller is given it: text terminated, and variables in it replaced.
void Present(RegistryValue& value, DWORD flags) {
    if (value.type == REG_EXPAND_SZ && (flags & RRF_NOEXPAND) == 0) {
        value.type = REG_SZ;
        value.data = Machine::Current().GetEnvironment().Expand(value.data.c_str()) + '\0';
    } else if (IsText(value.type)) {
        Terminate(value);
    }
}

bool IsAllowed(DWORD type, DWORD flags) {
    if ((flags & RRF_RT_ANY) == RRF_RT_ANY) {
        return true;
    }
    struct Allowed {
        DWORD type;
        DWORD flag;
    };
    constexpr std::array<Allowed, 7> all = {{{REG_NONE, RRF_RT_REG_NONE},
                                             {REG_SZ, RRF_RT_REG_SZ},
                                             {REG_EXPAND_SZ, RRF_RT_REG_EXPAND_SZ},
                                             {REG_BINARY, RRF_RT_REG_BINARY},
                                             {REG_DWORD, RRF_RT_REG_DWORD},
                                             {REG_MULTI_SZ, RRF_RT_REG_MULTI_SZ},
                                             {REG_QWORD, RRF_RT_REG_QWORD}}};
    return std::any_of(all.begin(), all.end(),
                       [&](const Allowed& allowed) { return allowed.type == type && (flags & allowed.flag) != 0; });
}

LSTATUS GiveData(const RegistryValue& value, PVOID data, LPDWORD dataSize) {
    if (dataSize == nullptr) {
        return ERROR_SUCCESS;
    }
    const auto needed = static_cast<DWORD>(value.data.size());
    const bool fits = data == nullptr || *dataSize >= needed;
    if (data != nullptr && fits) {
        std::memcpy(data, value.data.data(), value.data.size());
    }
    *dataSize = needed;
    return fits ? ERROR_SUCCESS : ERROR_MORE_DATA;
}

LSTATUS GetOwnValue(HKEY key, LPCSTR name, DWORD flags, LPDWORD type, PVOID data, LPDWORD dataSize) {
    RegistryValue value;
    if (const LSTATUS error = CurrentRegistry().GetValue(ToHandle(key), OrEmpty(name), value)) {
        return error;
    }
    Present(value, flags);
    if (type != nullptr) {
        *type = value.type;
    }
    return IsAllowed(value.type, flags) ? GiveData(value, data, dataSize) : ERROR_UNSUPPORTED_TYPE;
}

LSTATUS GetValueBelow(HKEY key, LPCSTR subKey, LPCSTR name, DWORD flags, LPDWORD type, PVOID data, LPDWORD dataSize) {
    if (OrEmpty(subKey).empty()) {
        return GetOwnValue(key, name, flags, type, data, dataSize);
    }
    HKEY opened = nullptr;
    if (const LSTATUS error = RegOpenKeyExA(key, subKey, 0, KEY_QUERY_VALUE, &opened)) {
        return error;
    }
    const PassingKey passing(opened);
    return GetOwnValue(opened, name, flags, type, data, dataSize);
}

}  // namespace

LSTATUS RegCreateKeyExA(HKEY key, LPCSTR subKey, DWORD, LPSTR, DWORD, REGSAM access, LPSECURITY_ATTRIBUTES,
                        PHKEY result, LPDWORD disposition) {
    Registry::Handle handle = 0;
    bool created = false;
    const LSTATUS error = CurrentRegistry().CreateKey(ToHandle(key), OrEmpty(subKey), access, handle, created);
    if (error != ERROR_SUCCESS) {
        return error;
    }
    *result = reinterpret_cast<HKEY>(handle);
    if (disposition != nullptr) {
        *disposition = created ? REG_CREATED_NEW_KEY : REG_OPENED_EXISTING_KEY;
    }
    return ERROR_SUCCESS;
}

LSTATUS RegOpenKeyExA(HKEY key, LPCSTR subKey, DWORD, REGSAM access, PHKEY result) {
    Registry::Handle handle = 0;
    const LSTATUS error = CurrentRegistry().OpenKey(ToHandle(key), OrEmpty(subKey), access, handle);
    *result = reinterpret_cast<HKEY>(handle);
    return error;
}

LSTATUS RegCloseKey(HKEY key) {
    return CurrentRegistry().CloseKey(ToHandle(key));
}

LSTATUS RegEnumKeyExA(HKEY key, DWORD index, LPSTR name, LPDWORD nameLength, LPDWORD, LPSTR, LPDWORD, PFILETIME) {
    std::string found;
    if (const LSTATUS error = CurrentRegistry().SubKeyName(ToHandle(key), index, found)) {
        return error;
    }
    if (found.size() >= *nameLength) {
        return ERROR_MORE_DATA;
    }
    std::memcpy(name, found.c_str(), found.size() + 1);
    *nameLength = static_cast<DWORD>(found.size());
    return ERROR_SUCCESS;
}

LSTATUS RegGetValueA(HKEY key, LPCSTR subKey, LPCSTR name, DWORD flags, LPDWORD type, PVOID data, LPDWORD dataSize) {
    const bool expands = (flags & RRF_RT_REG_EXPAND_SZ) != 0 && (flags & RRF_NOEXPAND) == 0;
    if ((data != nullptr && dataSize == nullptr) || (expands && (flags & RRF_RT_ANY) != RRF_RT_ANY)) {
        return ERROR_INVALID_PARAMETER;
    }
    const DWORD room = dataSize != nullptr ? *dataSize : 0;
    const LSTATUS error = GetValueBelow(key, subKey, name, flags, type, data, dataSize);
    if (error != ERROR_SUCCESS && data != nullptr && (flags & RRF_ZEROONFAILURE) != 0) {
        std::memset(data, 0, room);
    }
    return error;
}

LSTATUS RegSetValueExA(HKEY key, LPCSTR name, DWORD, DWORD type, const BYTE* data, DWORD dataSize) {
    if (data == nullptr && dataSize > 0) {
        return ERROR_INVALID_PARAMETER;
    }
    std::string bytes;
    if (dataSize > 0) {
        bytes.assign(reinterpret_cast<const char*>(data), dataSize);
    }
    return CurrentRegistry().SetValue(ToHandle(key), OrEmpty(name), {type, std::move(bytes)});
}

LSTATUS RegSetKeyValueA(HKEY key, LPCSTR subKey, LPCSTR name, DWORD type, LPCVOID data, DWORD dataSize) {
    const auto* bytes = static_cast<const BYTE*>(data);
    if (OrEmpty(subKey).empty()) {
        return RegSetValueExA(key, name, 0, type, bytes, dataSize);
    }
    HKEY opened = nullptr;
    if (const LSTATUS error = RegCreateKeyExA(key, subKey, 0, nullptr, REG_OPTION_NON_VOLATILE, KEY_SET_VALUE, nullptr,
                                              &opened, nullptr)) {
        return error;
    }
    const PassingKey passing(opened);
    return RegSetValueExA(opened, name, 0, type, bytes, dataSize);
}

LSTATUS RegDeleteTreeA(HKEY key, LPCSTR subKey) {
    return CurrentRegistry().DeleteTree(ToHandle(key), OrEmpty(subKey));
}
