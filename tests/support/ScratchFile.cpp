#include "tests/support/ScratchFile.h"

#include <unistd.h>

#include <cstdio>

namespace {

std::string WithPlainLineEnds(const std::string& text) {
    std::string plain;
    plain.reserve(text.size());
    for (std::size_t at = 0; at < text.size(); ++at) {
        if (text[at] != '\r' || at + 1 == text.size() || text[at + 1] != '\n') {
            plain += text[at];
        }
    }
    return plain;
}

}  // namespace

std::string ReadScratchFile(int descriptor) {
    std::string text;
    char part[4096];
    lseek(descriptor, 0, SEEK_SET);
    for (auto count = read(descriptor, part, sizeof part); count > 0; count = read(descriptor, part, sizeof part)) {
        text.append(part, static_cast<std::size_t>(count));
    }
    // Whoever writes shares this position.
    lseek(descriptor, 0, SEEK_END);
    return WithPlainLineEnds(text);
}
