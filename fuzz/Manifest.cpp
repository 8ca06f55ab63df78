// The text of a manifest, read into a fresh record and into one that has been used, which must not differ in payloads.
#include "package/Manifest.h"

#include "fuzz/Fuzzing.h"

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text = fuzzing::Text(data, size);
    HV::Manifest manifest;
    const bool read = manifest.Parse(text);
    for (const HV::Payload& payload : manifest.payloads) {
        static_cast<void>(payload.MatchesOS());
        static_cast<void>(payload.HasWildcardSource());
    }
    HV::Manifest used(manifest);
    fuzzing::Demand(used.Parse(text) == read, "a manifest is read alike twice");
    fuzzing::Demand(used.payloads.size() == manifest.payloads.size(), "a second reading inherits no payloads");
    return 0;
}
