#include "package/PayloadSources.h"

#include <algorithm>

#include "hvframework/FileUtils.h"
#include "hvframework/StringUtils.h"

namespace HV {
namespace {

using HVL::FileUtils::StripTrailingSeparator;

std::string WithSlashes(std::string text) {
    std::ranges::replace(text, '\\', '/');
    return text;
}

bool HasName(const std::vector<std::string>& sorted, const std::string& name) {
    return std::ranges::binary_search(sorted, name);
}

bool HasPrefix(const std::vector<std::string>& sorted, std::string_view prefix) {
    const auto found = std::ranges::lower_bound(sorted, prefix);
    return found != sorted.end() && HVL::StringUtils::StartsWith(*found, prefix);
}

/// Only names that begin with the text before the first wildcard can match, and in a sorted list they are neighbours.
bool HasMatch(const std::vector<std::string>& sorted, std::string_view pattern) {
    const std::string_view prefix = pattern.substr(0, pattern.find_first_of("*?"));
    auto entry = std::ranges::lower_bound(sorted, prefix);
    for (; entry != sorted.end() && HVL::StringUtils::StartsWith(*entry, prefix); ++entry) {
        if (HVL::FileUtils::MatchesWildcard(pattern, *entry)) {
            return true;
        }
    }
    return false;
}

}  // namespace

PayloadSources::PayloadSources(const std::vector<std::string>& directories, const std::vector<std::string>& files) {
    directories_.reserve(directories.size());
    for (const std::string& name : directories) {
        directories_.push_back(WithSlashes(StripTrailingSeparator(name)));
    }
    files_.reserve(files.size());
    for (const std::string& name : files) {
        files_.push_back(WithSlashes(name));
    }
    std::ranges::sort(directories_);
    std::ranges::sort(files_);
}

bool PayloadSources::Has(const std::string& source) const {
    const bool recursive = HVL::StringUtils::EndsWith(source, "*");
    std::string wanted = recursive ? source.substr(0, source.size() - 1) : source;
    const bool wild = wanted.find('*') != std::string::npos;
    wanted = WithSlashes(StripTrailingSeparator(wanted));
    // Fixed (contracts, archive): folders are matched against the source with its backslashes, which no entry here has,
    // and files against the one with slashes. So a wildcard below a folder finds files alone.
    const std::string whole = StripTrailingSeparator(source);
    if (HasName(directories_, wanted) || ((recursive || wild) && HasMatch(directories_, whole))) {
        return true;
    }
    if (recursive) {
        return HasPrefix(files_, wanted);
    }
    return wild ? HasMatch(files_, wanted) : HasName(files_, wanted);
}

}  // namespace HV
