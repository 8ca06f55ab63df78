#include "hvdeploy/src/ArgumentLine.h"

#include <algorithm>
#include <string_view>

#include "hvframework/StringUtils.h"

namespace HV {
namespace {

using HVL::StringUtils::kWhiteSpace;

using Positions = std::vector<std::size_t>;

// Strikes out of `positions` all that lie strictly between the first and the second of `quotes`, the third and the
// fourth, and so on. Both lists ascend, so one walk over each is enough.
void StrikeOutBetween(const Positions& quotes, Positions& positions) {
    std::size_t pair = 0;
    const auto isHidden = [&](std::size_t position) {
        while (pair + 1 < quotes.size() && quotes[pair + 1] < position) {
            pair += 2;
        }
        return pair + 1 < quotes.size() && quotes[pair] < position;
    };
    positions.erase(std::remove_if(positions.begin(), positions.end(), isHidden), positions.end());
}

void CutAt(const std::string& line, std::size_t start, const Positions& separators,
           std::vector<std::string>& arguments) {
    const auto addPiece = [&](std::size_t from, std::size_t to) {
        if (to > from) {
            arguments.push_back(line.substr(from, to - from));
        }
    };
    for (const std::size_t separator : separators) {
        addPiece(start, separator);
        start = separator + 1;
    }
    addPiece(start, line.size());
}

}  // namespace

LineSplit SplitArgumentLine(const std::string& line, std::vector<std::string>& arguments) {
    arguments.clear();
    const std::size_t start = line.find_first_not_of(kWhiteSpace);
    if (start == std::string::npos) {
        return LineSplit::Blank;
    }
    Positions spaces;
    Positions doubleQuotes;
    Positions singleQuotes;
    for (std::size_t i = start; i < line.size(); ++i) {
        if (kWhiteSpace.find(line[i]) != std::string_view::npos) {
            spaces.push_back(i);
        } else if (line[i] == '"') {
            doubleQuotes.push_back(i);
        } else if (line[i] == '\'') {
            singleQuotes.push_back(i);
        }
    }
    // Fixed (contracts, argument line): single quotes go first, with no regard to double quotes. An apostrophe inside a
    // double-quoted value pairs with the next apostrophe of the line.
    StrikeOutBetween(singleQuotes, spaces);
    StrikeOutBetween(singleQuotes, doubleQuotes);
    if (doubleQuotes.size() % 2 != 0) {
        return LineSplit::UnbalancedQuotes;
    }
    StrikeOutBetween(doubleQuotes, spaces);
    CutAt(line, start, spaces, arguments);
    return LineSplit::Done;
}

}  // namespace HV
