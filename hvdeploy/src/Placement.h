#pragma once

#include <string>
#include <vector>

#include "hosts/HostAppCheck.h"
#include "hvdeploy/src/DeployRollback.h"
#include "hvdeploy/src/EngineResult.h"
#include "package/Package.h"
#include "platform/filesystem.h"

namespace HV {

/// What became of one payload: kPlaced, kNothingDone or a failure, and what was placed, in the order of copying. A
/// failure may have placed some.
struct Placed {
    EngineResult result = kNothingDone;
    std::vector<std::string> files;
};

/// One payload of one extracted package: into which folders its files go, and the copying itself.
///
/// What is in the way goes to the stash before the new item is copied, and each placed item is reported to it. Detects
/// the machine's hosts when a payload first asks for one. Throws what a detector throws; what the copying throws is
/// logged here. Not thread-safe: the deployment's thread owns it.
class Placement {
public:
    /// Neither is owned, and both must outlive this object.
    Placement(HostAppCheck& hostCheck, DeployRollback& rollback) : hostCheck_(hostCheck), rollback_(rollback) {}

    /// Verbose, each payload is named on standard output.
    void SetVerbose(bool on) { verbose_ = on; }

    [[nodiscard]] Placed DeployPayload(const Payload& payload, const Package& package);

private:
    Placed DeployAppPayload(const Payload& payload, const Package& package);
    Placed DeploySysDirPayload(const Payload& payload, const Package& package);
    Placed DeployHostPayload(const Payload& payload, const Package& package);
    Placed DeployPayloadToDirectory(Payload payload, const Package& package, const fs::path& destDir);
    void CopyItems(const Payload& payload, const Package& package, const fs::path& destDir, Placed& placed);
    bool CopyItem(const PayloadPathPair& item);
    bool RequiredHostIsPresent(const Payload& payload);

    HostAppCheck& hostCheck_;
    DeployRollback& rollback_;
    bool verbose_ = false;
};

}  // namespace HV
