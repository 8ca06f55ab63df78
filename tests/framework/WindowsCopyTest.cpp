// A link among the folders that a copy fills. Wine makes no links and calls those of the host the user's, whom an
// elevated program does not trust; hosted, HostedPlantedLinkTest.cpp has another account put links there.
#include <gtest/gtest.h>

#include <filesystem>

#include "hvframework/FileUtils.h"
#include "platform/held_folder.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/HostLink.h"
#include "tests/support/Machine.h"

namespace {

class CopyOntoALink : public testing::Test {
protected:
    CopyOntoALink() {
        machine.Has(R"(C:\source\sub\a)", "new");
        machine.HasFolder(R"(C:\victim)");
    }

    Machine machine;
};

TEST_F(CopyOntoALink, IsRefusedWhereItIsAFolderInTheTree) {
    machine.HasFolder(R"(C:\target)");
    const HostLink link(machine, R"(C:\target\sub)", R"(C:\victim)");
    CapturedStreams streams;
    EXPECT_EQ(HVL::FileUtils::CopyFileOrDirectory(R"(C:\source)", R"(C:\target)"), -1);
    EXPECT_TRUE(std::filesystem::is_empty(machine.HostName(R"(C:\victim)")));
    EXPECT_EQ(streams.Errors(), "ERROR: refusing to copy into the link at C:\\target\\sub\n");
}

TEST_F(CopyOntoALink, IsRefusedWhereItIsTheDestination) {
    const HostLink link(machine, R"(C:\target)", R"(C:\victim)");
    CapturedStreams streams;
    EXPECT_EQ(HVL::FileUtils::CopyFileOrDirectory(R"(C:\source)", R"(C:\target)"), -1);
    EXPECT_TRUE(std::filesystem::is_empty(machine.HostName(R"(C:\victim)")));
}

TEST_F(CopyOntoALink, IsRefusedForAFolderThatWasMadeJustBefore) {
    const HostLink link(machine, R"(C:\target)", R"(C:\victim)");
    bool isLink = false;
    EXPECT_EQ(platform::HoldOwnFolder(R"(C:\target)", isLink), nullptr);
    EXPECT_TRUE(isLink);
    EXPECT_NE(platform::HoldOwnFolder(R"(C:\victim)", isLink), nullptr);
    EXPECT_FALSE(isLink);
    EXPECT_EQ(platform::HoldOwnFolder(R"(C:\none)", isLink), nullptr);
    EXPECT_FALSE(isLink);
}

}  // namespace
