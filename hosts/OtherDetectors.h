#pragma once

#include <string>
#include <vector>

#include "hosts/HostAppDetector.h"

/// The hosts of other vendors, whose plug-ins mostly go to the one OFX folder of the system. Each detector reads the
/// machine-wide registry; a value that cannot be read leaves its field empty and stops nothing. What goes wrong
/// is not logged, but for a folder that cannot be listed.
namespace HV {

/// EDIUS: one record for each subkey that has an installation with a folder. Says on standard output which registry
/// handles it works with.
class EdiusDetector_Win : public HostAppDetector {
public:
    bool Run(std::vector<HostRecord>& hosts) override;
};

/// HitFilm: one record for each FXHOME product whose name begins with "HitFilm", with the version of its executable.
class HitFilmDetector_Win : public HostAppDetector {
public:
    bool Run(std::vector<HostRecord>& hosts) override;
};

/// Media Composer: one record at most, for which both the application's key and that of its plug-ins must exist.
class MediaComposerDetector_Win : public HostAppDetector {
public:
    bool Run(std::vector<HostRecord>& hosts) override;
};

/// DaVinci Resolve: one record at most, at the place where its own installer puts it.
class ResolveDetector_Win : public HostAppDetector {
public:
    bool Run(std::vector<HostRecord>& hosts) override;
};

/// Vegas Pro: one record for each version that names its folder; the executable is the first "vegas*.exe" in there.
/// It stays empty, with a line in the log, where the folder cannot be listed.
class VegasDetector_Win : public HostAppDetector {
public:
    bool Run(std::vector<HostRecord>& hosts) override;

    /// The executable out of a search's answer: the first of `files`, or an empty text when the search found none.
    /// Throws std::logic_error when the search contradicts itself, by a match without a file.
    [[nodiscard]] static std::string FirstMatch(bool matched, const std::vector<std::string>& files);
};

}  // namespace HV
