#include "bench/Measure.h"

#include <algorithm>
#include <chrono>
#include <cstddef>
#include <cstdlib>
#include <fstream>
#include <stdexcept>

#include "bench/Process.h"
#include "bench/SuiteMaker.h"
#include "hvdeploy/src/UninstallScripts.h"

namespace HVBench {
namespace {

namespace disk = std::filesystem;

constexpr std::size_t kMegabyte = std::size_t{1} << 20;

double Median(std::vector<double> values) {
    std::ranges::sort(values);
    return values[values.size() / 2];
}

std::string Program(const Place& place, const char* name) {
    return (place.programs / name).string();
}

/// A new folder for a machine. Those of earlier runs stay until the end: after a large removal the file system is slow
/// to give out what it has just taken back, and the run that is measured would pay for it.
std::string Fresh(const Place& place) {
    static int number = 0;
    const disk::path folder = place.work / ("machine-" + std::to_string(++number));
    disk::create_directories(folder);
    return folder.string();
}

/// The arguments of an installation as users start it: with a log, at the level that holds without a word.
std::vector<std::string> InstallCommand(const Place& place, const disk::path& packages) {
    return {Program(place, "hvdeploy"), "dir=" + packages.string(), "log=C:\\ProgramData\\Halvorn\\Logs\\bench.log"};
}

// --- The same work by standard tools

/// For each package but the one that fails: unpack it to a folder of its own, copy the payload to its place, remove the
/// folder.
constexpr const char* kInstallByTools =
    R"(set -e; n=0; for p in "$1"/com.*.hvpkg; do n=$((n+1)); mkdir -p "$2/temp" "$2/target/$n"; )"
    R"(unzip -q "$p" -d "$2/temp/$n"; cp -r "$2/temp/$n/payload" "$2/temp/$n/history" "$2/target/$n"; )"
    R"(rm -r "$2/temp/$n"; done)";

/// What is there is moved aside before it is replaced; at the end the new goes and the old comes back.
constexpr const char* kReplaceAndPutBackByTools =
    R"(set -e; n=0; mkdir "$2/stash"; for p in "$1"/com.*.hvpkg; do n=$((n+1)); mkdir "$2/stash/$n"; )"
    R"(unzip -q "$p" -d "$2/temp/$n"; mv "$2/target/$n/payload" "$2/target/$n/history" "$2/stash/$n"; )"
    R"(cp -r "$2/temp/$n/payload" "$2/temp/$n/history" "$2/target/$n"; rm -r "$2/temp/$n"; done; )"
    R"(for f in "$2/stash"/*; do t="$2/target/${f##*/}"; rm -r "$t/payload" "$t/history"; )"
    R"(mv "$f/payload" "$f/history" "$t"; done; rm -r "$2/stash")";

/// Runs a script with the packages, in a folder of its own.
Run RunTools(const char* script, const disk::path& packages, const std::string& folder) {
    return RunProgram({"sh", "-c", script, "sh", packages.string(), folder}, folder);
}

// --- A suite against the same work by standard tools

constexpr int kInstallPairs = 5;
constexpr SuiteShape kSuite{14, 200, 8 * kMegabyte, 48 * 1024, false, 7};

std::vector<Figure> TakeInstall(const Place& place) {
    const disk::path packages = place.work / "packages";
    MakeSuite(kSuite, Program(place, "hvpack"), place.work, packages);
    std::vector<double> ratios;
    std::vector<double> peaks;
    for (int pair = 0; pair < kInstallPairs; ++pair) {
        const std::string machine = Fresh(place);
        const Run ours = RunProgram(InstallCommand(place, packages), machine);
        ratios.push_back(ours.seconds / RunTools(kInstallByTools, packages, Fresh(place)).seconds);
        peaks.push_back(static_cast<double>(ours.peakKilobytes) / 1024);
    }
    const double largest = static_cast<double>(kSuite.pluginSize) / static_cast<double>(kMegabyte);
    return {{"250 MB suite: time against unzip, cp, rm", Median(ratios), 0.9},
            {"250 MB suite: peak memory above the largest entry, MB", std::ranges::max(peaks) - largest, 24}};
}

// --- What a file costs among many, and what a package does

/// Gives how much more the `large` suite costs than the `small` one, beyond what it costs standard tools more: the
/// file system's own growth, which is that of all who write so many files, cancels. `run` gives the processor's time of
/// a run with the given suite against that of the same work by tools, which takes its turn straight after. The time on
/// the clock would be that of the disk: a search that grows with the suite is the processor's.
double Growth(int large, int small, const std::function<double(int)>& run) {
    constexpr int kRounds = 3;
    constexpr int kSmallRuns = 5;
    std::vector<double> growths;
    for (int round = 0; round < kRounds; ++round) {
        std::vector<double> few;
        for (int turn = 0; turn < kSmallRuns; ++turn) {
            few.push_back(run(small));
        }
        growths.push_back(run(large) / Median(few));
    }
    return Median(growths);
}

std::vector<Figure> TakeFiles(const Place& place) {
    constexpr int kMany = 100000;
    constexpr int kFew = 1000;
    for (const int files : {kMany, kFew}) {
        MakeSuite({1, files}, Program(place, "hvpack"), place.work, place.work / std::to_string(files));
    }
    const double growth = Growth(kMany, kFew, [&](int files) {
        const disk::path packages = place.work / std::to_string(files);
        const double ours = RunProgram(InstallCommand(place, packages), Fresh(place)).processorSeconds;
        return ours / RunTools(kInstallByTools, packages, Fresh(place)).processorSeconds;
    });
    return {{"a file of 100,000 against one of 1,000: growth beyond tools", growth, 1.3}};
}

/// A run that ended early would look fast: each package has a folder and a record that have to be put back.
void RequireWayBack(const disk::path& machine, int packages) {
    std::ifstream log(machine / "drive_c/ProgramData/Halvorn/Logs/bench.log");
    int restored = 0;
    for (std::string line; std::getline(log, line);) {
        restored += line.find("Restoring original file at") != std::string::npos ? 1 : 0;
    }
    if (restored != 2 * packages) {
        throw std::runtime_error("the run put back " + std::to_string(restored) + " items of " +
                                 std::to_string(2 * packages));
    }
}

/// The suite is there already, so the run that is measured stashes everything, replaces it, and puts it all back. Gives
/// its processor's seconds.
double ReplaceAndPutBack(const Place& place, const disk::path& packages, int count) {
    const std::string machine = Fresh(place);
    const std::vector<std::string> install = InstallCommand(place, packages);
    std::vector<std::string> before = install;
    before.push_back(std::string("skip=") + kFailingPackage);
    RunProgram(before, machine);
    const Run run = RunProgram(install, machine, 1);
    RequireWayBack(machine, count);
    return run.processorSeconds;
}

std::vector<Figure> TakePackages(const Place& place) {
    constexpr int kMany = 1000;
    constexpr int kFew = 10;
    for (const int packages : {kMany, kFew}) {
        SuiteShape shape{packages, 10};
        shape.lastFails = true;
        MakeSuite(shape, Program(place, "hvpack"), place.work, place.work / std::to_string(packages));
    }
    const double growth = Growth(kMany, kFew, [&](int count) {
        const disk::path packages = place.work / std::to_string(count);
        const double ours = ReplaceAndPutBack(place, packages, count);
        const std::string folder = Fresh(place);
        RunTools(kInstallByTools, packages, folder);
        return ours / RunTools(kReplaceAndPutBackByTools, packages, folder).processorSeconds;
    });
    return {{"a package of 1,000 against one of 10, rolled back: the same", growth, 1.3}};
}

// --- The script for removal

/// Takes turns between a large list and several short ones, and gives how many times as much one of `large` lines costs
/// as one of `small`. All of it happens in memory, so there is no disk whose growth would have to cancel.
double CostRatio(int large, int small, const std::function<double(int)>& run) {
    constexpr int kRounds = 3;
    constexpr int kSmallRuns = 5;
    std::vector<double> ratios;
    for (int round = 0; round < kRounds; ++round) {
        std::vector<double> few;
        for (int turn = 0; turn < kSmallRuns; ++turn) {
            few.push_back(run(small) / small);
        }
        ratios.push_back(run(large) / large / Median(few));
    }
    return Median(ratios);
}

/// Writes a script that lists this many files, and then the same package again, as a repair does: each of its files is
/// looked for among the lines that are there. Gives the seconds that both took.
double WriteRemovalScript(int files) {
    static int number = 0;
    std::vector<std::string> paths;
    for (int i = 0; i < files; ++i) {
        paths.push_back("C:\\Program Files\\Halvorn\\Tessaly\\Presets\\Preset " + std::to_string(i) + ".ffx");
    }
    std::string script = "C:\\Bench\\removal-" + std::to_string(++number) + ".bat";
    HVL::ProductData product;
    product.SetValue("display_name", "Bench Suite");
    product.SetValue("version", "1.0.0");
    const HV::Package package{fs::path("bench")};
    const auto start = std::chrono::steady_clock::now();
    // A run of its own for each: what stands in the script is read from the disk again.
    (void)HV::UninstallScripts().WriteStandaloneUninstallScript(script, paths, package, product, "");
    (void)HV::UninstallScripts().WriteStandaloneUninstallScript(script, paths, package, product, "");
    const std::chrono::duration<double> taken = std::chrono::steady_clock::now() - start;
    std::ifstream written(std::string(std::getenv("HV_MACHINE")) + "/drive_c/Bench/removal-" + std::to_string(number) +
                          ".bat");
    int deletes = 0;
    for (std::string line; std::getline(written, line);) {
        deletes += line.starts_with("CALL DEL") ? 1 : 0;
    }
    if (deletes != files) {
        throw std::runtime_error("the script deletes " + std::to_string(deletes) + " files of " +
                                 std::to_string(files));
    }
    return taken.count();
}

std::vector<Figure> TakeRemoval(const Place& place) {
    constexpr int kMany = 20000;
    constexpr int kFew = 2000;
    setenv("HV_MACHINE", Fresh(place).c_str(), 1);
    const double ratio = CostRatio(kMany, kFew, WriteRemovalScript);
    // Looking through all lines for each file would give 10. What is above 1 is memory: a long list leaves the caches.
    return {{"a file in a removal script of 20,000 against 2,000: time", ratio, 3}};
}

// --- The digest

constexpr int kDigestPairs = 9;
constexpr std::size_t kDigestSize = 256 * kMegabyte;

std::vector<Figure> TakeMd5(const Place& place) {
    const std::string file = (place.work / "digest.bin").string();
    WriteFile(file, MakeBytes(kDigestSize, 3));
    const std::string machine = Fresh(place);
    std::vector<double> ratios;
    for (int pair = 0; pair < kDigestPairs; ++pair) {
        const Run ours = RunProgram({Program(place, "hvbench"), "--digest", file}, machine);
        const Run theirs = RunProgram({"md5sum", file}, machine);
        ratios.push_back(theirs.seconds / ours.seconds);
    }
    return {{"MD5 of a file: rate against md5sum", Median(ratios), 0.9, true}};
}

}  // namespace

const std::vector<Measurement>& Measurements() {
    static const std::vector<Measurement> all = {{"install", TakeInstall},
                                                 {"files", TakeFiles},
                                                 {"packages", TakePackages},
                                                 {"removal", TakeRemoval},
                                                 {"md5", TakeMd5}};
    return all;
}

}  // namespace HVBench
