#pragma once

#include <string>

#include "hvframework/ProductData.h"

/// What the tests of removal know by heart: the texts of a script as they lie on disk, and the suite that they install.

inline constexpr const char* kScriptPath = R"(C:\ProgramData\Halvorn\uninstall\uninstall-com.halvorn.tessaly_v3.1.bat)";

/// The header, the line end after it and an empty line.
inline const std::string kHeaderOnDisk =
    "@echo off\rSET SCRIPT_NAME%0\rSET SCRIPT_DIR=%~dp0\rSET SCRIPT_PATH=%SCRIPT_DIR%%SCRIPT_NAME%\r\r\n\r\n";

inline std::string EchoOnDisk(const std::string& name, const std::string& version) {
    return "echo Uninstalling " + name + " v" + version + "\r\n\r\n";
}

inline std::string DeleteOnDisk(const std::string& path) {
    return "CALL DEL /S /F /Q \"" + path + "\"\r\n";
}

/// The line that removes the entry, between two empty ones.
inline std::string RegistryOnDisk(const std::string& entry) {
    return "\r\nCALL reg delete \"HKEY_LOCAL_MACHINE\\SOFTWARE\\Microsoft\\Windows\\CurrentVersion\\Uninstall\\" +
           entry + "\" /f\r\n\r\n";
}

inline HVL::ProductData Tessaly() {
    HVL::ProductData product;
    product.SetValue("identifier", "com.halvorn.tessaly");
    product.SetValue("version", "3.1");
    product.SetValue("display_name", "Tessaly Suite");
    return product;
}

/// The suite file that says the same.
inline constexpr const char* kTessalyFile =
    R"({"identifier": "com.halvorn.tessaly", "version": "3.1", "product_type": "0", "display_name": "Tessaly Suite"})";
