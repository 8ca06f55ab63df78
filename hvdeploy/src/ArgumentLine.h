#pragma once

#include <string>
#include <vector>

namespace HV {

/// How a text line falls apart into arguments.
///
/// White space separates, except between two double quotes or two single quotes. Quote characters stay in the text.
/// Single quotes pair up first and hide double quotes between them; a last single quote without a partner is ignored.
enum class LineSplit {
    Done,
    Blank,             // nothing but white space
    UnbalancedQuotes,  // an odd number of double quotes that no single quotes hide
};

/// Fills `arguments` with the pieces of `line`, after clearing it.
LineSplit SplitArgumentLine(const std::string& line, std::vector<std::string>& arguments);

}  // namespace HV
