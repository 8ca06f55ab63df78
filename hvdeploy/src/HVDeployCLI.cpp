#include "hvdeploy/src/HVDeployCLI.h"

#include <log4cpp/Category.hh>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <iostream>
#include <limits>
#include <utility>

#include "hvdeploy/src/ArgumentLine.h"
#include "hvdeploy/src/EntryTrace.h"
#include "hvframework/Log.h"
#include "hvframework/StringUtils.h"

namespace HV {
namespace {

constexpr const char* kProgramArgument = "./hvdeploy";
constexpr const char* kProductVersion = "2.0-d1";

constexpr const char* kFile = "file=";
constexpr const char* kDir = "dir=";
constexpr const char* kSkip = "skip=";
constexpr const char* kList = "list=";

// Fixed (contracts, argument line): "rollback=", "manifest=", "uninstall=" and "update=" are accepted and do nothing.
constexpr std::array kKeys{
    kFile, kDir, "rollback=", kSkip, "manifest=", "uninstall=", kList, "update=", "log=", "loglevel="};

constexpr const char* kAbout = "--about";
constexpr const char* kVerbose = "--verbose";
constexpr const char* kVersion = "--version";
constexpr const char* kLegacyUninstall = "--legacyuninstall";
constexpr const char* kError = "--error";
constexpr std::array kFlags{kAbout, kVerbose, kVersion, kLegacyUninstall, kError};

// Fixed (contracts, argument line): reserved words. No logic compares against them.
[[maybe_unused]] constexpr std::array kReservedWords{"force",   "newer",    "only",  "ignore",
                                                     "enabled", "disabled", "submit"};

template <class Table>
bool Holds(const Table& table, const std::string& word) {
    return std::any_of(table.begin(), table.end(), [&](const char* entry) { return word == entry; });
}

bool IsDirectory(const fs::path& path) {
    boost::system::error_code ignored;
    return fs::is_directory(path, ignored);
}

/// The part of `argument` up to its first "=", which is included; empty without one.
std::string KeyOf(const std::string& argument) {
    const std::size_t equals = argument.find('=');
    return argument.substr(0, equals == std::string::npos ? 0 : equals + 1);
}

/// The number that `text` begins with, within the bounds of a result; 0 when it begins with none.
int LeadingNumber(const std::string& text) {
    constexpr long long least = std::numeric_limits<int>::min();
    constexpr long long most = std::numeric_limits<int>::max();
    return static_cast<int>(std::clamp(std::strtoll(text.c_str(), nullptr, 10), least, most));
}

int Fold(EngineResult result) {
    return IsFailure(result) ? -1 : 0;
}

}  // namespace

DeployCLI::DeployCLI(ProgressListenerInterface* progressListener)
    : listener(progressListener), deploy(progressListener) {}

DeployCLI::~DeployCLI() = default;

int DeployCLI::ParseLine(std::string line) {
    std::vector<std::string> arguments;
    switch (SplitArgumentLine(line, arguments)) {
        case LineSplit::Blank:
            return -1;
        case LineSplit::UnbalancedQuotes:
            std::cerr << "Line parsing error: unbalanced double quotes." << std::endl;
            return -1;
        case LineSplit::Done:
            break;
    }
    return ParseArguments(arguments);
}

int DeployCLI::ParseArguments(const std::vector<std::string>& arguments) {
    if (arguments.empty()) {
        return -1;
    }
    std::vector<const char*> argv{kProgramArgument};
    for (const std::string& argument : arguments) {
        argv.push_back(argument.c_str());
    }
    const int argc = static_cast<int>(argv.size());
    if (log4cpp::Category::exists("halvorn") == nullptr) {
        InitLogging(argc, argv.data());
    }
    return ParseArgs(argc, argv.data());
}

int DeployCLI::ParseArgs(int argc, const char* const* argv) {
    HVL_LOG(Debug, "Parsing command-line hvdeploy args.");
    if (argc > 0) {
        initialDir = fs::current_path();
        exePath = fs::absolute(fs::path(argv[0]), initialDir);
        exeDir = exePath.parent_path();
    }
    for (int i = 1; i < argc; ++i) {
        if (const int error = ParseArg(argv[i]); error != 0) {
            HVL_LOG(Error,
                    "ParseArg() failed with error " << error << " for arg: " << (argv[i] != nullptr ? argv[i] : ""));
            HVL_LOG(Debug, "ParseArgs() is returning false.");
            return error;
        }
    }
    verbose = HasFlag(kVerbose);
    testError = HasFlag(kError);
    return 0;
}

int DeployCLI::ParseArg(const char* arg) {
    if (arg == nullptr) {
        HVL_LOG(Error, "NULL arg passed to ParseArg");
        return -1;
    }
    const std::string argument = arg;
    if (Holds(kFlags, argument)) {
        flags.push_back(argument);
        return 0;
    }
    if (!IsArgument(argument)) {
        HVL_LOG(Error, "unsupported argument: " << argument);
        return -1;
    }
    const std::string key = KeyOf(argument);
    args[key] = argument.substr(key.size());
    return 0;
}

bool IsArgument(const std::string& argument) {
    return Holds(kFlags, argument) || Holds(kKeys, KeyOf(argument));
}

std::string DeployCLI::GetArg(const std::string& key) const {
    const auto found = args.find(key);
    return found == args.end() ? std::string() : found->second;
}

bool DeployCLI::CountArg(const std::string& key) const {
    return args.count(key) != 0;
}

bool DeployCLI::HasFlag(const char* flag) const {
    return std::find(flags.begin(), flags.end(), flag) != flags.end();
}

int DeployCLI::Run() {
    int result = 0;
    try {
        try {
            result = RunCommand();
        } catch (const std::exception& error) {
            brokenOff = true;
            if (!IsFailure(result)) {
                result = ErrorCodeFromText(error.what());
            }
            HVL_LOG(Error, "exception caught in HV::DeployCLI::Run(): \n" << error.what());
        }
    } catch (...) {
        brokenOff = true;
        result = -1;
        HVL_LOG(Error, "unknown exception caught in HV::DeployCLI::Run()");
    }
    if (IsFailure(result) && listener != nullptr) {
        listener->update(kFailedPercent, "An error occurred during installation.", result);
    }
    const boost::mutex::scoped_lock guard(runningMutex);
    running = false;
    return result;
}

int DeployCLI::RunCommand() {
    HVL_LOG(Info, kDeployCLIClass << "HV::DeployCLI::Run");
    verbose = HasFlag(kVerbose);
    PrintBanner();
    // Fixed (contracts, run): the flags that print something do not end the run. A line that holds only "--version"
    // goes on to deploy the default folder.
    return CountArg(kList) ? DoListCommand() : DoDeployCommand();
}

void DeployCLI::PrintBanner() {
    const bool withNotice = verbose || HasFlag(kAbout);
    if (!withNotice && !HasFlag(kVersion)) {
        HVL_LOG(Info, "hvdeploy version " << kProductVersion);
        return;
    }
    std::cout << "hvdeploy version " << kProductVersion << std::endl;
    if (withNotice) {
        std::cout << "Copyright (c) Halvorn LLC. All rights reserved.\n"
                  << "Use of this program and of what it installs is subject to the licence agreement.\n"
                  << "=====" << std::endl;
    }
}

// Fixed (contracts, run): a search for any of these characters, not for the word "ERROR".
int ErrorCodeFromText(const std::string& text) {
    const std::size_t mark = text.find_first_of("ERO(");
    if (mark == std::string::npos) {
        return -1;
    }
    const std::size_t start = mark + 6;
    if (start >= text.size()) {
        return -1;
    }
    const std::size_t end = text.find(')', start);
    if (end == std::string::npos) {
        return -1;
    }
    return LeadingNumber(text.substr(start, end - start));
}

int DeployCLI::DoDeployCommand() {
    TraceEntry(kDeployCLIClass, "DoDeployCommand");
    const bool hasFile = CountArg(kFile);
    const fs::path file(hasFile ? GetArg(kFile) : "");
    // With "file=" on the line "dir=" is not read, even when the file's name is empty.
    fs::path dir(hasFile ? "" : GetArg(kDir));
    if (file.empty() && dir.empty()) {
        dir = DefaultPackagesFolder();
        if (dir.empty()) {
            HVL_LOG(Info, "No files to install.");
            return 0;
        }
    }
    deploy.SetVerbose(verbose);
    deploy.SetLegacyUninstall(HasFlag(kLegacyUninstall));
    deploy.SetListener(listener);
    deploy.SetFatalErrorTest(testError);
    return file.empty() ? DeployFolder(dir) : DeployFile(file);
}

fs::path DeployCLI::DefaultPackagesFolder() const {
    if (const fs::path folder = initialDir / "packages"; IsDirectory(folder)) {
        return folder;
    }
    if (const fs::path folder = exeDir / "packages"; initialDir != exeDir && IsDirectory(folder)) {
        return folder;
    }
    return {};
}

int DeployCLI::DeployFile(const fs::path& file) {
    HVL_LOG(Info, "Deploying package at " << file);
    return Fold(deploy.DeployPackages({file}));
}

int DeployCLI::DeployFolder(fs::path dir) {
    if (!IsDirectory(dir)) {
        const std::string text = dir.string();
        if (!text.empty() && text.front() == '"') {
            // The last character goes whatever it is.
            dir = fs::path(text.size() > 1 ? text.substr(1, text.size() - 2) : "");
        }
        if (!IsDirectory(dir)) {
            HVL_LOG(Error, "not a directory: " << dir);
            return -1;
        }
    }
    return Fold(deploy.DeployPackagesFromDirectory(dir, SkipList()));
}

std::vector<std::string> DeployCLI::SkipList() const {
    if (!CountArg(kSkip)) {
        return {};
    }
    return HVL::StringUtils::Split(HVL::StringUtils::StripQuotes(GetArg(kSkip)), ',');
}

void DeployCLI::Cancel() {
    HVL_LOG(Crit, "Cancel invoked");
    deploy.Cancel();
}

}  // namespace HV
