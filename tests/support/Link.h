#pragma once

#include <string>

#include "tests/support/Machine.h"

/// What a shell link says to who opens it. Texts are UTF-8.
struct LinkContent {
    std::string target;
    std::string description;
    std::string icon;
    int iconIndex = 0;
};

/// Reads the link at `path`: on Windows through the shell itself, hosted from the file's bytes (see LinkFileReader.h).
/// A link that cannot be read fails the test.
LinkContent LinkOf(const Machine& machine, const std::string& path);
