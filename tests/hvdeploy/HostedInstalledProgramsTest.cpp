// Only the hosted machine's registry can be made to refuse something.
#include <gtest/gtest.h>

#include "hvdeploy/src/UninstallScripts.h"
#include "tests/hvdeploy/UninstallTest.h"
#include "tests/support/Faults.h"
#include "tests/support/Machine.h"

namespace {

class RefusingRegistryTest : public testing::Test {
protected:
    RefusingRegistryTest() {
        machine.Has(kScriptPath, "echo");
        machine.Loads("REGEDIT4\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Microsoft\\Windows\\CurrentVersion\\Uninstall]\n");
        before = machine.Registry();
    }

    Machine machine;
    MachineFaults faults{machine};
    std::string before;
};

}  // namespace

TEST_F(RefusingRegistryTest, LeavesNoEntryWhenItRefusesTheKey) {
    faults.FailNth(hosted::Operation::RegistrySet, 1);
    HV::OSRegisterUninstall(kScriptPath, Tessaly());
    EXPECT_EQ(machine.Registry(), before);
}

TEST_F(RefusingRegistryTest, LosesOneValueAndNoOtherWhenItRefusesThat) {
    const std::vector<std::string> names{"DisplayName", "MajorVersion", "MinorVersion", "UninstallString",
                                         "Publisher",   "InstallDate",  "NoRepair",     "NoModify"};
    for (std::size_t lost = 0; lost < names.size(); ++lost) {
        HVL::ProductData product = Tessaly();
        product.SetValue("version", std::to_string(lost));
        faults.FailNth(hosted::Operation::RegistrySet, lost + 2);
        HV::OSRegisterUninstall(kScriptPath, product);
        faults.Disarm();
        const std::string registry = machine.Registry();
        const std::string entry = registry.substr(registry.find("Tessaly Suite v" + std::to_string(lost)));
        std::size_t kept = 0;
        for (const std::string& name : names) {
            const std::string section = entry.substr(0, entry.find("\n\n"));
            kept += section.find("\"" + name + "\"=") != std::string::npos ? 1 : 0;
        }
        EXPECT_EQ(kept, names.size() - 1) << entry;
        EXPECT_EQ(entry.substr(0, entry.find("\n\n")).find("\"" + names[lost] + "\"="), std::string::npos) << entry;
    }
}
