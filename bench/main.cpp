#include <algorithm>
#include <cstdio>
#include <exception>
#include <string>
#include <vector>

#include "bench/Measure.h"
#include "hvframework/FileUtils.h"

namespace {

using HVBench::Figure;
using HVBench::Measurement;

bool Show(const Figure& figure) {
    std::printf("%-58s %8.2f   %-5s %6.2f   %s\n", figure.what.c_str(), figure.measured,
                figure.isLeast ? "least" : "most", figure.limit, figure.Holds() ? "holds" : "PASSED THE LIMIT");
    std::fflush(stdout);
    return figure.Holds();
}

/// Takes the measurements in a folder that is gone afterwards, and says whether all their figures hold.
bool Take(const Measurement& measurement, const HVBench::Place& place) {
    bool holds = true;
    std::filesystem::create_directories(place.work);
    try {
        for (const Figure& figure : measurement.take(place)) {
            holds &= Show(figure);
        }
    } catch (const std::exception& error) {
        std::printf("%s: not measured: %s\n", measurement.name.c_str(), error.what());
        holds = false;
    }
    std::filesystem::remove_all(place.work);
    return holds;
}

}  // namespace

/// hvbench PROGRAMS WORK [MEASUREMENT...], or hvbench --digest FILE for the run that is compared with md5sum.
int main(int count, char** texts) {
    const std::vector<std::string> arguments(texts, texts + count);
    if (count == 3 && arguments[1] == "--digest") {
        std::puts(HVL::FileUtils::GetFileMD5(arguments[2]).c_str());
        return 0;
    }
    if (count < 3) {
        std::fputs("usage: hvbench PROGRAMS WORK [install] [files] [packages] [removal] [md5]\n", stderr);
        return 1;
    }
    const std::vector<std::string> wanted(arguments.begin() + 3, arguments.end());
    const auto isKnown = [](const std::string& name) {
        return std::ranges::any_of(HVBench::Measurements(), [&](const auto& item) { return item.name == name; });
    };
    if (!std::ranges::all_of(wanted, isKnown)) {
        std::fputs("hvbench: there are the measurements install, files, packages, removal and md5\n", stderr);
        return 1;
    }
    bool holds = true;
    for (const Measurement& measurement : HVBench::Measurements()) {
        if (wanted.empty() || std::ranges::find(wanted, measurement.name) != wanted.end()) {
            holds &= Take(measurement, {arguments[1], std::filesystem::path(arguments[2]) / measurement.name});
        }
    }
    return holds ? 0 : 1;
}
