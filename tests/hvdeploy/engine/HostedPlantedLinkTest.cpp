// Links on the way to where payloads go. Only hosted they can be another account's, and only root can make them so.
#include <unistd.h>

#include "tests/hvdeploy/engine/EngineTest.h"
#include "tests/support/Faults.h"
#include "tests/support/Stranger.h"

namespace {

constexpr const char* kShared = R"(C:\Users\Public\Documents\Halvorn)";
constexpr const char* kVictim = R"(C:\Windows\system32\Halvorn)";

class PlantedLinkTest : public EngineTest {
protected:
    void Link(const std::string& path, const std::string& target) {
        ASSERT_EQ(symlink(machine.HostName(target).c_str(), machine.HostName(path).c_str()), 0) << path;
    }
    /// The link at `path` itself becomes another account's.
    void ByStranger(const std::string& path) {
        ASSERT_EQ(lchown(machine.HostName(path).c_str(), 65534, 65534), 0) << path;
    }

    static PackageBuilder Presets() {
        return PackageBuilder("com.halvorn.glow")
            .Payload("presets")
            .To("commondocs", "Halvorn")
            .File("soft.ffx", "new soft");
    }
};

class StrangersLinkTest : public PlantedLinkTest {
protected:
    void SetUp() override {
        if (!Stranger::CanBe()) {
            GTEST_SKIP() << "only root can hand a link over to another account";
        }
    }
};

}  // namespace

TEST_F(StrangersLinkTest, FailsAPayloadThatWouldGoThroughIt) {
    machine.Has(std::string(kVictim) + R"(\soft.ffx)", "the system's own");
    Link(kShared, kVictim);
    ByStranger(kShared);
    EXPECT_EQ(Install({Presets()}), -2);
    EXPECT_EQ(machine.Content(std::string(kVictim) + R"(\soft.ffx)"), "the system's own");
    EXPECT_TRUE(log.Has(ErrorLine(R"(refusing to go through the link at C:\users\Public\Documents\Halvorn to )"
                                  R"("C:\Users\Public\Documents\Halvorn": whoever made it is no administrator)")))
        << log.Text();
    EXPECT_TRUE(HasRolledBack());
}

TEST_F(StrangersLinkTest, FailsAPayloadWhoseFolderWouldBeMadeThroughIt) {
    machine.HasFolder(kVictim);
    Link(kShared, kVictim);
    ByStranger(kShared);
    const PackageBuilder deep = PackageBuilder("com.halvorn.glow")
                                    .Payload("presets")
                                    .To("commondocs", R"(Halvorn\Glow\Presets)")
                                    .File("soft.ffx", "new soft");
    EXPECT_EQ(Install({deep}), -2);
    EXPECT_FALSE(machine.Exists(std::string(kVictim) + R"(\Glow)"));
}

TEST_F(StrangersLinkTest, IsLeftAloneOnTheWayBack) {
    machine.Has(std::string(kVictim) + R"(\soft.ffx)", "the system's own");
    HV::DeployRollback rollback;
    machine.Has(std::string(kShared) + R"(\soft.ffx)", "placed");
    rollback.AddInstalledFile("glow", "presets", fs::path(std::string(kShared) + R"(\soft.ffx)"));
    fs::rename(fs::path(kShared), fs::path(std::string(kShared) + ".away"));
    Link(kShared, kVictim);
    ByStranger(kShared);
    rollback.Rollback();
    EXPECT_EQ(machine.Content(std::string(kVictim) + R"(\soft.ffx)"), "the system's own");
    EXPECT_EQ(log.LinesStartingWith(ErrorLine("refusing to go through the link at ")).size(), 1U) << log.Text();
}

TEST_F(StrangersLinkTest, InPlaceOfTheItemItselfIsMovedAside) {
    machine.Has(std::string(kVictim) + R"(\kept)", "the system's own");
    machine.HasFolder(kShared);
    const std::string item = std::string(kShared) + R"(\soft.ffx)";
    Link(item, std::string(kVictim) + R"(\new)");
    ByStranger(item);
    EXPECT_EQ(Install({Presets()}), 1);
    EXPECT_FALSE(machine.Exists(std::string(kVictim) + R"(\new)"));
    EXPECT_EQ(machine.Content(item), "new soft");
}

TEST_F(PlantedLinkTest, OfARightfulOwnerIsFollowed) {
    machine.HasFolder(R"(C:\Other disk\Halvorn)");
    Link(kShared, R"(C:\Other disk\Halvorn)");
    EXPECT_EQ(Install({Presets()}), 1);
    EXPECT_EQ(machine.Content(R"(C:\Other disk\Halvorn\soft.ffx)"), "new soft");
}

// What holds a folder must not hide its name from a disk that is told to break.
TEST_F(PlantedLinkTest, AndHoldingAtAllKeepNoLockFromHolding) {
    machine.Has(std::string(kShared) + R"(\soft.ffx)", "old soft");
    MachineFaults faults(machine);
    faults.Lock(std::string(kShared) + R"(\soft.ffx)");
    (void)Install({Presets()});
    EXPECT_EQ(machine.Content(std::string(kShared) + R"(\soft.ffx)"), "old soft");
}
