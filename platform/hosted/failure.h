#pragma once

#include <string>

#include "platform/hosted/win32.h"

namespace hosted {

/// What Windows says where the host says an errno: the library of files by its own code, the runtime by its errno, and
/// the system by its last error.
struct Failure {
    int library = 0;
    int runtime = 0;
    LONG system = 0;
};

/// The one table of it. ENAMETOOLONG is what the host says to Machine's refused names, EBUSY what this room says of a
/// file that somebody has open.
[[nodiscard]] Failure FailureOf(int number);

/// Ends the process with exit status 1 and the message on standard error: the machine cannot be what it promises.
[[noreturn]] void EndWithMessage(const std::string& message);

}  // namespace hosted
