// Another account that may do as it likes in the folder for temporary files attacks runs, by plain polling: whatever
// appears there is moved away and something else put in its place. Hosted only, where the attacker can be another
// account; and only root can take one.
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <fstream>

#include "hvframework/FileUtils.h"
#include "tests/hvdeploy/engine/EngineTest.h"
#include "tests/support/Stranger.h"

namespace {

namespace host = std::filesystem;

constexpr int kRounds = 50;
constexpr const char* kAway = ".away";
constexpr const char* kMark = R"(C:\mark)";
constexpr const char* kPlaced = R"(C:\ProgramData\Halvorn\glow.dll)";

void Write(const host::path& file, const std::string& text) {
    std::ofstream(file, std::ios::binary) << text;
}

/// The first folder in `temp` whose name begins with `prefix` and that has not been moved away yet; else empty.
host::path FindFolder(const host::path& temp, const std::string& prefix) {
    std::error_code error;
    for (const auto& entry : host::directory_iterator(temp, error)) {
        const std::string name = entry.path().filename();
        if (name.rfind(prefix, 0) == 0 && !name.ends_with(kAway)) {
            return entry.path();
        }
    }
    return {};
}

/// Moves the folder away once `ripe` is in it, or at once where nobody else may look into it, and puts an empty one in
/// its place. True when that was done.
bool TakePlaceOf(const host::path& folder, const std::string& ripe) {
    const bool closed = access(folder.c_str(), R_OK | X_OK) != 0;
    if (!closed && access((folder / ripe).c_str(), F_OK) != 0) {
        return false;
    }
    return std::rename(folder.c_str(), (folder.string() + kAway).c_str()) == 0 && mkdir(folder.c_str(), 0777) == 0;
}

class AttackTest : public testing::Test {
protected:
    void SetUp() override {
        if (!Stranger::CanBe()) {
            GTEST_SKIP() << "only root can play another account";
        }
    }

    /// The folder for temporary files is the stranger's, as the elevated program of a user finds that user's own.
    static host::path StrangersTemp(const Machine& machine) {
        host::permissions(machine.HostName(R"(C:\)") + "/..", host::perms(0755));
        const std::string temp = machine.HostName(machine.TempFolder());
        Stranger::Owns(temp);
        return temp;
    }

    static bool HasMoved(const host::path& temp) {
        return std::ranges::any_of(host::directory_iterator(temp),
                                   [](const auto& entry) { return entry.path().filename().string().ends_with(kAway); });
    }

    /// A package whose script says who wrote it, and whose payload does.
    static PackageBuilder Honest() {
        return PackageBuilder("com.halvorn.glow")
            .Payload("resource")
            .To("programdata", "Halvorn")
            .File("glow.dll", "honest")
            .PreflightXml(R"(<preflight source="scripts/mark.sh"/>)")
            .File("scripts/mark.sh", "echo honest > \"$HV_MACHINE/drive_c/mark\"\n");
    }

    static void Plant(const host::path& folder) {
        host::create_directories(folder / "scripts");
        Write(folder / "glow.dll", "planted");
        Write(folder / "scripts/mark.sh", "echo planted > \"$HV_MACHINE/drive_c/mark\"\n");
    }
};

}  // namespace

TEST_F(AttackTest, NeverHasAnotherScriptRunOrAnotherPayloadPlaced) {
    int attacked = 0;
    for (int round = 0; round < kRounds; ++round) {
        SCOPED_TRACE(round);
        Machine machine;
        const fs::path package = Honest().WriteTo(kPackages);
        const host::path temp = StrangersTemp(machine);
        const Stranger stranger([&] {
            const host::path folder = FindFolder(temp, "tmp");
            if (!folder.empty() && TakePlaceOf(folder, "scripts/mark.sh")) {
                Plant(folder);
            }
        });
        HV::EngineResult result = 0;
        {
            HV::Deploy engine(nullptr);
            result = engine.DeployPackage(package);
        }
        // He can still be in the way, as with his own folder he may be.
        EXPECT_TRUE(result == 1 || HV::IsFailure(result)) << result;
        if (result == 1 || machine.HasFile(kMark)) {
            EXPECT_EQ(machine.Content(kMark), "honest\n");
        }
        if (result == 1 || machine.HasFile(kPlaced)) {
            EXPECT_EQ(machine.Content(kPlaced), "honest");
        }
        attacked += result == 1 && HasMoved(temp) ? 1 : 0;
    }
    EXPECT_GT(attacked, kRounds / 2) << "the stranger came too late too often to have proved anything";
}

TEST_F(AttackTest, NeverHasAnotherFilePutBack) {
    int attacked = 0;
    for (int round = 0; round < kRounds; ++round) {
        SCOPED_TRACE(round);
        Machine machine;
        machine.Has(R"(C:\ProgramData\Halvorn\glow.dll)", "the machine's own");
        const host::path temp = StrangersTemp(machine);
        const Stranger stranger([&] {
            const host::path stash = FindFolder(temp, "hvdeploystash");
            std::error_code error;
            for (const auto& item : host::directory_iterator(stash, error)) {
                const std::string name = item.path().filename();
                if (TakePlaceOf(stash, name)) {
                    Write(stash / name, "planted");
                }
            }
            if (!stash.empty() && error) {
                (void)TakePlaceOf(stash, "");
            }
        });
        {
            HV::DeployRollback rollback;
            rollback.StashExistingFile(fs::path(R"(C:\ProgramData\Halvorn\glow.dll)"));
            usleep(20000);  // what a run does between
            rollback.Rollback();
        }
        EXPECT_EQ(machine.Content(R"(C:\ProgramData\Halvorn\glow.dll)"), "the machine's own");
        attacked += HasMoved(temp) ? 1 : 0;
    }
    EXPECT_GT(attacked, kRounds / 2) << "the stranger came too late too often to have proved anything";
}

// A folder that he may write, and that a run deletes: what a payload placed in a folder for everybody, or his own that
// was moved aside. Between the listing and the entering each folder in it becomes a link, and a folder again.
TEST_F(AttackTest, NeverHasAFolderEmptiedThatALinkNames) {
    constexpr int kFolders = 40;
    for (int round = 0; round < kRounds; ++round) {
        SCOPED_TRACE(round);
        Machine machine;
        machine.Has(R"(C:\Kept\precious)", "x");
        host::permissions(machine.HostName(R"(C:\)") + "/..", host::perms(0755));
        const std::string root = machine.HostName(R"(C:\Shared\Glow)");
        const std::string kept = machine.HostName(R"(C:\Kept)");
        machine.HasFolder(R"(C:\Shared\Glow)");
        for (int i = 0; i < kFolders; ++i) {
            const std::string folder = root + "/" + std::to_string(i);
            machine.Has(R"(C:\Shared\Glow\)" + std::to_string(i) + R"(\a)", "x");
            host::create_directory_symlink(kept, folder + kAway);
            Stranger::Owns(folder);
        }
        Stranger::Owns(root);
        int turn = 0;
        const Stranger stranger([&, turn]() mutable {
            const std::string folder = root + "/" + std::to_string(turn++ % kFolders);
            renameat2(AT_FDCWD, folder.c_str(), AT_FDCWD, (folder + kAway).c_str(), RENAME_EXCHANGE);
        });
        for (int i = 0; i < 5 && machine.Exists(R"(C:\Shared\Glow)"); ++i) {
            (void)HVL::FileUtils::DeleteFileOrDirectory(R"(C:\Shared\Glow)");
        }
        EXPECT_TRUE(machine.HasFile(R"(C:\Kept\precious)"));
    }
}
