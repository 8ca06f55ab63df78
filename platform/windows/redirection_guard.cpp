#include "platform/redirection_guard.h"

#include "platform/windows/trust.h"

namespace platform {

// Looked up, because systems without it are served too. Number and layout are those that the system documents as
// ProcessRedirectionTrustPolicy and PROCESS_MITIGATION_REDIRECTION_TRUST_POLICY.
bool RefusePlantedJunctions() {
    using Setter = BOOL(WINAPI*)(int policy, PVOID value, SIZE_T size);
    constexpr int kRedirectionTrust = 16;
    DWORD enforce = 1;
    const HMODULE kernel = GetModuleHandleW(L"kernel32.dll");
    const auto set =
        reinterpret_cast<Setter>(reinterpret_cast<void*>(GetProcAddress(kernel, "SetProcessMitigationPolicy")));
    return set != nullptr && IsAdministrator() && set(kRedirectionTrust, &enforce, sizeof enforce);
}

}  // namespace platform
