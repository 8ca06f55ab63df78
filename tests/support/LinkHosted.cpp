#include <gtest/gtest.h>

#include <stdexcept>

#include "tests/support/Link.h"
#include "tests/support/LinkFileReader.h"

LinkContent LinkOf(const Machine& machine, const std::string& path) {
    try {
        const LinkFileContent file = ReadLinkFile(machine.Content(path));
        return {file.target, file.description, file.icon, file.iconIndex};
    } catch (const std::runtime_error& error) {
        ADD_FAILURE() << path << ": " << error.what();
        return {};
    }
}
