// Who may do what with the folders that the wizard's start leaves behind. Hosted only: Wine turns an access list into
// modes that do not keep the administrators and the users apart.
#include <gtest/gtest.h>

#include <log4cpp/Appender.hh>

#include <filesystem>

#include "hvframework/Log.h"
#include "installer/StartUp.h"
#include "platform/guarded_folder.h"
#include "platform/shared_directory.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/Machine.h"

namespace {

namespace host = std::filesystem;

const std::string kCompany = R"(C:\ProgramData\Halvorn)";

class HostedStartLoggingTest : public testing::Test {
protected:
    ~HostedStartLoggingTest() override {
        log4cpp::Appender::closeAll();
        log4cpp::Category::getRoot().removeAllAppenders();
    }

    static void Start() {
        CapturedStreams streams;
        HV::StartLogging();
    }

    [[nodiscard]] host::perms OthersRights(const std::string& path) const {
        return host::status(machine.HostName(path)).permissions() & host::perms::others_all;
    }

    Machine machine;
};

TEST_F(HostedStartLoggingTest, LeavesTheLogFoldersOpenAndNothingElse) {
    if (!platform::CanGuardFolders()) {
        GTEST_SKIP() << "only root guards folders";
    }
    // Open to everybody, as somebody may have left them.
    for (const char* folder :
         {"", R"(\uninstall)", R"(\.hvdeploy)", R"(\.hvdeploy\history)", R"(\Installer)", R"(\logs)"}) {
        platform::CreateSharedDirectory(kCompany + folder);
        ASSERT_EQ(OthersRights(kCompany + folder), host::perms::others_all) << folder;
    }
    Start();
    EXPECT_EQ(OthersRights(kCompany + R"(\logs)"), host::perms::others_all);
    int closed = 0;
    for (const char* folder :
         {"", R"(\uninstall)", R"(\.hvdeploy)", R"(\.hvdeploy\history)", R"(\Installer)", R"(\Logs)"}) {
        EXPECT_EQ(OthersRights(kCompany + folder), host::perms::others_read | host::perms::others_exec) << folder;
        ++closed;
    }
    EXPECT_EQ(closed, 6);
    // What is made below later is closed too, but for the folders that are made open.
    machine.HasFolder(kCompany + R"(\later)");
    EXPECT_EQ(OthersRights(kCompany + R"(\later)"), host::perms::others_read | host::perms::others_exec);
}

// What logging is configured from is in a folder of the run's own, so nobody else changes it in between.
TEST_F(HostedStartLoggingTest, KeepsOthersFromThePropertyFileThatItMakes) {
    Start();
    const auto entries = machine.TempEntries();
    ASSERT_EQ(entries.size(), 1U);
    EXPECT_EQ(OthersRights(machine.TempFolder() + "\\" + entries.front()), host::perms::none);
}

}  // namespace
