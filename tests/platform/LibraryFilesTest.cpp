#include <gtest/gtest.h>

#include <cstdio>
#include <log4cpp/Category.hh>
#include <log4cpp/FileAppender.hh>
#include <log4cpp/PropertyConfigurator.hh>
#include <string>

#include "platform/libraries.h"
#include "tests/support/Machine.h"

namespace {

constexpr const char* PropertyFile = "C:\\ProgramData\\log.properties";
constexpr const char* LogFile = "C:\\ProgramData\\the.log";

class LibraryFilesTest : public testing::Test {
protected:
    /// What the log library holds open, no machine can be rid of.
    static void EndLogging() {
        log4cpp::Appender::closeAll();
        log4cpp::Category::shutdown();
    }

    /// Sets the log library up by a file with this value for the appender's file, and writes one line.
    void LogTo(const std::string& fileName) {
        machine.Has(PropertyFile,
                    "log4cpp.rootCategory=INFO, A\r\n"
                    "log4cpp.appender.A=FileAppender\r\n"
                    "# log4cpp.appender.A.fileName=not this\r\n"
                    "log4cpp.folder=C:\\ProgramData\r\n"
                    "log4cpp.appender.A.fileName = " +
                        fileName +
                        "\r\n"
                        "log4cpp.appender.A.layout=PatternLayout\r\n"
                        "log4cpp.appender.A.layout.ConversionPattern=[%p] %m%n\r\n");
        log4cpp::PropertyConfigurator::configure(platform::LibraryPropertyFile(PropertyFile));
        log4cpp::Category::getRoot().info("hello");
        EndLogging();
    }

    Machine machine;
};

TEST_F(LibraryFilesTest, TheLogLibraryWritesWhereItsPropertyFileSays) {
    LogTo(LogFile);
    EXPECT_EQ(machine.Content(LogFile).rfind("[INFO] hello", 0), 0u);
}

TEST_F(LibraryFilesTest, TheLogLibraryWritesToTheNameThatItIsGiven) {
    auto* appender = new log4cpp::FileAppender("test", platform::LibraryFileName(LogFile));
    log4cpp::Category& category = log4cpp::Category::getInstance("library-files-test");
    category.addAppender(appender);
    category.info("hello");
    EndLogging();
    EXPECT_NE(machine.Content(LogFile).find("hello"), std::string::npos);
}

TEST_F(LibraryFilesTest, APropertyFileThatIsMissingIsTheLibrarysToReport) {
    EXPECT_THROW(log4cpp::PropertyConfigurator::configure(platform::LibraryPropertyFile("C:\\none.properties")),
                 log4cpp::ConfigureFailure);
}

}  // namespace
