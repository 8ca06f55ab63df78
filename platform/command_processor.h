#pragma once

/// What runs the scripts of packages: the system's own command processor, whatever the user's environment says.
namespace platform {

/// Makes the system's command processor the one that `_popen` starts, and lets it look for programs along the search
/// path alone: the current folder, which may be the one that a release was downloaded to, is none of the places. Both
/// are variables of the environment ("COMSPEC" and "NoDefaultCurrentDirectoryInExePath"), so what a script starts has
/// them too. For the start of a program, ahead of other threads. Throws std::runtime_error when the system does not
/// tell its folder.
void UseSystemCommandProcessor();

/// Makes the system's folder the current one: nobody but an administrator writes there. Throws std::runtime_error when
/// the system does not let it be.
void EnterSystemFolder();

}  // namespace platform
