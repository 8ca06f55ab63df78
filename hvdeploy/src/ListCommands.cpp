// The commands that print something instead of deploying.
#include <algorithm>
#include <iostream>

#include "hosts/HostAppCheck.h"
#include "hvdeploy/src/EntryTrace.h"
#include "hvdeploy/src/HVDeployCLI.h"
#include "hvdeploy/src/InstalledHistory.h"
#include "hvframework/Log.h"

namespace HV {

int DeployCLI::DoListCommand() {
    TraceEntry(kDeployCLIClass, "DoListCommand");
    const std::string wanted = GetArg("list=");
    if (wanted == "hosts") {
        return ListHosts();
    }
    if (wanted == "installed") {
        return ListInstalled();
    }
    if (wanted == "packages") {
        return ListPackages();
    }
    if (wanted == "commands") {
        return ListCommands();
    }
    return 0;
}

int DeployCLI::ListHosts() {
    TraceEntry(kDeployCLIClass, "ListHosts");
    HostAppCheck check;
    if (!check.DetectHosts()) {
        std::cout << "[]" << std::endl;
        return 0;
    }
    const std::vector<HostRecord> hosts = check.Hosts();
    HVL_LOG(Debug, "HV::HostAppCheck found " << hosts.size() << " host apps... ");
    std::cout << "[\n";
    for (std::size_t i = 0; i < hosts.size(); ++i) {
        std::cout << hosts[i].ToText() << (i + 1 < hosts.size() ? ",\n" : "\n");
    }
    std::cout << "]" << std::endl;
    return 0;
}

int DeployCLI::ListInstalled() {
    TraceEntry(kDeployCLIClass, "ListInstalled");
    std::vector<std::string> stems = ReadHistoryStems(HistoryFolder());
    std::sort(stems.begin(), stems.end());
    for (const std::string& stem : stems) {
        std::cout << stem << '\n';
    }
    std::cout.flush();
    return 0;
}

int DeployCLI::ListPackages() {
    TraceEntry(kDeployCLIClass, "ListPackages");
    HVL_LOG(Warn, "ListPackages not yet implemented.");
    return 0;
}

// Fixed (contracts, run): the text is that of the packages.
int DeployCLI::ListCommands() {
    TraceEntry(kDeployCLIClass, "ListCommands");
    HVL_LOG(Warn, "ListPackages not yet implemented.");
    return 0;
}

}  // namespace HV
