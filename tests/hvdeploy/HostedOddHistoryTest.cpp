// Items of a history folder that only the hosted machine's file system can hold: links onto nothing, pipes, and names
// that are no text.
#include <sys/stat.h>
#include <unistd.h>

#include <fstream>

#include "hvdeploy/src/InstalledHistory.h"
#include "tests/hvdeploy/CommandLineTest.h"
#include "tests/support/RunProgram.h"

namespace {

class HostedOddHistoryTest : public CommandLineTest {
protected:
    HostedOddHistoryTest() { machine.HasFolder(HV::HistoryFolder()); }

    std::string OnHost(const std::string& stem) const {
        return machine.HostName(HV::HistoryFolder()) + "/" + stem + "_hvmanifest.xml";
    }
    static std::string Listed() {
        const ProgramResult result = RunProgram("hvdeploy", {"list=installed", "loglevel=emerg"});
        EXPECT_EQ(result.exitStatus, 0);
        return result.output;
    }
};

TEST_F(HostedOddHistoryTest, ALinkOntoNothingIsNoRecord) {
    ASSERT_EQ(symlink("nowhere", OnHost("com.halvorn.glow_v9.0").c_str()), 0);
    EXPECT_EQ(Listed(), "");
}

// Opening it would wait for ever.
TEST_F(HostedOddHistoryTest, APipeIsNoRecord) {
    ASSERT_EQ(mkfifo(OnHost("com.halvorn.glow_v9.0").c_str(), 0600), 0);
    EXPECT_EQ(Listed(), "");
}

TEST_F(HostedOddHistoryTest, ANameThatIsNoTextKeepsTheOthersReadable) {
    std::ofstream(OnHost("com.halvorn.gl\xFFow_v9.0")) << "<x/>";
    std::ofstream(OnHost("com.halvorn.grain_v1.0")) << "<x/>";
    EXPECT_EQ(Listed(), "com.halvorn.gl\xEF\xBF\xBDow_v9.0\ncom.halvorn.grain_v1.0\n");
}

}  // namespace
