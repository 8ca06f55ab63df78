#include "hosts/HostRegistry.h"

namespace HV {

bool OpenSoftwareKey(const std::string& path, Win32RegKeyHandle& key) {
    Win32RegKeyHandle software(HKEY_LOCAL_MACHINE, "SOFTWARE", false);
    const bool opened = software.key != nullptr && Win32RegKeyHandle::OpenPath(software.key, path, key, false);
    // It lies directly below a hive, so nobody else closes it.
    software.Close();
    return opened;
}

std::vector<std::string> SubkeyNames(const Win32RegKeyHandle& key) {
    std::vector<std::string> names;
    key.GetSubkeyNames(names);
    return names;
}

std::string ReadText(const Win32RegKeyHandle& key, const std::string& name) {
    std::string text;
    // A failure leaves the text empty, which is all that the detectors ask about.
    static_cast<void>(key.ReadValue("", name, text));
    return text;
}

}  // namespace HV
