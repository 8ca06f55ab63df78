// The shipped program on a terminal. Only the hosted machine has terminals that a test can make and look at.
#include <gtest/gtest.h>
#include <poll.h>
#include <pty.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <cstdlib>

#include "platform/hosted/machine.h"
#include "tests/hvdeploy/TerminalPicture.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"

namespace {

constexpr int kPatienceMilliseconds = 60'000;

/// hvdeploy on a terminal of its own. What is still running when it goes is ended.
class Terminal {
public:
    explicit Terminal(std::vector<std::string> arguments) {
        std::string program = std::string(HV_PROGRAM_FOLDER) + "/hvdeploy";
        hosted::Machine::Current().GetRegistry().Flush();
        const std::string folder = hosted::Machine::Current().Folder();
        std::vector<char*> words{program.data()};
        for (std::string& argument : arguments) {
            words.push_back(argument.data());
        }
        words.push_back(nullptr);
        process_ = forkpty(&terminal_, nullptr, nullptr, nullptr);
        if (process_ == 0) {
            setenv("HV_MACHINE", folder.c_str(), 1);
            execv(program.c_str(), words.data());
            _exit(127);
        }
    }
    ~Terminal() {
        if (process_ > 0) {
            kill(process_, SIGKILL);
            waitpid(process_, nullptr, 0);
        }
        close(terminal_);
    }
    Terminal(const Terminal&) = delete;
    Terminal& operator=(const Terminal&) = delete;

    /// Reads on until the text has been printed; false when the program falls silent or ends before.
    bool Shows(const std::string& text) {
        while (output_.find(text) == std::string::npos) {
            if (!ReadMore()) {
                return false;
            }
        }
        return true;
    }
    void Type(char key) const { EXPECT_EQ(write(terminal_, &key, 1), 1); }

    /// The exit status, once everything has been read.
    int Wait() {
        while (ReadMore()) {
        }
        int status = 0;
        waitpid(process_, &status, 0);
        process_ = -1;
        return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    }
    [[nodiscard]] const std::string& Output() const { return output_; }

private:
    bool ReadMore() {
        pollfd wait{terminal_, POLLIN, 0};
        char part[4096];
        if (poll(&wait, 1, kPatienceMilliseconds) <= 0) {
            ADD_FAILURE() << "the program fell silent after:\n" << output_;
            kill(process_, SIGKILL);
            return false;
        }
        const auto count = read(terminal_, part, sizeof part);
        if (count <= 0) {
            return false;
        }
        output_.append(part, static_cast<std::size_t>(count));
        return true;
    }

    pid_t process_ = -1;
    int terminal_ = -1;
    std::string output_;
};

class TerminalTest : public testing::Test {
protected:
    using Lines = std::vector<std::string>;

    static PackageBuilder Glow() {
        return PackageBuilder("com.halvorn.glow")
            .Payload("resource")
            .To("programdata", "Halvorn")
            .File("Glow.txt", "new");
    }
    Machine machine;
};

TEST_F(TerminalTest, ShowsTheBarToTheEndOfTheRun) {
    (void)Glow().WriteTo(R"(C:\Packages)");
    Terminal terminal({R"(dir=C:\Packages)", "loglevel=emerg"});
    EXPECT_EQ(terminal.Wait(), 0);
    const std::string& output = terminal.Output();
    EXPECT_EQ(output.rfind("[........................]   1% Preparing to install...", 0), 0U) << output;
    EXPECT_NE(output.find("Installing com.halvorn.glow.hvpkg..."), std::string::npos) << output;
    EXPECT_EQ(TerminalPicture(output),
              (Lines{"[########################] 100% Installation complete.", "hvdeploy: installed"}));
}

TEST_F(TerminalTest, KeepsTheBarBelowTheLog) {
    (void)Glow().WriteTo(R"(C:\Packages)");
    Terminal terminal({R"(dir=C:\Packages)"});
    EXPECT_EQ(terminal.Wait(), 0);
    Lines lines = TerminalPicture(terminal.Output());
    ASSERT_GT(lines.size(), 20U);
    EXPECT_EQ(lines.back(), "hvdeploy: installed");
    lines.pop_back();
    for (std::size_t i = 0; i + 1 < lines.size(); ++i) {
        EXPECT_NE(lines[i].rfind('[', 0), 0U) << "a bar was left behind: " << lines[i];
    }
    EXPECT_NE(lines[lines.size() - 2].find(" DEBUG hvdeploy-detail : "), std::string::npos);
    EXPECT_EQ(lines.back(), "[########################] 100% Installation complete.");
}

TEST_F(TerminalTest, LeavesTheBarWhereAFailedRunCameToAHalt) {
    Terminal terminal({R"(dir=C:\Nothing)", "loglevel=emerg"});
    EXPECT_EQ(terminal.Wait(), 1);
    EXPECT_EQ(TerminalPicture(terminal.Output()),
              (Lines{"[........................]   1% An error occurred during installation.",
                     "hvdeploy: failed; nothing was installed"}));
}

TEST_F(TerminalTest, PrintsAListWithoutABar) {
    Terminal terminal({"list=hosts", "loglevel=emerg"});
    EXPECT_EQ(terminal.Wait(), 0);
    EXPECT_EQ(TerminalPicture(terminal.Output()), Lines{"[]"});
}

TEST_F(TerminalTest, ShowsNoBarForABadArgument) {
    Terminal terminal({"--help", "loglevel=emerg"});
    EXPECT_EQ(terminal.Wait(), 1);
    EXPECT_EQ(TerminalPicture(terminal.Output()),
              Lines{"hvdeploy: bad arguments; run hvdeploy without any to see its options"});
}

/// A run that stands in a script, which does not hear of the interrupt and ends when the test lets it.
///
/// The script keeps talking: a thread sanitizer hands signals over only between two calls of the runtime, so a reader
/// that waits for a silent script would never hear of the interrupt.
class InterruptTest : public TerminalTest {
protected:
    InterruptTest() {
        machine.Has(R"(C:\ProgramData\Halvorn\Glow.txt)", "old");
        const std::string go = machine.HostName(R"(C:\go)");
        (void)Glow()
            .Postflight("trap '' INT TERM; : > " + machine.HostName(R"(C:\up)") + "; while [ ! -e " + go +
                        " ]; do echo waiting; sleep 0.05; done")
            .Payload("resource")
            .To("programdata", "Halvorn")
            .File("Second.txt", "second")
            .WriteTo(R"(C:\Packages)");
    }

    /// Comes back once the script is there and has shut its ears. All before is read: an interrupt empties the
    /// terminal.
    void WaitForTheScript(Terminal& terminal) const {
        ASSERT_TRUE(terminal.Shows("Running postflight command")) << terminal.Output();
        for (int waited = 0; !machine.Exists(R"(C:\up)"); ++waited) {
            ASSERT_LT(waited, 6000) << "the script did not start";
            usleep(10'000);
        }
    }

    void ExpectUndone(Terminal& terminal) {
        ASSERT_TRUE(terminal.Shows("CRIT hvdeploy-detail : Cancel invoked")) << terminal.Output();
        machine.Has(R"(C:\go)", "");
        EXPECT_EQ(terminal.Wait(), 1);
        EXPECT_NE(terminal.Output().find("INFO hvdeploy-detail : Installation cancelled"), std::string::npos);
        EXPECT_EQ(machine.Content(R"(C:\ProgramData\Halvorn\Glow.txt)"), "old");
        EXPECT_FALSE(machine.Exists(R"(C:\ProgramData\Halvorn\Second.txt)"));
        EXPECT_TRUE(machine.TempEntries().empty());
        const Lines lines = TerminalPicture(terminal.Output());
        ASSERT_GE(lines.size(), 2U);
        EXPECT_NE(lines[lines.size() - 2].find("100% An error occurred during installation."), std::string::npos);
        EXPECT_EQ(lines.back(), "hvdeploy: failed and undone");
    }
};

TEST_F(InterruptTest, UndoesTheRunAfterControlC) {
    Terminal terminal({R"(dir=C:\Packages)"});
    WaitForTheScript(terminal);
    EXPECT_EQ(machine.Content(R"(C:\ProgramData\Halvorn\Glow.txt)"), "new");
    terminal.Type('\x03');
    ExpectUndone(terminal);
}

TEST_F(InterruptTest, GoesOnUndoingAfterASecondControlC) {
    Terminal terminal({R"(dir=C:\Packages)"});
    WaitForTheScript(terminal);
    terminal.Type('\x03');
    ASSERT_TRUE(terminal.Shows("CRIT hvdeploy-detail : Cancel invoked")) << terminal.Output();
    terminal.Type('\x03');
    ExpectUndone(terminal);
}

}  // namespace
