#include <gtest/gtest.h>

#include <filesystem>
#include <sstream>

#include "tests/support/Faults.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"
#include "tools/hvpack/Commands.h"

// Packages are often made where Windows' rules for names do not hold. On Windows no such folder can be there to begin
// with, and no disk is full on demand, so these tests exist for the hosted target alone.

namespace {

/// Tries to make a package of C:\glow and gives what was said about it.
std::string Refusal() {
    std::ostringstream out;
    std::ostringstream err;
    EXPECT_EQ(HVPack::RunCommand({"make", R"(C:\glow)", R"(C:\glow.hvpkg)"}, out, err), 1);
    EXPECT_EQ(out.str(), "");
    return err.str();
}

TEST(HvpackHosted, RefusesNamesThatWindowsReadsOtherwise) {
    int tried = 0;
    for (const std::string name : {"aux.txt", "trailing.", "stream:x", "COM7"}) {
        Machine machine;
        machine.Has(R"(C:\glow\_hvmanifest.xml)", PackageBuilder("com.halvorn.glow").Manifest());
        machine.HasFolder(R"(C:\glow\sub)");
        std::filesystem::copy_file(machine.HostName(R"(C:\glow\_hvmanifest.xml)"),
                                   machine.HostName(R"(C:\glow\sub)") + "/" + name);
        EXPECT_EQ(Refusal(), "hvpack: the name sub/" + name + " cannot be unpacked on Windows\n");
        EXPECT_FALSE(machine.Exists(R"(C:\glow.hvpkg)"));
        ++tried;
    }
    EXPECT_EQ(tried, 4);
}

TEST(HvpackHosted, RefusesLinks) {
    Machine machine;
    machine.Has(R"(C:\glow\_hvmanifest.xml)", PackageBuilder("com.halvorn.glow").Manifest());
    std::filesystem::create_directory_symlink(machine.HostName(R"(C:\glow)"),
                                              machine.HostName(R"(C:\glow)") + "/itself");
    EXPECT_EQ(Refusal(), "hvpack: itself/ is neither a file nor a folder\n");
}

TEST(HvpackHosted, RefusesAReleaseWithTwoPackagesThatAreOneOnWindows) {
    Machine machine;
    (void)PackageBuilder("com.halvorn.glow").Named("glow.zip").WriteTo(R"(C:\packages)");
    (void)PackageBuilder("com.halvorn.glow").Named("Glow.zip").WriteTo(R"(C:\packages)");
    std::ostringstream out;
    std::ostringstream err;
    EXPECT_EQ(HVPack::RunCommand({"table", R"(C:\packages)"}, out, err), 1);
    EXPECT_EQ(err.str(), "hvpack: Glow.zip and glow.zip are one name on Windows\n");
    EXPECT_EQ(out.str(), "");
}

TEST(HvpackHosted, KeepsTheOlderTableWhenTheDiskIsFull) {
    Machine machine;
    (void)PackageBuilder("com.halvorn.glow").WriteTo(R"(C:\packages)");
    machine.Has(R"(C:\rows.cpp)", "the older one");
    MachineFaults faults(machine);
    faults.LimitSpace(100);
    std::ostringstream out;
    std::ostringstream err;
    EXPECT_EQ(HVPack::RunCommand({"table", R"(C:\packages)", R"(C:\rows.cpp)"}, out, err), 1);
    EXPECT_EQ(err.str(), "hvpack: cannot write C:\\rows.cpp\n");
    EXPECT_EQ(machine.Content(R"(C:\rows.cpp)"), "the older one");
    EXPECT_FALSE(machine.Exists(R"(C:\rows.cpp.part)"));
}

}  // namespace
