#include "hvframework/FileVersion.h"

#include <gtest/gtest.h>

#include <string>

#include "tests/hosts/TestExecutables.h"
#include "tests/support/Machine.h"

namespace {

class FileVersion : public testing::Test {
protected:
    /// Asks with a version that still holds the text of an earlier question.
    bool Ask(const std::string& path) {
        version.text = "9.9.9";
        return HVL::GetFileVersion(path, version);
    }

    Machine machine;
    HVL::Version version;
};

TEST_F(FileVersion, IsTheProductVersionWithoutItsFourthNumber) {
    EXPECT_TRUE(Ask(TestExecutable("both-versions")));
    EXPECT_EQ(version.text, "13.0.5");
}

TEST_F(FileVersion, IsTheFileVersionWhereTheProductVersionIsZero) {
    EXPECT_TRUE(Ask(TestExecutable("file-version")));
    EXPECT_EQ(version.text, "12.1.0");
}

TEST_F(FileVersion, IsTheProductVersionAsSoonAsEitherHalfOfItIsNotZero) {
    EXPECT_TRUE(Ask(TestExecutable("upper-half")));
    EXPECT_EQ(version.text, "13.300.0");
    EXPECT_TRUE(Ask(TestExecutable("lower-half")));
    EXPECT_EQ(version.text, "0.0.65535");
}

TEST_F(FileVersion, IsNotThereWithoutAVersionBlock) {
    EXPECT_FALSE(Ask(TestExecutable("no-version")));
    EXPECT_EQ(version.text, "");
}

TEST_F(FileVersion, IsReadFromAFileOfTheMachine) {
    machine.Has(R"(C:\Program Files\Host ä\host.exe)", TestExecutableBytes("both-versions"));
    EXPECT_TRUE(Ask(R"(C:\Program Files\Host ä\host.exe)"));
    EXPECT_EQ(version.text, "13.0.5");
}

TEST_F(FileVersion, IsNotThereForAFileThatDoesNotExist) {
    EXPECT_FALSE(Ask(R"(C:\nowhere\host.exe)"));
    EXPECT_EQ(version.text, "");
}

TEST_F(FileVersion, IsNotThereForAnEmptyPath) {
    EXPECT_FALSE(Ask(""));
    EXPECT_EQ(version.text, "");
}

TEST_F(FileVersion, IsNotThereForAFolder) {
    machine.HasFolder(R"(C:\host.exe)");
    EXPECT_FALSE(Ask(R"(C:\host.exe)"));
}

TEST_F(FileVersion, IsNotThereForAFileThatIsNoExecutable) {
    machine.Has(R"(C:\host.exe)", "MZ is how an executable begins, and that is all that this has of one.");
    EXPECT_FALSE(Ask(R"(C:\host.exe)"));
    machine.Has(R"(C:\empty.exe)", "");
    EXPECT_FALSE(Ask(R"(C:\empty.exe)"));
}

}  // namespace
