// Only the hosted machine's disk can be filled on demand.
#include <gtest/gtest.h>

#include "hvdeploy/src/UninstallScripts.h"
#include "tests/hvdeploy/UninstallTest.h"
#include "tests/support/Faults.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"

TEST(StandaloneScriptOnAFullDisk, GetsTheLostLinesWithTheNextSegment) {
    Machine machine;
    MachineFaults faults(machine);
    HV::Package package(PackageBuilder("com.halvorn.glow").WriteTo(R"(C:\Packages)"));
    HV::UninstallScripts scripts;
    std::string path;
    const std::vector<std::string> files{std::string(3000, 'a'), std::string(3000, 'b')};
    faults.LimitSpace(4000);
    EXPECT_TRUE(scripts.WriteStandaloneUninstallScript(path, files, package, Tessaly(), ""));
    const std::string before = machine.HasFile(path) ? machine.Content(path) : "";
    EXPECT_EQ(before.find(DeleteOnDisk(files[1])), std::string::npos);
    faults.Disarm();
    EXPECT_TRUE(scripts.WriteStandaloneUninstallScript(path, files, package, Tessaly(), ""));
    EXPECT_NE(machine.Content(path).find(DeleteOnDisk(files[1])), std::string::npos);
}
