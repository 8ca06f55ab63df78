#pragma once

#include <string>
#include <vector>

#include "hosts/HostAppCheck.h"
#include "hvdeploy/src/DeployRollback.h"
#include "hvdeploy/src/EngineResult.h"
#include "package/Package.h"
#include "platform/filesystem.h"

namespace HV {

/// What became of an attempt to place something: its result, and the places of the items that are there now, in the
/// order of copying. Items that were placed before a failure are among them.
struct Placed {
    EngineResult result = kNothingDone;
    std::vector<std::string> files;
    bool leftOut = false;  // the system refused to copy something, which the result does not say
};

/// Puts the files of payloads into the folders where they belong: those of hosts, of the system, or of applications.
///
/// What is in the way goes to the stash first, and what is placed is reported to it; taking back is the engine's
/// decision. Does not own what it is made with. Used by the thread of the run alone.
class Placement {
public:
    Placement(HostAppCheck& hosts, DeployRollback& rollback) : hosts_(hosts), rollback_(rollback) {}

    /// Places one payload of `package`, which is unpacked. Throws what a detector throws, and what the filesystem
    /// library throws outside of the copying.
    [[nodiscard]] Placed Place(const Payload& payload, const Package& package);

private:
    Placed DeployAppPayload(const Payload& payload, const Package& package);
    Placed DeploySysDirPayload(const Payload& payload, const Package& package);
    Placed DeployHostPayload(const Payload& payload, const Package& package);
    bool RequiredHostIsPresent(const Payload& payload);
    Placed DeployPayloadToDirectory(const Payload& payload, const Package& package, const fs::path& destDir);
    void CopyItems(const Payload& payload, const Package& package, const fs::path& destDir, Placed& placed);
    bool CopyItem(const PayloadPathPair& item);

    HostAppCheck& hosts_;
    DeployRollback& rollback_;
};

}  // namespace HV
