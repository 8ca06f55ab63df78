// What the model knows of running programs: which process stands for which host.
#include <algorithm>
#include <string>
#include <vector>

#include "installer/InstallerModel.h"

namespace HV {
namespace {

/// The hosts of all packages, each once, in the order in which they are first named.
std::vector<std::string> DistinctHostRefs(const std::vector<PackageInfo>& packages) {
    std::vector<std::string> hostRefs;
    for (const PackageInfo& package : packages) {
        for (const std::string& hostRef : package.hostRefs) {
            if (std::ranges::find(hostRefs, hostRef) == hostRefs.end()) {
                hostRefs.push_back(hostRef);
            }
        }
    }
    return hostRefs;
}

/// One search for running hosts: appends what each host's question finds.
class HostSearch {
public:
    HostSearch(const Processes& processes, std::vector<ProcessRecord>& out) : processes_(processes), out_(out) {}

    // Fixed (contracts, running programs): each process more that is found is an installation more that does not start.
    // "EDIUS" is compared with a whole file name, which EDIUS.exe is not. "n/a" is the name of no process. HitFilm has
    // no name of its own, so its question finds the processes whose name cannot be read. Nobody is asked to quit Vegas,
    // or whatever else reads the OFX folder.
    void Ask(HostType host) {
        switch (host) {
            case HostType::AfterEffects:
            case HostType::AfterEffectsMediaCore:
                return AskForAfterEffects();
            case HostType::Premiere:
                return AskForPremiere();
            case HostType::AfterEffectsAndPremiere:
                AskForAfterEffects();
                return AskForPremiere();
            case HostType::Edius:
                return AskByName("EDIUS");
            case HostType::FinalCutProX:
            case HostType::Motion:
                return AskByName("n/a");
            case HostType::HitFilm:
                return AskByName("");
            case HostType::MediaComposer:
                return AskByName("AvidMediaComposer.exe");
            case HostType::Resolve:
                return AskByName("Resolve.exe");
            case HostType::Ofx:
            case HostType::Vegas:
            case HostType::NotSet:
                return;
        }
    }

private:
    // Several host references mean these two, so they are asked for once in a search, whatever that finds.
    void AskForAfterEffects() {
        if (!askedForAfterEffects_) {
            askedForAfterEffects_ = true;
            AskByName("AfterFX.exe");
        }
    }

    // By its path alone: the name of its folder counts as well.
    void AskForPremiere() {
        if (!askedForPremiere_) {
            askedForPremiere_ = true;
            std::vector<ProcessRecord> found;
            processes_.FindByPath("Adobe Premiere Pro.exe", found);
            Append(found);
        }
    }

    void AskByName(const std::string& name) {
        std::vector<ProcessRecord> found;
        processes_.FindByName(name, found);
        Append(found);
    }

    void Append(const std::vector<ProcessRecord>& found) { out_.insert(out_.end(), found.begin(), found.end()); }

    const Processes& processes_;
    std::vector<ProcessRecord>& out_;
    bool askedForAfterEffects_ = false;
    bool askedForPremiere_ = false;
};

}  // namespace

// A list of processes that cannot be had is an empty one, here and below: the wizard does not refuse to install because
// it cannot look.
bool InstallerModel::ManagerIsRunning() {
    processes.Refresh();
    std::vector<ProcessRecord> found;
    return processes.FindByName("Halvorn Application Manager.exe", found);
}

bool InstallerModel::FindRunningHosts(std::vector<ProcessRecord>& out) {
    out.clear();
    const std::vector<std::string> hostRefs = DistinctHostRefs(packages);
    if (hostRefs.empty()) {
        return false;
    }
    processes.Refresh();
    HostSearch search(processes, out);
    for (const std::string& hostRef : hostRefs) {
        search.Ask(HostTypeFromAbbreviation(hostRef));
    }
    return !out.empty();
}

}  // namespace HV
