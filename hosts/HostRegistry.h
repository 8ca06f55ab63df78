#pragma once

#include <string>
#include <vector>

#include "system/RegistryKey.h"

/// How the detectors look into the registry: machine-wide, for reading, and without a failure that stops anything.
namespace HV {

/// Opens `path` below HKEY_LOCAL_MACHINE\SOFTWARE. Returns false, with `key` empty, when there is no such key.
[[nodiscard]] bool OpenSoftwareKey(const std::string& path, Win32RegKeyHandle& key);

/// The names of the direct subkeys of `key`, in the registry's order.
[[nodiscard]] std::vector<std::string> SubkeyNames(const Win32RegKeyHandle& key);

/// The value `name` of `key` as text; empty when it cannot be read.
[[nodiscard]] std::string ReadText(const Win32RegKeyHandle& key, const std::string& name);

}  // namespace HV
