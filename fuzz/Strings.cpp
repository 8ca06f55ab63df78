// The table of the wizard's texts. Before the last zero byte stands the table, after it a replacement for a token.
#include "fuzz/Fuzzing.h"
#include "system/XMLStringsResource.h"

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text = fuzzing::Text(data, size);
    const std::size_t end = text.rfind('\0');
    HV::XMLStringsResource strings;
    static_cast<void>(strings.Parse(text.substr(0, end)));
    strings.ReplaceAll("{", end == std::string::npos ? "product" : text.substr(end + 1));
    static_cast<void>(strings.GetString("title"));
    return 0;
}
