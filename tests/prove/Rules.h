#pragma once

#include <string>
#include <vector>

#include "tests/prove/Machines.h"

/// What a machine may be after a run: as it was, whole, or what a rule of the engine says.
///
/// A rule explains a file and not a run: what the log, the fault or the signal gives as the reason has to name the very
/// item whose file is not as it should be. A file that nothing explains is a violation.
namespace Prove {

enum class Kind { AsBefore, Whole, ByRule, Violation };

struct Verdict {
    Kind kind = Kind::Violation;
    std::vector<std::string> rules;    // by which it is so, each once
    std::vector<std::string> details;  // of a violation, a line for each file
};

[[nodiscard]] Verdict Judge(const Release& release, const Fault& fault, const Outcome& outcome);

/// Whether the run showed no sign of trouble.
[[nodiscard]] bool IsQuiet(const Outcome& outcome);

}  // namespace Prove
