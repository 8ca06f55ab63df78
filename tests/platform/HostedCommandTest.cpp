// What /bin/sh makes of command lines and scripts on the hosted machine.
#include <gtest/gtest.h>
#include <sys/resource.h>

#include <atomic>
#include <cerrno>
#include <string>
#include <thread>
#include <vector>

#include "platform/hosted/machine.h"
#include "platform/win32.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/Machine.h"

namespace {

struct ChildResult {
    std::string output;
    int code = 0;
};

ChildResult RunLine(const std::string& line) {
    ChildResult run;
    FILE* const stream = _popen(line.c_str(), "r");
    if (stream == nullptr) {
        ADD_FAILURE() << "no pipe for " << line;
        return run;
    }
    for (int character = std::fgetc(stream); character != EOF; character = std::fgetc(stream)) {
        run.output += static_cast<char>(character);
    }
    run.code = _pclose(stream);
    return run;
}

class HostedCommandTest : public testing::Test {
protected:
    ChildResult RunScript(const std::string& content) {
        machine.Has(R"(C:\Users\Public\run.bat)", content);
        return RunLine(R"("C:\Users\Public\run.bat")");
    }

    Machine machine;
};

/// No more files can be opened while it lives.
class NoMoreFiles {
public:
    NoMoreFiles() {
        getrlimit(RLIMIT_NOFILE, &before_);
        rlimit none = before_;
        none.rlim_cur = 0;
        setrlimit(RLIMIT_NOFILE, &none);
    }
    ~NoMoreFiles() { setrlimit(RLIMIT_NOFILE, &before_); }
    NoMoreFiles(const NoMoreFiles&) = delete;
    NoMoreFiles& operator=(const NoMoreFiles&) = delete;

private:
    rlimit before_{};
};

}  // namespace

TEST_F(HostedCommandTest, ReachesTheMachineByItsVariable) {
    machine.Has(R"(C:\ProgramData\note.txt)", "from the machine");
    EXPECT_EQ(RunLine("cat \"$HV_MACHINE/drive_c/ProgramData/note.txt\"").output, "from the machine");
}

TEST_F(HostedCommandTest, WorksInTheDirectoryOfItsParent) {
    EXPECT_EQ(RunLine("test . -ef \"" + std::string("/proc/$PPID/cwd") + "\"").code, 0);
}

TEST_F(HostedCommandTest, TellsAScriptItsOwnName) {
    const ChildResult run = RunScript("echo \"$0\"");
    EXPECT_EQ(run.output, machine.HostName(R"(C:\Users\Public\run.bat)") + "\n");
}

TEST_F(HostedCommandTest, GivesTheCodeOfAScriptThatTrapsItsOwnExit) {
    EXPECT_EQ(RunScript("trap 'echo bye' EXIT\nexit 3\n").code, 3);
}

TEST_F(HostedCommandTest, GivesTheCodeOfTheProgramThatTheShellBecomes) {
    EXPECT_EQ(RunScript("exec sh -c 'exit 7'\n").code, 7);
}

TEST_F(HostedCommandTest, GivesTheCodeOfTheLastCommand) {
    EXPECT_EQ(RunLine("true; false").code, 1);
}

TEST_F(HostedCommandTest, GivesAnInterruptedProgramsCodeWhenASignalEndsTheShell) {
    EXPECT_EQ(RunLine("kill -9 $$").code, static_cast<int>(0xC000013A));
}

TEST_F(HostedCommandTest, FailsForAFileThatDoesNotExist) {
    CapturedStreams streams;
    EXPECT_EQ(RunLine(R"("C:\Users\Public\none.bat")").code, 127);
}

TEST_F(HostedCommandTest, HandsALineWithTwoQuotedWordsToTheShell) {
    machine.Has(R"(C:\Users\Public\run.bat)", "echo script");
    EXPECT_EQ(RunLine("\"echo\" \"two words\"").output, "two words\n");
}

TEST_F(HostedCommandTest, KnowsReadingOnly) {
    EXPECT_EQ(_popen("echo hello", "w"), nullptr);
    EXPECT_EQ(errno, EINVAL);
}

TEST_F(HostedCommandTest, GivesNoStreamWhenNoPipeCanBeMade) {
    const NoMoreFiles limit;
    EXPECT_EQ(_popen("echo hello", "r"), nullptr);
}

TEST_F(HostedCommandTest, RefusesToCloseAStreamThatIsNotItsOwn) {
    EXPECT_EQ(_pclose(stdin), -1);
    EXPECT_EQ(errno, EINVAL);
}

// A child that held the writing end of another's pipe would keep it open, and the reader of the short one would wait
// for the long one.
TEST_F(HostedCommandTest, LeaksNoPipeIntoTheChildrenOfOtherThreads) {
    constexpr int threads = 8;
    constexpr int rounds = 10;
    const std::string line = "ls /proc/$$/fd";
    const std::string alone = RunLine(line).output;
    std::atomic<int> right{0};
    std::vector<std::thread> crowd;
    for (int i = 0; i < threads; ++i) {
        crowd.emplace_back([&] {
            for (int round = 0; round < rounds; ++round) {
                right += RunLine(line).output == alone ? 1 : 0;
            }
        });
    }
    for (std::thread& thread : crowd) {
        thread.join();
    }
    EXPECT_EQ(right, threads * rounds);
}
