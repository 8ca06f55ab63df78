#pragma once

#include <cstdint>
#include <string>

/// What the system knows of one installed host application, and the abbreviations by which manifests name hosts.
namespace HV {

/// The families of hosts. Not every family has a detector on this platform.
enum class HostType : std::int32_t {
    NotSet = -1,
    AfterEffects = 0,
    AfterEffectsMediaCore = 1,  // a combined reference, never the type of a record
    Premiere = 2,
    AfterEffectsAndPremiere = 3,  // a combined reference, never the type of a record
    Edius = 4,
    FinalCutProX = 5,
    Ofx = 6,
    HitFilm = 7,
    MediaComposer = 8,
    Motion = 9,
    Resolve = 10,
    Vegas = 11,
};

/// The type that an abbreviation such as "aftereffects" names, compared exactly; NotSet for any other text.
HostType HostTypeFromAbbreviation(const std::string& abbreviation);

/// One detected version of one host. A plain value; a field that its detector does not fill stays empty.
struct HostRecord {
    HostType hostType = HostType::NotSet;
    std::string hostAbbreviation;
    std::string hostDisplayName;
    std::string hostVersion;     // as found, not normalised
    std::string hostAppPath;     // the host's executable
    std::string hostPluginPath;  // the host's own plug-ins
    std::string hostSharedPath;  // shared with related hosts: MediaCore, or the OFX folder
    std::string hostPresetsPath;
    std::string hostScriptsPath;
    std::string hostDocsPath;
    std::string hostData;  // free text

    /// The fields that are not empty, one a line, in the shape of a JSON object. Values go out as they stand.
    std::string ToText() const;
};

}  // namespace HV
