#pragma once

#include <string>
#include <string_view>

namespace platform {

/// A file name with every character in upper case, for the question whether two names are one to Windows. The same on
/// both targets.
///
/// Windows compares names by a table of its own, unit by unit and in no language. This one is at least as coarse: what
/// is one name to Windows is one here, and a few names that it keeps apart are one here too.
std::wstring NameInUpperCase(std::wstring_view name);

}  // namespace platform
