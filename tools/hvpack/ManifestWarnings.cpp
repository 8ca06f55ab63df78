#include "tools/hvpack/ManifestWarnings.h"

#include <algorithm>

#include "hosts/HostRecord.h"
#include "hvframework/StringUtils.h"
#include "system/SystemDirectories.h"

namespace HVPack {
namespace {

using Lines = std::vector<std::string>;

void CheckType(const HV::Payload& payload, Lines& warnings) {
    if (payload.type == HV::PayloadType::Unknown) {
        warnings.push_back("payload " + payload.id + " has an unknown type");
    }
}

void CheckHosts(const HV::Payload& payload, Lines& warnings) {
    for (const std::string& host : payload.hosts) {
        if (HV::HostTypeFromAbbreviation(host) == HV::HostType::NotSet) {
            warnings.push_back("payload " + payload.id + " has the unknown host-ref \"" + host + "\"");
        }
    }
}

void CheckSysDir(const HV::Payload& payload, Lines& warnings) {
    if (!payload.sysdir.empty() && HV::SysDirFromKeyword(payload.sysdir) == HV::SysDir::Unknown) {
        warnings.push_back("payload " + payload.id + " has the unknown sysdir \"" + payload.sysdir + "\"");
    }
}

void CheckSubpath(const HV::Payload& payload, Lines& warnings) {
    if (std::ranges::count(HVL::StringUtils::Split(payload.subpath, '\\'), "..") > 0) {
        warnings.push_back("payload " + payload.id + " leaves its folder: \"..\" stands in its subpath");
    }
}

}  // namespace

Lines WarningsAbout(const HV::Manifest& manifest) {
    Lines warnings;
    for (const HV::Payload& payload : manifest.payloads) {
        if (payload.MatchesOS()) {
            CheckType(payload, warnings);
            CheckHosts(payload, warnings);
            CheckSysDir(payload, warnings);
            CheckSubpath(payload, warnings);
        }
    }
    return warnings;
}

}  // namespace HVPack
