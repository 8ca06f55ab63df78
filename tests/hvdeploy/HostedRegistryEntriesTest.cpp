// Only the hosted machine's registry can be made to refuse a value.
#include "platform/win32.h"
#include "tests/hvdeploy/SideActionsTest.h"
#include "tests/support/Faults.h"

namespace {

class BrokenRegistryTest : public SideActionsTest {
protected:
    BrokenRegistryTest() {
        entry.os = "windows";
        entry.key = R"(SOFTWARE\Halvorn)";
        entry.name = "Folder";
        machine.Loads("REGEDIT4\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Halvorn]\n");
    }

    HV::RegistryEntry entry;
    MachineFaults faults{machine};
};

}  // namespace

TEST_F(BrokenRegistryTest, FailsTheEntryWithItsOwnCode) {
    faults.FailNth(hosted::Operation::RegistrySet, 1);
    EXPECT_GT(engine.MakeRegistryEntry(entry), 1);
}

TEST_F(BrokenRegistryTest, FailsTheEntryWhoseKeyItDoesNotMake) {
    entry.key = R"(SOFTWARE\Halvorn\Glow)";
    faults.FailNth(hosted::Operation::RegistrySet, 1);
    EXPECT_EQ(engine.MakeRegistryEntry(entry), -1);
}

TEST_F(BrokenRegistryTest, UndoesThePackageThatNeedsIt) {
    const PackageBuilder package = PackageBuilder("com.halvorn.glow")
                                       .Payload("resource")
                                       .To("programdata", "Halvorn")
                                       .File("Glow.txt", "text")
                                       .RegistryEntry("", R"(SOFTWARE\Halvorn)", "Folder", "value", "windows")
                                       .Postflight("echo never");
    faults.FailNth(hosted::Operation::RegistrySet, 1);
    const HV::EngineResult result = Deploy(package);
    EXPECT_GT(result, 1);
    EXPECT_TRUE(
        log.Has(ErrorLine("Installation cannot complete, rolling back; error value is " + std::to_string(result))));
    EXPECT_FALSE(machine.Exists(R"(C:\ProgramData\Halvorn\Glow.txt)"));
    EXPECT_FALSE(log.Has(DebugLine("Postflight command: echo never")));
}
