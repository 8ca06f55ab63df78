// Manifests of which it is known whether they are read, and with how many payloads: honest ones of all sizes, and those
// that would take the XML library minutes, gigabytes or all of its stack. The input chooses shape and excess.
#include <string_view>

#include "fuzz/Choices.h"
#include "fuzz/Fuzzing.h"
#include "package/Manifest.h"

namespace {

using fuzzing::Choices;

std::string Repeated(std::string_view text, std::size_t times) {
    std::string all;
    all.reserve(text.size() * times);
    while (times-- > 0) {
        all += text;
    }
    return all;
}

std::string Nested(std::size_t depth) {
    return Repeated("<a>", depth) + Repeated("</a>", depth);
}

std::string Attributes(std::size_t count) {
    std::string attributes;
    for (std::size_t number = 0; number < count; ++number) {
        attributes += " a" + std::to_string(number) + "='" + std::string(number % 3, 'v') + "'";
    }
    return attributes;
}

/// What stands inside the root element before the payloads, and whether a manifest with it is read.
struct Preface {
    std::string xml;
    bool isRead;
};

/// The root is one element above; 199 are left of 200.
Preface ChoosePreface(Choices& choices) {
    const std::size_t few = choices.Next(256);
    switch (choices.Next(8)) {
        case 1:
            return {"<x" + Attributes(few) + "/>", true};
        case 2:
            return {"<x" + Attributes(257 + few * 100) + "/>", false};
        case 3:
            return {Nested(few % 200), true};
        case 4:
            return {Nested(200 + few * 50), false};
        case 5:
            return {Repeated("<x/>", few * 40), true};
        case 6:
            return {Repeated("<x/>", 1050000 + few), false};
        case 7:
            return {"<!--" + std::string(few, '<') + "--><![CDATA[" + Repeated("<a>", few) + "]]>", true};
        default:
            return {"", true};
    }
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Choices choices(data, size);
    const Preface preface = ChoosePreface(choices);
    const std::size_t payloads = choices.Next(40);
    const std::string text = "<hvmanifest version='1' product='a' productversion='1'>" + preface.xml + "<contents>" +
                             Repeated("<payload id='p' type='plugin'><source>s</source></payload>", payloads) +
                             "</contents></hvmanifest>";
    HV::Manifest manifest;
    fuzzing::Demand(manifest.Parse(text) == preface.isRead, "a manifest is read when it is of a sane size");
    fuzzing::Demand(manifest.payloads.size() == (preface.isRead ? payloads : 0), "with all its payloads, or none");
    return 0;
}
