#pragma once

#include <filesystem>
#include <functional>
#include <string>
#include <vector>

namespace HVBench {

/// One figure and the most, or the least, that it may be.
struct Figure {
    std::string what;
    double measured = 0;
    double limit = 0;
    bool isLeast = false;

    [[nodiscard]] bool Holds() const { return isLeast ? measured >= limit : measured <= limit; }
};

/// Where the programs are, and a folder that a measurement fills as it likes. Both are absolute.
struct Place {
    std::filesystem::path programs;
    std::filesystem::path work;
};

/// A group of figures that come of the same runs.
struct Measurement {
    std::string name;
    std::function<std::vector<Figure>(const Place&)> take;
};

/// All there are. Taking one throws std::runtime_error when a run of it goes wrong.
const std::vector<Measurement>& Measurements();

}  // namespace HVBench
