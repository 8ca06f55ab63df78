// Child processes through the runtime's calls. The lines are such that both command processors know them.
#include <gtest/gtest.h>

#include <string>

#include "platform/win32.h"
#include "tests/support/Machine.h"

namespace {

std::string ReadToEnd(FILE* stream) {
    std::string text;
    char piece[128];
    while (std::fgets(piece, sizeof piece, stream) != nullptr) {
        text += piece;
    }
    return text;
}

class CommandTest : public testing::Test {
protected:
    Machine machine;
};

int ExitCodeOf(const std::string& line) {
    FILE* const stream = _popen(line.c_str(), "r");
    if (stream == nullptr) {
        ADD_FAILURE() << "no pipe for " << line;
        return -1;
    }
    (void)ReadToEnd(stream);
    return _pclose(stream);
}

}  // namespace

TEST_F(CommandTest, GivesWhatTheChildPrints) {
    FILE* const stream = _popen("echo hello", "r");
    ASSERT_NE(stream, nullptr);
    EXPECT_EQ(ReadToEnd(stream), "hello\n");
    EXPECT_EQ(_pclose(stream), 0);
}

TEST_F(CommandTest, GivesTheExitCodeAsItStands) {
    int seen = 0;
    for (const int code : {0, 1, 3, 127, 255, 256, 512, 70000}) {
        EXPECT_EQ(ExitCodeOf("exit " + std::to_string(code)), code);
        ++seen;
    }
    EXPECT_EQ(seen, 8);
}

TEST_F(CommandTest, RunsTheFileThatIsTheWholeLine) {
    const std::string script = R"(C:\Users\Public\a script.bat)";
    machine.Has(script, "exit 515\n");
    EXPECT_EQ(ExitCodeOf("\"" + script + "\""), 515);
}

TEST_F(CommandTest, ClosesAStreamThatHasNotBeenReadToItsEnd) {
    const std::string script = R"(C:\Users\Public\many.bat)";
    std::string lines;
    for (int i = 0; i < 2000; ++i) {
        lines += "echo " + std::string(100, 'x') + "\n";
    }
    machine.Has(script, lines);
    FILE* const stream = _popen(("\"" + script + "\"").c_str(), "r");
    ASSERT_NE(stream, nullptr);
    char first[16];
    EXPECT_NE(std::fgets(first, sizeof first, stream), nullptr);
    (void)_pclose(stream);
}
