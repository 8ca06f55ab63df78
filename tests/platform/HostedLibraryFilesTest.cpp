// The private copy of a property file, which only the hosted target needs.

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <sstream>
#include <string>

#include "platform/libraries.h"
#include "tests/support/Machine.h"

namespace {

constexpr const char* PropertyFile = "C:\\ProgramData\\log.properties";

class HostedLibraryFilesTest : public testing::Test {
protected:
    static std::string ContentOnHost(const std::string& name) {
        std::ostringstream content;
        content << std::ifstream(name, std::ios::binary).rdbuf();
        return content.str();
    }
    std::string Converted(const std::string& content) {
        machine.Has(PropertyFile, content);
        return ContentOnHost(platform::LibraryPropertyFile(PropertyFile));
    }

    Machine machine;
};

TEST_F(HostedLibraryFilesTest, OnlyFileNamesAreTurnedIntoTheHosts) {
    EXPECT_EQ(
        Converted("a.fileName=C:\\ProgramData\\x.log\nb.other=C:\\ProgramData\\x.log\nno value\n"),
        "a.fileName=" + machine.HostName("C:\\ProgramData\\x.log") + "\nb.other=C:\\ProgramData\\x.log\nno value\n");
}

TEST_F(HostedLibraryFilesTest, VariablesAreTheMachines) {
    EXPECT_EQ(Converted("a.fileName=${ProgramData}\\x.log\n"),
              "a.fileName=" + machine.HostName("C:\\ProgramData\\x.log") + "\n");
}

TEST_F(HostedLibraryFilesTest, VariablesThatTheMachineLacksAreTakenFromEarlierLines) {
    EXPECT_EQ(Converted("folder=C:\\ProgramData\na.fileName=${folder}\\${nobody}x.log\n"),
              "folder=C:\\ProgramData\na.fileName=" + machine.HostName("C:\\ProgramData\\x.log") + "\n");
}

TEST_F(HostedLibraryFilesTest, TheCopyIsThisUsersAlone) {
    machine.Has(PropertyFile, "a=b\n");
    struct stat found {};
    ASSERT_EQ(::stat(platform::LibraryPropertyFile(PropertyFile).c_str(), &found), 0);
    EXPECT_EQ(found.st_mode & 0077, 0u);
}

TEST_F(HostedLibraryFilesTest, TheCopyIsRemovedWhenTheProcessEnds) {
    machine.Has(PropertyFile, "a=b\n");
    int names[2];
    ASSERT_EQ(::pipe(names), 0);
    const pid_t child = ::fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
        const std::string name = platform::LibraryPropertyFile(PropertyFile);
        const bool told = ::write(names[1], name.data(), name.size()) == static_cast<ssize_t>(name.size());
        std::exit(told && ::access(name.c_str(), R_OK) == 0 ? 0 : 1);
    }
    ::close(names[1]);
    std::string name(4096, '\0');
    name.resize(static_cast<std::size_t>(std::max<ssize_t>(0, ::read(names[0], name.data(), name.size()))));
    ::close(names[0]);
    int status = 0;
    ASSERT_EQ(::waitpid(child, &status, 0), child);
    EXPECT_EQ(status, 0);
    EXPECT_FALSE(name.empty());
    EXPECT_NE(::access(name.c_str(), F_OK), 0) << name;
}

}  // namespace
