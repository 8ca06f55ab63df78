// What the removal of the sample release can be asked for without running it: its script names what was installed, and
// nothing of anybody else.
#include <memory>

#include "tests/hvdeploy/SampleRelease.h"

namespace {

class SampleReleaseTest : public testing::Test {
protected:
    using Files = SampleInstallation::Files;

    static void SetUpTestSuite() { release = std::make_unique<SampleInstallation>(); }
    static void TearDownTestSuite() { release.reset(); }

    inline static std::unique_ptr<SampleInstallation> release;
};

bool IsBelow(const std::string& path, const std::string& folder) {
    return path.starts_with(folder + '\\');
}

std::string FolderOf(const std::string& path) {
    return path.substr(0, path.rfind('\\'));
}

std::string NameOf(const std::string& path) {
    return path.substr(path.rfind('\\') + 1);
}

}  // namespace

TEST_F(SampleReleaseTest, GoesToEveryHostAndTouchesNoFileOfOthers) {
    EXPECT_EQ(release->result.exitStatus, 0) << release->result.output;
    EXPECT_GT(release->installed.size(), 150U);
    std::size_t untouched = 0;
    const Files after = release->FilesBesideTheRelease();
    for (const auto& [path, content] : release->before) {
        EXPECT_TRUE(after.count(path) != 0 && after.at(path) == content) << path;
        ++untouched;
    }
    EXPECT_EQ(untouched, 11U);
    EXPECT_TRUE(release->machine.TempEntries().empty());
}

TEST_F(SampleReleaseTest, HasOneRemovalScriptThatTheListOfProgramsNames) {
    ASSERT_EQ(release->scripts.size(), 1U);
    EXPECT_EQ(release->scripts.begin()->first,
              R"(C:\ProgramData\Halvorn\uninstall\uninstall-com.halvorn.tessaly-suite_v4.2.0.bat)");
    const std::string registry = release->machine.Registry();
    EXPECT_NE(registry.find("[" + std::string(SampleInstallation::kEntry) + "]"), std::string::npos);
    EXPECT_NE(registry.find(R"("UninstallString"="\"C:\\ProgramData\\Halvorn\\uninstall\\uninstall-com.halvorn.)"
                            R"(tessaly-suite_v4.2.0.bat\"")"),
              std::string::npos)
        << registry;
}

TEST_F(SampleReleaseTest, HasARemovalScriptThatNamesEveryInstalledFile) {
    ASSERT_EQ(release->scripts.size(), 1U);
    const std::set<std::string> deleted = release->Deleted(release->scripts.begin()->second);
    std::size_t byName = 0;
    std::size_t byFolder = 0;
    for (const auto& file : release->installed) {
        if (deleted.count(file.first) != 0) {
            ++byName;
            continue;
        }
        // An item that is a folder is named as one.
        std::string folder = FolderOf(file.first);
        while (folder.size() > 2 && deleted.count(folder) == 0) {
            folder = FolderOf(folder);
        }
        EXPECT_GT(folder.size(), 2U) << file.first << " is named nowhere";
        ++byFolder;
    }
    EXPECT_GT(byName, 80U);
    EXPECT_GT(byFolder, 5U);
    EXPECT_EQ(byName + byFolder, release->installed.size());
}

// A line deletes the item of that name, in its folder and in the folders below; of a folder all files that it holds.
TEST_F(SampleReleaseTest, HasARemovalScriptThatNamesNothingElse) {
    ASSERT_EQ(release->scripts.size(), 1U);
    std::size_t lines = 0;
    for (const std::string& path : release->Deleted(release->scripts.begin()->second)) {
        EXPECT_TRUE(std::any_of(release->installed.begin(), release->installed.end(),
                                [&](const auto& file) { return file.first == path || IsBelow(file.first, path); }))
            << path << " was not installed";
        for (const auto& file : release->before) {
            EXPECT_FALSE(file.first == path || IsBelow(file.first, path)) << path << " takes " << file.first;
            EXPECT_FALSE(IsBelow(file.first, FolderOf(path)) && NameOf(file.first) == NameOf(path))
                << path << " takes " << file.first;
        }
        ++lines;
    }
    EXPECT_GT(lines, 100U);
}
