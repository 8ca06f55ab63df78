// Logging brought to life in code and from a property file.
#include "hvdeploy/src/Logging.h"

#include <gtest/gtest.h>

#include <boost/exception/all.hpp>
#include <log4cpp/Appender.hh>
#include <log4cpp/Category.hh>
#include <log4cpp/Priority.hh>

#include "hvdeploy/src/HVDeployCLI.h"
#include "hvframework/Log.h"
#include "platform/win32.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/Machine.h"

namespace {

using log4cpp::Category;
using log4cpp::Priority;

constexpr const char* kConfig = R"(C:\Config\hvinstaller.cfg)";

bool EndsWith(const std::string& text, const std::string& end) {
    return text.size() >= end.size() && text.compare(text.size() - end.size(), end.size(), end) == 0;
}

/// The categories as a process has them before anybody set them up, apart from their existence.
class LoggingTest : public testing::Test {
protected:
    LoggingTest() { Reset(); }
    ~LoggingTest() override { Reset(); }

    static void Reset() {
        // What a property file brings is owned by nobody and would keep its file open.
        log4cpp::Appender::closeAll();
        for (Category* category : {&HVL::Log::General(), &HVL::Log::Detail()}) {
            category->removeAllAppenders();
            category->setPriority(Priority::NOTSET);
        }
        Category::getRoot().removeAllAppenders();
        Category::setRootPriority(Priority::INFO);
    }

    void Init(const std::vector<const char*>& arguments) {
        cli.InitLogging(static_cast<int>(arguments.size()), arguments.data());
    }

    static std::size_t AppendersOf(Category& category) { return category.getAllAppenders().size(); }

    static std::vector<int> Priorities() {
        return {HVL::Log::General().getPriority(), HVL::Log::Detail().getPriority()};
    }
    static std::vector<int> Both(int priority) { return {priority, priority}; }

    static int SetLevel(const std::vector<const char*>& arguments, const char* key = "loglevel") {
        return HV::SetCategoryLevelFromArgs("hvdeploy-detail", static_cast<int>(arguments.size()), arguments.data(),
                                            key);
    }

    Machine machine;
    HV::DeployCLI cli{nullptr};
};

TEST_F(LoggingTest, LogsFromInfoOnWithoutArguments) {
    Init({});
    EXPECT_EQ(Priorities(), Both(Priority::INFO));
    EXPECT_EQ(AppendersOf(HVL::Log::Detail()), 1U);
    EXPECT_EQ(AppendersOf(HVL::Log::General()), 1U);
}

TEST_F(LoggingTest, LogsFromInfoOnWithoutAVector) {
    cli.InitLogging(3, nullptr);
    EXPECT_EQ(Priorities(), Both(Priority::INFO));
}

TEST_F(LoggingTest, LogsEverythingWithoutALevel) {
    Init({"./hvdeploy", "--verbose"});
    EXPECT_EQ(Priorities(), Both(Priority::DEBUG));
}

TEST_F(LoggingTest, LogsToStandardOutputInTheBasicLayout) {
    CapturedStreams streams;
    Init({"./hvdeploy"});
    EXPECT_NE(HVL::Log::Detail().getAppender("console"), nullptr);
    HVL_LOG(Warn, "a line");
    HVL_LOG_TO(HVL::Log::General(), Info, "another");
    const std::string text = streams.Output();
    EXPECT_NE(text.find(" WARN hvdeploy-detail : a line\n"), std::string::npos) << text;
    EXPECT_TRUE(EndsWith(text, " INFO halvorn : another\n")) << text;
    EXPECT_EQ(streams.Errors(), "");
}

TEST_F(LoggingTest, AppendsBothCategoriesToTheLogFileAndMakesItsFolder) {
    machine.Has(R"(C:\My Logs\old.log)", "before\r\n");
    {
        CapturedStreams streams;
        Init({"./hvdeploy", "log= \t\"C:\\My Logs\\old.log\" "});
        HVL_LOG(Debug, "a line");
        HVL_LOG_TO(HVL::Log::General(), Error, "another");
    }
    EXPECT_NE(HVL::Log::Detail().getAppender("logfile"), nullptr);
    Reset();
    const std::string text = machine.Content(R"(C:\My Logs\old.log)");
    EXPECT_EQ(text.rfind("before\r\n", 0), 0U) << text;
    EXPECT_NE(text.find(" DEBUG hvdeploy-detail : a line"), std::string::npos) << text;
    EXPECT_NE(text.find(" ERROR halvorn : another"), std::string::npos) << text;
}

TEST_F(LoggingTest, MakesTheFoldersOfTheLogFile) {
    Init({"./hvdeploy", R"(log=C:\New\Logs\run.log)"});
    Reset();
    EXPECT_TRUE(machine.HasFile(R"(C:\New\Logs\run.log)"));
}

TEST_F(LoggingTest, RunsOnWithoutALogFileWhoseFolderCannotBeMade) {
    machine.Has(R"(C:\file)", "in the way");
    CapturedStreams streams;
    Init({"./hvdeploy", R"(log=C:\file\run.log)"});
    HVL_LOG(Info, "still here");
    EXPECT_TRUE(EndsWith(streams.Output(), " INFO hvdeploy-detail : still here\n")) << streams.Output();
    EXPECT_EQ(machine.Content(R"(C:\file)"), "in the way");
    EXPECT_EQ(streams.Errors(),
              "hvdeploy: cannot open log file C:\\file\\run.log; the log goes to standard output alone\n");
}

TEST_F(LoggingTest, TakesTheFirstOfTwoLogFiles) {
    Init({"./hvdeploy", R"(log=C:\Logs\first.log)", R"(log=C:\Logs\second.log)"});
    Reset();
    EXPECT_TRUE(machine.HasFile(R"(C:\Logs\first.log)"));
    EXPECT_FALSE(machine.Exists(R"(C:\Logs\second.log)"));
}

TEST_F(LoggingTest, StopsAtTheFirstLogEvenWhenItIsEmpty) {
    Init({"./hvdeploy", "log=", R"(log=C:\Logs\second.log)"});
    EXPECT_EQ(AppendersOf(HVL::Log::Detail()), 1U);
    EXPECT_FALSE(machine.Exists(R"(C:\Logs)"));
}

TEST_F(LoggingTest, AddsNoFileForTwoDoubleQuotes) {
    Init({"./hvdeploy", "log=\"\""});
    EXPECT_EQ(AppendersOf(HVL::Log::Detail()), 1U);
}

TEST_F(LoggingTest, AddsNoFileForALoneDoubleQuote) {
    Init({"./hvdeploy", "log=\""});
    EXPECT_EQ(AppendersOf(HVL::Log::Detail()), 1U);
}

TEST_F(LoggingTest, TakesAClosingQuoteAwayOnlyWithAnOpeningOne) {
    Init({"./hvdeploy", "log=\"C:\\Logs\\opened.log"});
    Reset();
    EXPECT_TRUE(machine.HasFile(R"(C:\Logs\opened.log)"));
    // A name that Windows refuses, and not the one without its last character.
    Init({"./hvdeploy", "log=C:\\Logs\\closed.log\""});
    Reset();
    EXPECT_FALSE(machine.Exists(R"(C:\Logs\closed.log)"));
}

TEST_F(LoggingTest, AddsNoFileForWhiteSpace) {
    Init({"./hvdeploy", "log= \t\r\n\v\f"});
    EXPECT_EQ(AppendersOf(HVL::Log::Detail()), 1U);
}

TEST_F(LoggingTest, AcceptsALogValueOf16383Characters) {
    const std::string argument = "log=" + std::string(16383, ' ');
    EXPECT_NO_THROW(Init({"./hvdeploy", argument.c_str()}));
    EXPECT_EQ(Priorities(), Both(Priority::DEBUG));
}

TEST_F(LoggingTest, ThrowsOnALogValueOf16384Characters) {
    const std::string argument = "log=" + std::string(16384, ' ');
    try {
        Init({"./hvdeploy", argument.c_str()});
        FAIL() << "nothing was thrown";
    } catch (const std::runtime_error& error) {
        EXPECT_STREQ(error.what(), "Arg value cannot be greater than 16k in length!");
        const char* const* const function = boost::get_error_info<boost::throw_function>(error);
        const char* const* const file = boost::get_error_info<boost::throw_file>(error);
        const int* const line = boost::get_error_info<boost::throw_line>(error);
        ASSERT_TRUE(function != nullptr && file != nullptr && line != nullptr);
        EXPECT_NE(std::string(*function).find("InitLogging"), std::string::npos);
        EXPECT_STREQ(*file, "hvdeploy/src/HVDeployCLI");
        EXPECT_EQ(*line, 194);
    }
}

TEST_F(LoggingTest, TakesALevelInEitherCase) {
    Init({"./hvdeploy", "loglevel=warn"});
    EXPECT_EQ(Priorities(), Both(Priority::WARN));
    Reset();
    Init({"./hvdeploy", "loglevel=ERROR"});
    EXPECT_EQ(Priorities(), Both(Priority::ERROR));
}

TEST_F(LoggingTest, SaysThatALevelIsUnknownForEachCategoryAndLogsEverything) {
    CapturedStreams streams;
    Init({"./hvdeploy", "loglevel=loud"});
    EXPECT_EQ(streams.Errors(), "unknown priority name: 'LOUD'\nunknown priority name: 'LOUD'\n");
    EXPECT_EQ(Priorities(), Both(Priority::DEBUG));
}

TEST_F(LoggingTest, SaysThatAnEmptyLevelIsUnknown) {
    CapturedStreams streams;
    EXPECT_EQ(SetLevel({"loglevel="}), 0);
    EXPECT_EQ(streams.Errors(), "unknown priority name: ''\n");
    EXPECT_EQ(HVL::Log::Detail().getPriority(), static_cast<int>(Priority::NOTSET));
}

TEST_F(LoggingTest, KnowsEveryPriorityOfTheLog) {
    const std::vector<std::pair<const char*, int>> levels{
        {"loglevel=emerg", 0},    {"loglevel=fatal", 0},   {"loglevel=alert", 100},
        {"loglevel=crit", 200},   {"loglevel=error", 300}, {"loglevel=warn", 400},
        {"loglevel=notice", 500}, {"loglevel=info", 600},  {"loglevel=debug", 700}};
    for (const auto& [argument, priority] : levels) {
        EXPECT_EQ(SetLevel({argument}), 1) << argument;
        EXPECT_EQ(HVL::Log::Detail().getPriority(), priority) << argument;
    }
    EXPECT_EQ(levels.size(), 9U);
}

TEST_F(LoggingTest, LooksAtEveryArgumentFromTheFirstOnAndTakesTheLastLevel) {
    EXPECT_EQ(SetLevel({"loglevel=crit", "x", "loglevel=warn"}), 1);
    EXPECT_EQ(HVL::Log::Detail().getPriority(), static_cast<int>(Priority::WARN));
}

TEST_F(LoggingTest, GoesOnAfterAnUnknownLevel) {
    CapturedStreams streams;
    EXPECT_EQ(SetLevel({"loglevel=loud", "loglevel=crit"}), 1);
    EXPECT_EQ(HVL::Log::Detail().getPriority(), static_cast<int>(Priority::CRIT));
}

TEST_F(LoggingTest, KeepsALevelThatWasSetBeforeAnUnknownOne) {
    CapturedStreams streams;
    EXPECT_EQ(SetLevel({"loglevel=crit", "loglevel=loud"}), 1);
    EXPECT_EQ(HVL::Log::Detail().getPriority(), static_cast<int>(Priority::CRIT));
    EXPECT_EQ(streams.Errors(), "unknown priority name: 'LOUD'\n");
}

TEST_F(LoggingTest, TakesTheSecondOfThePiecesBetweenEqualsSigns) {
    EXPECT_EQ(SetLevel({"loglevel=warn=debug"}), 1);
    EXPECT_EQ(HVL::Log::Detail().getPriority(), static_cast<int>(Priority::WARN));
}

TEST_F(LoggingTest, SetsNoLevelWithoutTheKey) {
    EXPECT_EQ(SetLevel({"log=warn", "level=warn", "xloglevel=warn", "LOGLEVEL=warn", "loglevel"}), 0);
    EXPECT_EQ(SetLevel({}), 0);
    EXPECT_EQ(HVL::Log::Detail().getPriority(), static_cast<int>(Priority::NOTSET));
}

TEST_F(LoggingTest, TakesTheNameOfTheKeyFromItsCaller) {
    EXPECT_EQ(SetLevel({"loglevel=debug", "volume=crit"}, "volume"), 1);
    EXPECT_EQ(HVL::Log::Detail().getPriority(), static_cast<int>(Priority::CRIT));
}

TEST_F(LoggingTest, SetsTheLevelOfOneCategoryAlone) {
    EXPECT_EQ(SetLevel({"loglevel=crit"}), 1);
    EXPECT_EQ(HVL::Log::General().getPriority(), static_cast<int>(Priority::NOTSET));
}

std::string PropertyTextFor(const std::string& logPath) {
    return "log4cpp.rootCategory=INFO, console, servicelog\r\n"
           "log4cpp.appender.servicelog.maxFileSize=104857600\r\n"
           "log4cpp.appender.servicelog.maxBackupIndex=10\r\n"
           "log4cpp.appender.servicelog.layout=PatternLayout\r\n"
           "log4cpp.appender.servicelog.layout.ConversionPattern=%d{%y-%m-%d %H:%M:%S} [%p] %c: %m%n\r\n"
           "log4cpp.appender.servicelog=RollingFileAppender\r\n"
           "log4cpp.appender.servicelog.fileName=" +
           logPath +
           "\r\n"
           "log4cpp.appender.console=ConsoleAppender\r\n"
           "log4cpp.appender.console.layout=PatternLayout\r\n"
           "log4cpp.appender.console.layout.ConversionPattern=%d{%y-%m-%d %H:%M:%S} [%p] %c: %m%n";
}

TEST_F(LoggingTest, WritesTheTenLinesOfThePropertyFile) {
    machine.HasFolder(R"(C:\Config)");
    EXPECT_EQ(HV::WriteLoggingConfig(kConfig, "Suite.log", R"(C:\New\Logs)"), 1);
    EXPECT_EQ(machine.Content(kConfig), PropertyTextFor(R"(C:\New\Logs\Suite.log)"));
    EXPECT_TRUE(machine.Exists(R"(C:\New\Logs)"));
}

TEST_F(LoggingTest, TakesTheDefaultLogFolderForAnEmptyOne) {
    machine.HasFolder(R"(C:\Config)");
    EXPECT_EQ(HV::WriteLoggingConfig(kConfig, "Tessaly Suite Installer.log", ""), 1);
    EXPECT_EQ(machine.Content(kConfig), PropertyTextFor(R"(C:\ProgramData\Halvorn\Logs\Tessaly Suite Installer.log)"));
    EXPECT_TRUE(machine.Exists(R"(C:\ProgramData\Halvorn\Logs)"));
}

TEST_F(LoggingTest, WritesNoPropertyFileWhereItCannotBeOpened) {
    EXPECT_EQ(HV::WriteLoggingConfig(R"(C:\No\such\folder\a.cfg)", "a.log", R"(C:\Logs)"), 0);
    EXPECT_TRUE(machine.Exists(R"(C:\Logs)")) << "the log's folder comes first";
}

TEST_F(LoggingTest, WritesThePropertyFileThoughTheLogFolderCannotBeMade) {
    machine.HasFolder(R"(C:\Config)");
    machine.Has(R"(C:\file)", "in the way");
    EXPECT_EQ(HV::WriteLoggingConfig(kConfig, "a.log", R"(C:\file\Logs)"), 1);
    EXPECT_EQ(machine.Content(kConfig), PropertyTextFor(R"(C:\file\Logs\a.log)"));
}

TEST_F(LoggingTest, LogsAsThePropertyFileSays) {
    machine.HasFolder(R"(C:\Config)");
    ASSERT_EQ(HV::WriteLoggingConfig(kConfig, "a.log", R"(C:\Logs)"), 1);
    {
        CapturedStreams streams;
        EXPECT_EQ(HV::ConfigureLogging(kConfig), 1);
        EXPECT_EQ(streams.Errors(), "");
        HVL::Log::Detail().setPriority(Priority::DEBUG);
        HVL_LOG(Debug, "a line");
        EXPECT_NE(streams.Output().find(" [DEBUG] hvdeploy-detail: a line\n"), std::string::npos) << streams.Output();
    }
    Reset();
    const std::string text = machine.Content(R"(C:\Logs\a.log)");
    // "yy-mm-dd HH:MM:SS [DEBUG] ..." and nothing of the test lines, which the file's INFO switches off.
    ASSERT_GT(text.size(), 20U) << text;
    EXPECT_EQ(text[2], '-');
    EXPECT_EQ(text[5], '-');
    EXPECT_EQ(text[8], ' ');
    EXPECT_EQ(text[11], ':');
    EXPECT_EQ(text.substr(17, 40).rfind(" [DEBUG] hvdeploy-detail: a line", 0), 0U) << text;
    EXPECT_EQ(text.find("Testing the"), std::string::npos) << text;
}

TEST_F(LoggingTest, TestsBothCategoriesWhenTheyLogEverything) {
    machine.HasFolder(R"(C:\Logs)");
    machine.Has(kConfig,
                "log4cpp.rootCategory=DEBUG, file\n"
                "log4cpp.appender.file=FileAppender\n"
                "log4cpp.appender.file.fileName=C:\\Logs\\a.log\n"
                "log4cpp.appender.file.layout=PatternLayout\n"
                "log4cpp.appender.file.layout.ConversionPattern=%p %c: %m;\n");
    CapturedStreams streams;
    EXPECT_EQ(HV::ConfigureLogging(kConfig), 1);
    EXPECT_EQ(streams.Errors(), "");
    Reset();
    EXPECT_EQ(machine.Content(R"(C:\Logs\a.log)"),
              "DEBUG halvorn: Testing the halvorn logger...;"
              "DEBUG hvdeploy-detail: Testing the hvdeploy-detail logger...;");
}

TEST_F(LoggingTest, SaysWhyAPropertyFileIsRefused) {
    machine.Has(kConfig, "log4cpp.rootCategory=INFO, nobody\n");
    CapturedStreams streams;
    EXPECT_EQ(HV::ConfigureLogging(kConfig), 0);
    EXPECT_EQ(streams.Errors().rfind("Logging configuration error: ", 0), 0U) << streams.Errors();
    EXPECT_TRUE(EndsWith(streams.Errors(), "\n"));
}

TEST_F(LoggingTest, SaysThatThereIsNoPropertyFile) {
    CapturedStreams streams;
    EXPECT_EQ(HV::ConfigureLogging(R"(C:\none.cfg)"), 0);
    EXPECT_EQ(streams.Errors().rfind("Logging configuration error: ", 0), 0U) << streams.Errors();
}

// Last, for the environment: it is the machine's to put back.
TEST_F(LoggingTest, LogsBelowNoFolderWithoutTheVariable) {
    machine.HasFolder(R"(C:\Config)");
    ASSERT_NE(SetEnvironmentVariableA("PROGRAMDATA", ""), 0);
    EXPECT_EQ(HV::WriteLoggingConfig(kConfig, "a.log", ""), 1);
    EXPECT_EQ(machine.Content(kConfig), PropertyTextFor(R"(\Halvorn\Logs\a.log)"));
}

}  // namespace
