#include "hvdeploy/src/Logging.h"

#include <boost/exception/all.hpp>
#include <log4cpp/Appender.hh>
#include <log4cpp/BasicLayout.hh>
#include <log4cpp/Category.hh>
#include <log4cpp/FileAppender.hh>
#include <log4cpp/OstreamAppender.hh>
#include <log4cpp/Priority.hh>
#include <log4cpp/PropertyConfigurator.hh>

#include <algorithm>
#include <array>
#include <cstdio>
#include <iostream>
#include <memory>
#include <set>
#include <stdexcept>
#include <vector>

#include "hvdeploy/src/HVDeployCLI.h"
#include "hvframework/FileUtils.h"
#include "hvframework/StringUtils.h"
#include "platform/files.h"
#include "platform/filesystem.h"
#include "platform/libraries.h"
#include "platform/win32.h"

namespace HV {
namespace {

using namespace HVL;

constexpr std::array kCategories{"halvorn", "hvdeploy-detail"};
constexpr std::size_t kLogValueBuffer = 16384;
constexpr int kLogFileMode = 0644;

std::string DefaultLogFolder() {
    return StringUtils::GetEnvironmentValue("PROGRAMDATA") + "\\Halvorn\\Logs";
}

std::string PropertyText(const std::string& logPath) {
    return "log4cpp.rootCategory=INFO, console, servicelog\n"
           "log4cpp.appender.servicelog.maxFileSize=104857600\n"
           "log4cpp.appender.servicelog.maxBackupIndex=10\n"
           "log4cpp.appender.servicelog.layout=PatternLayout\n"
           "log4cpp.appender.servicelog.layout.ConversionPattern=%d{%y-%m-%d %H:%M:%S} [%p] %c: %m%n\n"
           "log4cpp.appender.servicelog=RollingFileAppender\n"
           "log4cpp.appender.servicelog.fileName=" +
           logPath +
           "\n"
           "log4cpp.appender.console=ConsoleAppender\n"
           "log4cpp.appender.console.layout=PatternLayout\n"
           "log4cpp.appender.console.layout.ConversionPattern=%d{%y-%m-%d %H:%M:%S} [%p] %c: %m%n";
}

// The library would read an empty name as EMERG and switch the log off. Nobody means that, so it fails like any name
// that the library does not know, with the library's own words.
log4cpp::Priority::Value PriorityFromName(const std::string& name) {
    if (name.empty()) {
        throw std::invalid_argument("unknown priority name: ''");
    }
    return log4cpp::Priority::getPriorityValue(name);
}

// The first "log=" of the line counts here, though the arguments keep the last.
std::string LogFileFromArgs(int argc, const char* const* argv) {
    constexpr const char* key = "log=";
    const auto* const end = argv + argc;
    const auto* const found =
        std::find_if(argv, end, [&](const char* arg) { return arg != nullptr && StringUtils::StartsWith(arg, key); });
    if (found == end) {
        return {};
    }
    const std::string value = std::string(*found).substr(4);
    if (value.size() >= kLogValueBuffer) {
        throw boost::enable_error_info(std::runtime_error("Arg value cannot be greater than 16k in length!"))
            << boost::throw_function("HV::DeployCLI::InitLogging") << boost::throw_file("hvdeploy/src/HVDeployCLI")
            << boost::throw_line(194);
    }
    std::string name = StringUtils::Trim(value);
    if (!name.empty() && name.front() == '"') {
        name.erase(0, 1);
        if (!name.empty() && name.back() == '"') {
            name.pop_back();
        }
    }
    return name;
}

void AddConsole(log4cpp::Category& category) {
    // The category owns its appender, and the appender its layout.
    auto* const console = new log4cpp::OstreamAppender("console", &std::cout);
    console->setLayout(new log4cpp::BasicLayout());
    category.addAppender(console);
}

// What the library's appenders tell their heirs alone. One that cannot open its file says nothing, and neither does any
// line that it is given.
struct OpenFile : log4cpp::FileAppender {
    static bool IsMissing(const log4cpp::FileAppender& appender) { return appender.*&OpenFile::_fd < 0; }
    static std::string NameOf(const log4cpp::FileAppender& appender) { return appender.*&OpenFile::_fileName; }
};

// Returns whether the file could be opened.
bool AddLogFile(log4cpp::Category& category, const std::string& fileName) {
    auto* const file = new log4cpp::FileAppender("logfile", platform::LibraryFileName(fs::path(fileName)), true,
                                                 static_cast<mode_t>(kLogFileMode));
    file->setLayout(new log4cpp::BasicLayout());
    category.addAppender(file);
    return !OpenFile::IsMissing(*file);
}

// Each name once, however many categories share the file.
std::set<std::string> LogFilesThatAreMissing() {
    const std::unique_ptr<std::vector<log4cpp::Category*>> categories(log4cpp::Category::getCurrentCategories());
    std::set<std::string> names;
    for (log4cpp::Category* const category : *categories) {
        for (log4cpp::Appender* const appender : category->getAllAppenders()) {
            const auto* const file = dynamic_cast<log4cpp::FileAppender*>(appender);
            if (file != nullptr && OpenFile::IsMissing(*file)) {
                names.insert(OpenFile::NameOf(*file));
            }
        }
    }
    return names;
}

void WriteTestLines() {
    for (const char* const name : kCategories) {
        log4cpp::Category& category = log4cpp::Category::getInstance(name);
        if (category.isDebugEnabled()) {
            category.debugStream() << "Testing the " << name << " logger...";
        }
    }
}

}  // namespace

std::string LoggingConfigOfTheMachine() {
    const std::string company = FileUtils::JoinPath(StringUtils::GetEnvironmentValue("ProgramData"), "Halvorn");
    return FileUtils::JoinPath(FileUtils::JoinPath(company, "Installer"), "halvorn.logging.config");
}

int WriteLoggingConfig(const std::string& configPath, const std::string& logFileName, const std::string& logDir) {
    const std::string folder = logDir.empty() ? DefaultLogFolder() : logDir;
    // ConfigureLogging reports the file that cannot be opened where the folder cannot be made.
    (void)FileUtils::CreateDirectories(folder);
    std::FILE* const file = platform::OpenStream(configPath, "w");
    if (file == nullptr) {
        return 0;
    }
    const std::string text = PropertyText(folder + "\\" + logFileName);
    std::fwrite(text.data(), 1, text.size(), file);
    std::fclose(file);
    return 1;
}

int ConfigureLogging(const std::string& configPath) {
    int accepted = 0;
    try {
        log4cpp::PropertyConfigurator::configure(platform::LibraryPropertyFile(fs::path(configPath)));
        accepted = 1;
        WriteTestLines();
        for (const std::string& name : LogFilesThatAreMissing()) {
            std::cerr << "Logging configuration error: cannot open log file " << name << std::endl;
        }
    } catch (const std::exception& error) {
        std::cerr << "Logging configuration error: " << error.what() << std::endl;
    } catch (...) {
        std::cerr << "Logging configuration unknown exception." << std::endl;
    }
    return accepted;
}

int SetCategoryLevelFromArgs(std::string categoryName, int argc, const char* const* argv, const std::string& key) {
    const std::string prefix = key + "=";
    int result = 0;
    for (int i = 0; i < argc; ++i) {
        if (argv[i] == nullptr || !StringUtils::StartsWith(argv[i], prefix)) {
            continue;
        }
        const std::vector<std::string> pieces = StringUtils::Split(argv[i], '=');
        if (pieces.size() < 2) {
            continue;
        }
        try {
            log4cpp::Category::getInstance(categoryName).setPriority(PriorityFromName(StringUtils::ToUpper(pieces[1])));
            result = 1;
        } catch (const std::invalid_argument& error) {
            std::cerr << error.what() << std::endl;
        }
    }
    return result;
}

void DeployCLI::InitLogging(int argc, const char* const* argv) {
    for (const char* const name : kCategories) {
        AddConsole(log4cpp::Category::getInstance(name));
    }
    if (argc < 1 || argv == nullptr) {
        for (const char* const name : kCategories) {
            log4cpp::Category::getInstance(name).setPriority(log4cpp::Priority::INFO);
        }
        return;
    }
    const std::string fileName = LogFileFromArgs(argc, argv);
    if (!fileName.empty()) {
        // A folder that cannot be made leaves the run without a log file, which is reported below; it goes on all the
        // same. Both separators are what people type.
        (void)FileUtils::CreateDirectories(fs::path(fileName).parent_path().make_preferred().string());
    }
    bool logs = true;
    for (const char* const name : kCategories) {
        log4cpp::Category& category = log4cpp::Category::getInstance(name);
        if (!fileName.empty()) {
            logs = AddLogFile(category, fileName) && logs;
        }
        if (SetCategoryLevelFromArgs(name, argc, argv, "loglevel") == 0) {
            category.setPriority(log4cpp::Priority::DEBUG);
        }
    }
    if (!logs) {
        std::cerr << "hvdeploy: cannot open log file " << fileName << "; the log goes to standard output alone"
                  << std::endl;
    }
}

}  // namespace HV
