#include "tools/hvpack/Doubts.h"

#include <algorithm>

#include "hosts/HostRecord.h"
#include "hvframework/StringUtils.h"
#include "system/SystemDirectories.h"

namespace HVPack {
namespace {

using Lines = std::vector<std::string>;

void DoubtType(const HV::Payload& payload, Lines& doubts) {
    if (payload.type == HV::PayloadType::Unknown) {
        doubts.push_back("payload " + payload.id + " has an unknown type");
    }
}

void DoubtHosts(const HV::Payload& payload, Lines& doubts) {
    for (const std::string& host : payload.hosts) {
        if (HV::HostTypeFromAbbreviation(host) == HV::HostType::NotSet) {
            doubts.push_back("payload " + payload.id + " has the unknown host-ref \"" + host + "\"");
        }
    }
}

void DoubtSysDir(const HV::Payload& payload, Lines& doubts) {
    if (!payload.sysdir.empty() && HV::SysDirFromKeyword(payload.sysdir) == HV::SysDir::Unknown) {
        doubts.push_back("payload " + payload.id + " has the unknown sysdir \"" + payload.sysdir + "\"");
    }
}

void DoubtSubpath(const HV::Payload& payload, Lines& doubts) {
    if (std::ranges::count(HVL::StringUtils::Split(payload.subpath, '\\'), "..") > 0) {
        doubts.push_back("payload " + payload.id + " leaves its folder: \"..\" stands in its subpath");
    }
}

}  // namespace

Lines DoubtsAbout(const HV::Manifest& manifest) {
    Lines doubts;
    for (const HV::Payload& payload : manifest.payloads) {
        if (payload.MatchesOS()) {
            DoubtType(payload, doubts);
            DoubtHosts(payload, doubts);
            DoubtSysDir(payload, doubts);
            DoubtSubpath(payload, doubts);
        }
    }
    return doubts;
}

}  // namespace HVPack
