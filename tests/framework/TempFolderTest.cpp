#include "hvframework/TempFolder.h"

#include <gtest/gtest.h>

#include <atomic>
#include <filesystem>
#include <fstream>
#include <thread>

#include "hvframework/FileUtils.h"
#include "tests/support/Machine.h"

namespace HVL {
namespace {

constexpr const char* kFolder = R"(C:\T\mine)";

/// What another program does that may do as it likes in the folder above: moves the folder away and puts its own, with
/// its own file, in the place.
void TakePlaceOf(const std::filesystem::path& folder, const std::filesystem::path& away) {
    std::error_code error;
    std::filesystem::rename(folder, away, error);
    if (!error && std::filesystem::create_directory(folder, error)) {
        std::ofstream(folder / "script", std::ios::binary) << "planted";
    }
}

class TempFolderTest : public testing::Test {
protected:
    static TempFolder Mine() {
        return TempFolder([] { return std::string(kFolder); });
    }

    Machine machine;
};

}  // namespace

TEST_F(TempFolderTest, IsANewFolderInTheFolderForTemporaryFiles) {
    const TempFolder folder("hvdeploystash");
    ASSERT_TRUE(folder.IsThere());
    EXPECT_TRUE(FileUtils::DirectoryExists(folder.Path()));
    const std::vector<std::string> entries = machine.TempEntries();
    ASSERT_EQ(entries.size(), 1U);
    EXPECT_EQ(entries[0].rfind("hvdeploystash", 0), 0U) << entries[0];
    EXPECT_EQ(FileUtils::GetFileName(folder.Path()), entries[0]);
}

TEST_F(TempFolderTest, LeavesANameAloneThatIsThereAndTakesTheNext) {
    machine.Has(R"(C:\T\first\planted)", "x");
    machine.Has(R"(C:\T\second)", "a file");
    int name = 0;
    const TempFolder folder([&] {
        constexpr const char* kNames[] = {R"(C:\T\first)", R"(C:\T\second)", R"(C:\T\third)"};
        return std::string(kNames[name++]);
    });
    EXPECT_EQ(name, 3);
    EXPECT_EQ(folder.Path(), R"(C:\T\third)");
    EXPECT_EQ(machine.Content(R"(C:\T\first\planted)"), "x");
    EXPECT_EQ(machine.Content(R"(C:\T\second)"), "a file");
}

TEST_F(TempFolderTest, IsNoneWhenEveryNameIsTaken) {
    machine.HasFolder(kFolder);
    int asked = 0;
    const TempFolder folder([&] {
        ++asked;
        return std::string(kFolder);
    });
    EXPECT_FALSE(folder.IsThere());
    EXPECT_EQ(folder.Path(), "");
    EXPECT_GT(asked, 1);
}

TEST_F(TempFolderTest, MakesTheFolderAboveItWhenThatIsMissing) {
    const TempFolder folder = Mine();
    EXPECT_TRUE(folder.IsThere());
    EXPECT_TRUE(machine.Exists(kFolder));
}

TEST_F(TempFolderTest, IsNoneWhereItCannotBeMade) {
    machine.Has(R"(C:\T)", "a file where the folder above should be");
    EXPECT_FALSE(Mine().IsThere());
}

TEST_F(TempFolderTest, CanBeDeletedWhenItHasBeenLetGo) {
    TempFolder folder = Mine();
    machine.Has(R"(C:\T\mine\deep\file)", "x");
    folder.LetGo();
    EXPECT_FALSE(folder.IsThere());
    EXPECT_EQ(FileUtils::DeleteFileOrDirectory(kFolder), 0);
    EXPECT_FALSE(machine.Exists(kFolder));
}

// The attacker is another thread here: a system that is asked to rename a folder that is held open does not ask which
// program holds it. Hosted the renaming succeeds, as the host's does, and must not help.
TEST_F(TempFolderTest, IsReachedByItsPathWhateverHappensToItsName) {
    constexpr int kRounds = 50;
    int attacks = 0;
    for (int round = 0; round < kRounds; ++round) {
        SCOPED_TRACE(round);
        const std::string path = R"(C:\T\mine)" + std::to_string(round);
        const std::string script = path + R"(\script)";
        // Names of the host: another program does not go by what this one holds.
        const std::string name = machine.HostName(path);
        std::atomic<bool> over = false;
        std::atomic<int> tried = 0;
        std::thread attacker([&] {
            for (int i = 0; !over; ++i, ++tried) {
                TakePlaceOf(name, name + "." + std::to_string(i));
            }
        });
        const TempFolder folder([&] { return path; });
        if (folder.IsThere()) {
            machine.Has(script, "honest");
            const int before = tried;
            while (tried < before + 3) {
                std::this_thread::yield();
            }
            EXPECT_EQ(machine.Content(script), "honest");
            ++attacks;
        }
        over = true;
        attacker.join();
    }
    EXPECT_GT(attacks, kRounds / 2);
}

}  // namespace HVL
