#pragma once

#include <string>

#include "platform/windows/win32.h"

namespace platform {

/// Whether this program has the rights of an administrator now, and not only an account that could have them.
[[nodiscard]] bool IsAdministrator();

/// The account that this program runs as, in the text form of accounts; empty when the system does not tell.
[[nodiscard]] std::wstring OwnAccount();

/// The owner of the open file or folder, in the same form; empty when there is none.
[[nodiscard]] std::wstring OwnerOf(HANDLE item);

/// Whether the open file or folder is the administrators', the system's or TrustedInstaller's, or this account's own
/// while it has no administrator's rights: an elevated program does not trust what the same user may do un-elevated.
[[nodiscard]] bool HasTrustedOwner(HANDLE item);

}  // namespace platform
