#include "installer/RunningHostsText.h"

namespace HV {
namespace {

std::string JoinedNames(const std::vector<ProcessRecord>& running) {
    std::string names;
    for (std::size_t i = 0; i < running.size(); ++i) {
        names += HostDisplayName(running[i]);
        const std::size_t left = running.size() - 1 - i;
        names += left == 0 ? "" : left == 1 ? " and " : ", ";
    }
    return names;
}

}  // namespace

std::string RunningHostsText(const std::vector<ProcessRecord>& running) {
    // Fixed (contracts, wizard): only the text for a single host ends in a blank. The other one runs into the last
    // sentence ("and retryor cancel").
    const char* const request =
        running.size() == 1
            ? " is a host application for products in the installer; please quit this application and retry "
            : " are host applications for products in the installer; please quit these applications and retry";
    return JoinedNames(running) + request + "or cancel to exit the installer.";
}

}  // namespace HV
