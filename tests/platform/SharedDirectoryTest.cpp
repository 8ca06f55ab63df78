#include "platform/shared_directory.h"

#include <gtest/gtest.h>

#include "tests/support/CapturedStreams.h"
#include "tests/support/FolderAccess.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"

namespace {

constexpr const char* kFolder = R"(C:\ProgramData\Halvorn)";

TEST(SharedDirectory, LetsOthersWrite) {
    Machine machine;
    platform::CreateSharedDirectory(kFolder);
    EXPECT_TRUE(machine.Exists(kFolder));
    EXPECT_TRUE(OthersMayWrite(machine, kFolder));
}

TEST(SharedDirectory, IsMadeBelowAnother) {
    Machine machine;
    platform::CreateSharedDirectory(kFolder);
    platform::CreateSharedDirectory(R"(C:\ProgramData\Halvorn\logs)");
    EXPECT_TRUE(OthersMayWrite(machine, R"(C:\ProgramData\Halvorn\logs)"));
}

TEST(SharedDirectory, KeepsTheAccessOfAFolderThatIsThere) {
    Machine machine;
    machine.HasFolder(kFolder);
    ASSERT_FALSE(OthersMayWrite(machine, kFolder));
    platform::CreateSharedDirectory(kFolder);
    EXPECT_FALSE(OthersMayWrite(machine, kFolder));
}

TEST(SharedDirectory, LetsOnlyItselfBeOpen) {
    Machine machine;
    machine.HasFolder(kFolder);
    platform::CreateSharedDirectory(R"(C:\ProgramData\Halvorn\logs)");
    EXPECT_FALSE(OthersMayWrite(machine, kFolder));
}

TEST(SharedDirectory, MayHaveANameBeyondAscii) {
    Machine machine;
    const std::string folder = "C:\\ProgramData\\Gemeinsam f\xC3\xBCr alle";
    platform::CreateSharedDirectory(folder);
    EXPECT_TRUE(OthersMayWrite(machine, folder));
}

TEST(SharedDirectory, IsPassedOverInSilenceWhenItCannotBeMade) {
    Machine machine;
    machine.Has(R"(C:\ProgramData\file)", "in the way");
    const LogRecorder log;
    CapturedStreams streams;
    const auto before = machine.Files();
    int folders = 0;
    for (const char* folder : {R"(C:\ProgramData\missing\logs)", R"(C:\ProgramData\file)",
                               R"(C:\ProgramData\file\logs)", R"(C:\ProgramData\a|b)", R"(Q:\logs)", ""}) {
        platform::CreateSharedDirectory(folder);
        ++folders;
    }
    EXPECT_EQ(folders, 6);
    EXPECT_EQ(machine.Files(), before);
    EXPECT_EQ(streams.Errors() + streams.Output() + log.Text(), "");
}

}  // namespace
