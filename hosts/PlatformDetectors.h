#pragma once

namespace HV {

class HostAppCheck;

/// Hands `check` one detector for each family of hosts, in the order in which their records are wanted.
void AddPlatformDetectors(HostAppCheck& check);

}  // namespace HV
