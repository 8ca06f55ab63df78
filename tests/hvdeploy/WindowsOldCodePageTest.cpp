// A process in the system's code page, as all are on Windows before version 1903, whose Temp folder is named beyond
// ASCII. The hosted machine has no code pages.
#include <gtest/gtest.h>

#include "hvdeploy/src/Deploy.h"
#include "hvframework/FileUtils.h"
#include "platform/win32.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"

namespace {

// Its last letter has two bytes in UTF-8 and one in the code page 1252.
constexpr const wchar_t* kTemp = L"C:\\Ren\u00e9";
constexpr const char* kTempInUtf8 = "C:\\Ren\xC3\xA9";

bool HasEntries(const std::wstring& folder) {
    return !fs::is_empty(fs::path(folder));
}

class OldCodePageTest : public testing::Test {
protected:
    OldCodePageTest() {
        machine.HasFolder(kTempInUtf8);
        EXPECT_NE(SetEnvironmentVariableW(L"Temp", kTemp), 0);
    }

    static PackageBuilder Glow() {
        return PackageBuilder("com.halvorn.glow")
            .Payload("resource")
            .To("programdata", "Halvorn")
            .File("Glow.txt", "new");
    }

    Machine machine;
    LogRecorder log;
};

TEST_F(OldCodePageTest, IsWhatThisProcessHas) {
    EXPECT_EQ(GetACP(), 1252U);
    EXPECT_EQ(HVL::FileUtils::GetTempDirectory(), "C:\\Ren\xE9");
}

TEST_F(OldCodePageTest, PathsAreReadAndWrittenInIt) {
    EXPECT_EQ(fs::path("C:\\Ren\xE9").native(), kTemp);
    EXPECT_EQ(fs::path(kTemp).string(), "C:\\Ren\xE9");
    EXPECT_EQ(fs::path(L"\u4e2d\u0101.txt").string(), "??.txt") << "no letter that only looks alike";
}

TEST_F(OldCodePageTest, InstallsThroughATemporaryFolderBeyondAscii) {
    machine.Has(R"(C:\ProgramData\Halvorn\Glow.txt)", "old");
    {
        HV::Deploy engine(nullptr);
        EXPECT_TRUE(HasEntries(kTemp)) << "the stash";
        EXPECT_EQ(engine.DeployPackages({Glow().WriteTo(R"(C:\Packages)")}), HV::kPlaced) << log.Text();
    }
    EXPECT_EQ(machine.Content(R"(C:\ProgramData\Halvorn\Glow.txt)"), "new");
    EXPECT_FALSE(HasEntries(kTemp));
}

TEST_F(OldCodePageTest, UndoesAFailedRunThroughATemporaryFolderBeyondAscii) {
    machine.Has(R"(C:\ProgramData\Halvorn\Glow.txt)", "old");
    {
        HV::Deploy engine(nullptr);
        EXPECT_TRUE(HasEntries(kTemp)) << "the stash";
        EXPECT_TRUE(HV::IsFailure(engine.DeployPackages(
            {Glow().Payload("resource").To("nowhere").File("x", "x").WriteTo(R"(C:\Packages)")})));
    }
    EXPECT_EQ(machine.Content(R"(C:\ProgramData\Halvorn\Glow.txt)"), "old");
    EXPECT_FALSE(HasEntries(kTemp));
}

}  // namespace
