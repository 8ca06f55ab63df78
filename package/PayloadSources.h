#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace HV {

/// What an archive holds, made ready for the question whether a payload's source is in it.
///
/// Names are compared byte by byte, with both separators taken for one. A question without wildcard costs a search in a
/// sorted list, one with wildcard a look at the entries that share the text before it.
class PayloadSources {
public:
    /// Takes the entry names as the archive spells them.
    PayloadSources(const std::vector<std::string>& directories, const std::vector<std::string>& files);

    /// Whether an entry is, or matches, the `source` of a payload.
    [[nodiscard]] bool Has(const std::string& source) const;

private:
    std::vector<std::string> directories_;  // sorted, separated by `/`, without the final separator
    std::vector<std::string> files_;        // sorted, separated by `/`
};

}  // namespace HV
