#pragma once

#include <string>

#include "platform/win32.h"

/// The host's name of a path whose folder is there, which Wine knows.
std::wstring NameOnHost(const std::string& path);

/// Has the host start its program `name` of `/usr/bin` with the line, and with `output`, which may be null, as its
/// standard output. False, as a failure of the test, where that is impossible. Nobody can wait for a program of the
/// host itself: whoever needs what it does looks for that.
bool StartOnHost(const std::wstring& name, std::wstring line, HANDLE output);
