#include "hosts/HostRecord.h"

#include <array>
#include <utility>

namespace HV {
namespace {

using NamedHost = std::pair<const char*, HostType>;

constexpr std::array<NamedHost, 12> kHosts{{
    {"aftereffects", HostType::AfterEffects},
    {"aftereffectsMC", HostType::AfterEffectsMediaCore},
    {"premiere", HostType::Premiere},
    {"aftereffects+premiere", HostType::AfterEffectsAndPremiere},
    {"edius", HostType::Edius},
    {"finalcutprox", HostType::FinalCutProX},
    {"ofx", HostType::Ofx},
    {"hitfilm", HostType::HitFilm},
    {"mediacomposer", HostType::MediaComposer},
    {"motion", HostType::Motion},
    {"resolve", HostType::Resolve},
    {"vegas", HostType::Vegas},
}};

}  // namespace

HostType HostTypeFromAbbreviation(const std::string& abbreviation) {
    for (const auto& [name, type] : kHosts) {
        if (abbreviation == name) {
            return type;
        }
    }
    return HostType::NotSet;
}

// Fixed (contracts, hosts): no value is escaped, so a Windows path shows single backslashes and the text is JSON in
// shape only.
std::string HostRecord::ToText() const {
    const std::array<std::pair<const char*, const std::string&>, 10> fields{{
        {"hostAbbreviation", hostAbbreviation},
        {"hostDisplayName", hostDisplayName},
        {"hostVersion", hostVersion},
        {"hostAppPath", hostAppPath},
        {"hostPluginPath", hostPluginPath},
        {"hostSharedPath", hostSharedPath},
        {"hostPresetsPath", hostPresetsPath},
        {"hostScriptsPath", hostScriptsPath},
        {"hostDocsPath", hostDocsPath},
        {"hostData", hostData},
    }};
    std::string text = "{";
    for (const auto& [key, value] : fields) {
        if (!value.empty()) {
            text += "\n  \"" + std::string(key) + "\": \"" + value + "\",";
        }
    }
    // The comma after the last value is always the last of the text, whatever the values hold.
    if (const auto lastComma = text.rfind(','); lastComma != std::string::npos) {
        text[lastComma] = '\n';
    }
    return text + "}";
}

}  // namespace HV
