#pragma once

#include "platform/hosted/filesystem.h"

namespace hosted::filesystem {

/// How every operation ends that may be given an error code: the code is set, or cleared for 0; without one a failure
/// is thrown. `number` is an errno. Texts begin as those of the library do on Windows.
void Report(int number, error_code* error, const char* operation, const path& first = {}, const path& second = {});

}  // namespace hosted::filesystem
