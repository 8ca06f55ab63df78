#include <gtest/gtest.h>

#include <filesystem>
#include <sstream>

#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"
#include "tools/hvpack/Commands.h"

// Packages are often made where Windows' rules for names do not hold. On Windows no such folder can be there to begin
// with, so these tests exist for the hosted target alone.

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

}  // namespace
