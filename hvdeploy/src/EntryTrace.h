#pragma once

#include "hvframework/Log.h"

namespace HV {

/// The two classes whose operations write entry lines, as these lines spell them.
inline constexpr const char* kDeployClass = "HV::Deploy::";
inline constexpr const char* kDeployCLIClass = "HV::DeployCLI::";

/// The line that an operation writes at DEBUG when it is entered. `owner` is its class, with the "::" that follows.
///
/// Fixed (contracts, run): the class stands twice in the line ("HV::Deploy::HV::Deploy::DeployPackage").
inline void TraceEntry(const char* owner, const char* operation) {
    HVL_LOG(Debug, owner << owner << operation);
}

}  // namespace HV
