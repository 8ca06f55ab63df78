#include "platform/arguments.h"

#include <algorithm>

namespace platform {
namespace {

std::string AsTheMachineUnderstands(std::string word) {
    const std::size_t equals = word.find('=');
    const std::size_t start = equals == std::string::npos ? 0 : equals + 1;
    const bool isSwitch = start == 0 && word.size() <= 2;
    if (word.size() == start || word[start] != '/' || isSwitch) {
        return word;
    }
    std::replace(word.begin() + static_cast<std::ptrdiff_t>(start), word.end(), '/', '\\');
    return word.insert(start, "Z:");
}

}  // namespace

std::vector<std::string> ProgramArguments(int count, const char* const* words) {
    std::vector<std::string> arguments;
    for (int at = 1; at < count; ++at) {
        arguments.push_back(AsTheMachineUnderstands(words[at]));
    }
    return arguments;
}

}  // namespace platform
