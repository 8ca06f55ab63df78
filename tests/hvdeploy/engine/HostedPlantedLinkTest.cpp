// Links on the way to where payloads go. Only hosted they can be another account's, and only root can make them so.
#include <sys/stat.h>
#include <unistd.h>

#include <cstdio>
#include <filesystem>

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

// The folders of a payload are made and filled one after the other. Here each is everybody's from its first moment on,
// and becomes a link as soon as it is seen.
TEST_F(StrangersLinkTest, InPlaceOfAFolderThatHasJustBeenMadeIsNotFilled) {
    constexpr int kRounds = 10;
    constexpr int kFolders = 30;
    PackageBuilder bundle = PackageBuilder("com.halvorn.glow").Payload("presets").To("commondocs", "Halvorn");
    bundle.Folder("bundle").Source("bundle");
    for (int i = 0; i < kFolders; ++i) {
        const std::string folder = "bundle/" + std::to_string(i);
        bundle.File(folder + "/deeper/a", "new").File(folder + "/b", "new");
    }
    const fs::path package = bundle.WriteTo(kPackages);
    namespace host = std::filesystem;
    host::permissions(machine.HostName(R"(C:\)") + "/..", host::perms(0755));
    machine.HasFolder(kVictim);
    ASSERT_EQ(chmod(machine.HostName(kVictim).c_str(), 0777), 0);
    machine.HasFolder(kShared);
    Stranger::Owns(machine.HostName(kShared));
    const std::string shared = machine.HostName(kShared);
    const std::string victim = machine.HostName(kVictim);
    const mode_t mask = umask(0);
    for (int round = 0; round < kRounds; ++round) {
        SCOPED_TRACE(round);
        const Stranger stranger([&] {
            std::error_code error;
            for (host::recursive_directory_iterator at(shared, error), end; !error && at != end; at.increment(error)) {
                if (host::is_directory(at->symlink_status(error)) && at->path().extension() != ".away") {
                    const std::string folder = at->path();
                    if (std::rename(folder.c_str(), (folder + ".away").c_str()) == 0) {
                        (void)!symlink(victim.c_str(), folder.c_str());
                    }
                }
            }
        });
        HV::Deploy other(nullptr);
        (void)other.DeployPackage(package);
        EXPECT_TRUE(host::is_empty(victim));
    }
    umask(mask);
    bool moved = false;
    for (const auto& entry : host::recursive_directory_iterator(shared)) {
        moved |= entry.path().extension() == ".away";
    }
    EXPECT_TRUE(moved) << "the stranger came too late to have proved anything";
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
