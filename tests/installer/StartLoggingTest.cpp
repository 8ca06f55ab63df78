// The wizard's log: whose property file it obeys, and where it goes when there is none.
#include <gtest/gtest.h>

#include <log4cpp/Appender.hh>
#include <log4cpp/Category.hh>
#include <log4cpp/Priority.hh>

#include <filesystem>

#include "hvframework/Log.h"
#include "installer/StartUp.h"
#include "platform/filesystem.h"
#include "platform/guarded_folder.h"
#include "platform/win32.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/Machine.h"

// The library hands the appenders of a property file to nobody, and loses sight of the first round's when the second
// makes others of their names. Their files are closed; the few bytes live until the process ends, which the leak
// sanitizer would take for ours. It asks for its exceptions under this name.
extern "C" const char* __lsan_default_suppressions();  // NOLINT(bugprone-reserved-identifier): the sanitizer's own
extern "C" const char* __lsan_default_suppressions() {
    return "leak:log4cpp::PropertyConfiguratorImpl\nleak:log4cpp::PatternLayout\n";
}

namespace {

using log4cpp::Category;
using log4cpp::Priority;

constexpr const char* kPropertyFile = R"(C:\ProgramData\Halvorn\Installer\halvorn.logging.config)";
constexpr const char* kDefaultLog = R"(C:\ProgramData\Halvorn\Logs\Tessaly Suite Installer.log)";

std::size_t CountOf(const std::string& part, const std::string& text) {
    std::size_t count = 0;
    for (auto at = text.find(part); at != std::string::npos; at = text.find(part, at + part.size())) {
        ++count;
    }
    return count;
}

class StartLoggingTest : public testing::Test {
protected:
    StartLoggingTest() { Reset(); }
    ~StartLoggingTest() override { Reset(); }

    /// The categories as a process has them before anybody sets them up, and their files closed.
    static void Reset() {
        log4cpp::Appender::closeAll();
        for (Category* category : {&HVL::Log::General(), &HVL::Log::Detail()}) {
            category->removeAllAppenders();
            category->setPriority(Priority::NOTSET);
        }
        Category::getRoot().removeAllAppenders();
        Category::setRootPriority(Priority::INFO);
    }

    /// Starts logging, and logs a line to each category at the lowest priority.
    void Start() {
        CapturedStreams streams;
        HV::StartLogging();
        priorities = {HVL::Log::General().getPriority(), HVL::Log::Detail().getPriority()};
        HVL_LOG(Debug, "a line");
        HVL_LOG_TO(HVL::Log::General(), Debug, "another");
        output = streams.Output();
        errors = streams.Errors();
        Reset();
    }

    void ExpectEverythingIsLogged() const {
        EXPECT_EQ(priorities, (std::vector<int>{Priority::DEBUG, Priority::DEBUG}));
    }

    /// A property file that logs to `C:\Own\own.log`, in one line, from this priority on.
    static std::string OwnProperties(const std::string& priority) {
        return "log4cpp.rootCategory=" + priority +
               ", file\n"
               "log4cpp.appender.file=FileAppender\n"
               "log4cpp.appender.file.fileName=C:\\Own\\own.log\n"
               "log4cpp.appender.file.layout=PatternLayout\n"
               "log4cpp.appender.file.layout.ConversionPattern=%p %c: %m;\n";
    }

    /// The file that the start-up has made in the folder for temporary files.
    [[nodiscard]] std::string GeneratedFile() const {
        const auto entries = machine.TempEntries();
        EXPECT_EQ(entries.size(), 1U);
        if (entries.empty()) {
            return {};
        }
        EXPECT_EQ(entries.front().rfind("tmp", 0), 0U) << entries.front();
        return machine.TempFolder() + "\\" + entries.front() + R"(\hvinstaller.cfg)";
    }

    Machine machine;
    std::vector<int> priorities;
    std::string output;
    std::string errors;
};

std::string GeneratedText(const std::string& logFile) {
    return "log4cpp.rootCategory=INFO, console, servicelog\r\n"
           "log4cpp.appender.servicelog.maxFileSize=104857600\r\n"
           "log4cpp.appender.servicelog.maxBackupIndex=10\r\n"
           "log4cpp.appender.servicelog.layout=PatternLayout\r\n"
           "log4cpp.appender.servicelog.layout.ConversionPattern=%d{%y-%m-%d %H:%M:%S} [%p] %c: %m%n\r\n"
           "log4cpp.appender.servicelog=RollingFileAppender\r\n"
           "log4cpp.appender.servicelog.fileName=" +
           logFile +
           "\r\n"
           "log4cpp.appender.console=ConsoleAppender\r\n"
           "log4cpp.appender.console.layout=PatternLayout\r\n"
           "log4cpp.appender.console.layout.ConversionPattern=%d{%y-%m-%d %H:%M:%S} [%p] %c: %m%n";
}

TEST_F(StartLoggingTest, ObeysThePropertyFileOfTheMachineAndLeavesItAlone) {
    machine.HasFolder(R"(C:\Own)");
    machine.Has(kPropertyFile, OwnProperties("INFO"));
    const auto before = machine.Files();
    Start();
    EXPECT_EQ(machine.Content(R"(C:\Own\own.log)"), "DEBUG hvdeploy-detail: a line;DEBUG halvorn: another;");
    EXPECT_EQ(machine.Content(kPropertyFile), OwnProperties("INFO"));
    EXPECT_EQ(machine.Files().size(), before.size() + 1) << "nothing but the log was made";
    EXPECT_TRUE(machine.TempEntries().empty());
    EXPECT_EQ(errors, "");
    ExpectEverythingIsLogged();
}

TEST_F(StartLoggingTest, TestsTheLogTwiceAndLogsEveryOtherLineOnce) {
    machine.HasFolder(R"(C:\Own)");
    machine.Has(kPropertyFile, OwnProperties("DEBUG"));
    Start();
    const std::string test =
        "DEBUG halvorn: Testing the halvorn logger...;"
        "DEBUG hvdeploy-detail: Testing the hvdeploy-detail logger...;";
    EXPECT_EQ(machine.Content(R"(C:\Own\own.log)"),
              test + test + "DEBUG hvdeploy-detail: a line;DEBUG halvorn: another;");
}

// A file that something still holds open is not renamed on Windows.
TEST_F(StartLoggingTest, LetsALogThatIsFullBeRolledOver) {
    machine.HasFolder(R"(C:\Own)");
    machine.Has(R"(C:\Own\own.log)", std::string(100, '.'));
    machine.Has(kPropertyFile,
                "log4cpp.rootCategory=INFO, file\n"
                "log4cpp.appender.file=RollingFileAppender\n"
                "log4cpp.appender.file.maxFileSize=100\n"
                "log4cpp.appender.file.maxBackupIndex=1\n"
                "log4cpp.appender.file.fileName=C:\\Own\\own.log\n"
                "log4cpp.appender.file.layout=PatternLayout\n"
                "log4cpp.appender.file.layout.ConversionPattern=%m;\n");
    Start();
    EXPECT_EQ(machine.Content(R"(C:\Own\own.log.1)").substr(0, 100), std::string(100, '.'));
    EXPECT_EQ(CountOf("another;", machine.Content(R"(C:\Own\own.log)")), 1U);
}

TEST_F(StartLoggingTest, LogsEverythingWhateverThePropertyFileSays) {
    machine.HasFolder(R"(C:\Own)");
    machine.Has(kPropertyFile, OwnProperties("ERROR") +
                                   "log4cpp.category.halvorn=CRIT\n"
                                   "log4cpp.category.hvdeploy-detail=EMERG\n");
    Start();
    ExpectEverythingIsLogged();
    EXPECT_EQ(machine.Content(R"(C:\Own\own.log)"), "DEBUG hvdeploy-detail: a line;DEBUG halvorn: another;");
}

TEST_F(StartLoggingTest, LeavesThresholdsOfThePropertyFileAsTheyAre) {
    machine.HasFolder(R"(C:\Own)");
    machine.Has(kPropertyFile, OwnProperties("INFO") + "log4cpp.appender.file.threshold=ERROR\n");
    Start();
    EXPECT_EQ(machine.Content(R"(C:\Own\own.log)"), "");
    ExpectEverythingIsLogged();
}

TEST_F(StartLoggingTest, GoesOnWithAPropertyFileThatIsRefused) {
    machine.Has(kPropertyFile, "log4cpp.rootCategory=INFO, nobody\n");
    Start();
    ExpectEverythingIsLogged();
    EXPECT_EQ(CountOf("Logging configuration error: ", errors), 2U) << errors;
    EXPECT_TRUE(machine.TempEntries().empty()) << "a bad file is not replaced";
}

TEST_F(StartLoggingTest, MakesAPropertyFileWhereThereIsNone) {
    Start();
    EXPECT_EQ(machine.Content(GeneratedFile()), GeneratedText(kDefaultLog));
    EXPECT_FALSE(machine.Exists(R"(C:\ProgramData\Halvorn\Installer)"));
    EXPECT_EQ(errors, "");
    ExpectEverythingIsLogged();
}

TEST_F(StartLoggingTest, LogsToTheDefaultPlaceAndToTheConsoleWithTheMadeFile) {
    Start();
    const std::string text = machine.Content(kDefaultLog);
    EXPECT_EQ(CountOf(" [DEBUG] hvdeploy-detail: a line", text), 1U) << text;
    EXPECT_EQ(CountOf(" [DEBUG] halvorn: another", text), 1U) << text;
    EXPECT_EQ(CountOf("Testing the", text), 0U) << text;
    EXPECT_EQ(CountOf(" [DEBUG] hvdeploy-detail: a line\n", output), 1U) << output;
}

TEST_F(StartLoggingTest, MakesANewPropertyFileAtEachStart) {
    Start();
    Start();
    EXPECT_EQ(machine.TempEntries().size(), 2U);
    EXPECT_EQ(CountOf(" [DEBUG] hvdeploy-detail: a line", machine.Content(kDefaultLog)), 2U);
}

TEST_F(StartLoggingTest, TakesADirectoryOfThatNameForAMissingFile) {
    machine.HasFolder(kPropertyFile);
    Start();
    EXPECT_EQ(machine.Content(GeneratedFile()), GeneratedText(kDefaultLog));
    EXPECT_TRUE(machine.Exists(kPropertyFile));
    EXPECT_FALSE(machine.HasFile(kPropertyFile));
    EXPECT_EQ(errors, "");
}

TEST_F(StartLoggingTest, GoesOnWhereTheLogFolderCannotBeMade) {
    machine.Has(R"(C:\ProgramData\Halvorn)", "in the way");
    Start();
    EXPECT_EQ(machine.Content(GeneratedFile()), GeneratedText(kDefaultLog));
    EXPECT_EQ(machine.Content(R"(C:\ProgramData\Halvorn)"), "in the way");
    EXPECT_EQ(CountOf("Logging configuration error: cannot open log file ", errors), 2U) << errors;
    EXPECT_EQ(CountOf("Tessaly Suite Installer.log\n", errors), 2U) << errors;
    ExpectEverythingIsLogged();
}

TEST_F(StartLoggingTest, ReportsEveryLogFileThatCannotBeOpenedAndWritesTheOthers) {
    machine.HasFolder(R"(C:\Own)");
    machine.HasFolder(R"(C:\Own\folder.log)");
    machine.Has(kPropertyFile, OwnProperties("INFO") +
                                   "log4cpp.category.halvorn=INFO, folder, rolling\n"
                                   "log4cpp.category.hvdeploy-detail=INFO, folder\n"
                                   "log4cpp.appender.folder=FileAppender\n"
                                   "log4cpp.appender.folder.fileName=C:\\Own\\folder.log\n"
                                   "log4cpp.appender.folder.layout=BasicLayout\n"
                                   "log4cpp.appender.rolling=RollingFileAppender\n"
                                   "log4cpp.appender.rolling.fileName=C:\\None\\rolling.log\n"
                                   "log4cpp.appender.rolling.layout=BasicLayout\n");
    Start();
    EXPECT_EQ(CountOf("Logging configuration error: cannot open log file ", errors), 4U) << errors;
    EXPECT_EQ(CountOf("folder.log\n", errors), 2U) << errors;
    EXPECT_EQ(CountOf("rolling.log\n", errors), 2U) << errors;
    EXPECT_EQ(machine.Content(R"(C:\Own\own.log)"), "DEBUG hvdeploy-detail: a line;DEBUG halvorn: another;");
}

TEST_F(StartLoggingTest, GoesOnWhereTheTemporaryFolderCannotBeMade) {
    machine.Has(R"(C:\file)", "in the way");
    ASSERT_NE(SetEnvironmentVariableA("Temp", R"(C:\file)"), 0);
    Start();
    EXPECT_EQ(machine.Content(R"(C:\file)"), "in the way");
    EXPECT_EQ(CountOf("Logging configuration error: ", errors), 2U) << errors;
    EXPECT_FALSE(machine.Exists(kDefaultLog));
    ExpectEverythingIsLogged();
}

// A second name of a file is what everybody can make without being seen as its owner.
TEST_F(StartLoggingTest, DoesNotObeyAPropertyFileThatMayBeAnybodys) {
    if (!platform::CanGuardFolders()) {
        GTEST_SKIP() << "only root guards folders";
    }
    machine.HasFolder(R"(C:\Own)");
    machine.Has(R"(C:\Own\planted)", OwnProperties("INFO"));
    machine.HasFolder(R"(C:\ProgramData\Halvorn\Installer)");
    std::filesystem::create_hard_link(machine.HostName(R"(C:\Own\planted)"), machine.HostName(kPropertyFile));
    Start();
    EXPECT_FALSE(machine.Exists(R"(C:\Own\own.log)"));
    EXPECT_FALSE(machine.Exists(kPropertyFile));
    const std::string text = machine.Content(kDefaultLog);
    EXPECT_EQ(CountOf(std::string(" [WARN] hvdeploy-detail: somebody else than an administrator may have made ") +
                          kPropertyFile + "; it is not used, and now it is C:\\ProgramData\\Halvorn\\set-aside-",
                      text),
              1U)
        << text;
}

// Without the variable the places are below the root of the current drive, as their names then say.
TEST_F(StartLoggingTest, LooksAtTheRootOfTheDriveWithoutTheVariable) {
    const fs::path folder = fs::current_path();
    machine.HasFolder(R"(C:\Own)");
    machine.Has(R"(C:\Halvorn\Installer\halvorn.logging.config)", OwnProperties("INFO"));
    fs::current_path(fs::path("C:\\"));
    ASSERT_NE(SetEnvironmentVariableA("ProgramData", ""), 0);
    Start();
    fs::current_path(folder);
    EXPECT_EQ(machine.Content(R"(C:\Own\own.log)"), "DEBUG hvdeploy-detail: a line;DEBUG halvorn: another;");
}

TEST_F(StartLoggingTest, NamesALogBelowTheRootOfTheDriveWithoutTheVariable) {
    const fs::path folder = fs::current_path();
    fs::current_path(fs::path("C:\\"));
    ASSERT_NE(SetEnvironmentVariableA("ProgramData", ""), 0);
    Start();
    fs::current_path(folder);
    EXPECT_EQ(machine.Content(GeneratedFile()), GeneratedText(R"(\Halvorn\Logs\Tessaly Suite Installer.log)"));
    ExpectEverythingIsLogged();
}

}  // namespace
