// The entry in the system's list of installed programs.
#include <gtest/gtest.h>

#include <ctime>

#include "hvdeploy/src/UninstallScripts.h"
#include "tests/hvdeploy/UninstallTest.h"
#include "tests/support/Machine.h"

namespace {

std::string Today() {
    const std::time_t now = std::time(nullptr);
    char digits[16];
    std::strftime(digits, sizeof digits, "%Y%m%d", std::localtime(&now));
    return digits;
}

/// The entry's values as registry text, sorted by their names.
std::string Entry(const std::string& name, const std::string& displayName, const std::string& majorDigits,
                  const std::string& minorDigits, const std::string& day) {
    return "REGEDIT4\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Microsoft\\Windows\\CurrentVersion\\Uninstall\\" + name +
           "]\n\"DisplayName\"=\"" + displayName + "\"\n\"InstallDate\"=\"" + day +
           "\"\n\"MajorVersion\"=dword:" + majorDigits + "\n\"MinorVersion\"=dword:" + minorDigits +
           "\n\"NoModify\"=dword:00000001\n\"NoRepair\"=dword:00000001\n\"Publisher\"=\"Halvorn LLC\"\n"
           "\"UninstallString\"=\"\\\"C:\\\\Scripts\\\\remove me.bat\\\"\"\n";
}

class InstalledProgramsTest : public testing::Test {
protected:
    InstalledProgramsTest() { machine.Has(script, "echo"); }

    /// The machine's registry with the day of the test in place of today's: it may turn midnight meanwhile.
    void ExpectEntry(const std::string& name, const std::string& displayName, const std::string& majorDigits,
                     const std::string& minorDigits) {
        const std::string before = Today();
        HV::OSRegisterUninstall(script, product);
        const std::string registry = machine.Registry();
        if (registry != Entry(name, displayName, majorDigits, minorDigits, before)) {
            EXPECT_EQ(registry, Entry(name, displayName, majorDigits, minorDigits, Today()));
        }
    }

    Machine machine;
    HVL::ProductData product = Tessaly();
    std::string script = R"(C:\Scripts\remove me.bat)";
};

}  // namespace

TEST_F(InstalledProgramsTest, GetTheseValuesAndNoOther) {
    ExpectEntry("Tessaly Suite v3.1", "Tessaly Suite", "00000003", "00000001");
}

TEST_F(InstalledProgramsTest, ReadTheVersionByItsNumbers) {
    product.SetValue("version", "12.34.5-beta");
    ExpectEntry("Tessaly Suite v12.34.5-beta", "Tessaly Suite", "0000000c", "00000022");
}

TEST_F(InstalledProgramsTest, TakeAProductWithoutANameOrVersion) {
    product = {};
    ExpectEntry(" v", "", "00000000", "00000000");
}

TEST_F(InstalledProgramsTest, GetNothingWithoutAScript) {
    const std::string before = machine.Registry();
    HV::OSRegisterUninstall(R"(C:\Scripts\none.bat)", product);
    HV::OSRegisterUninstall("", product);
    machine.HasFolder(R"(C:\Scripts\folder.bat)");
    HV::OSRegisterUninstall(R"(C:\Scripts\folder.bat)", product);
    EXPECT_EQ(machine.Registry(), before);
}

TEST_F(InstalledProgramsTest, KeepTheEntryOfAnOlderVersion) {
    HV::OSRegisterUninstall(script, product);
    const std::string before = machine.Registry();
    product.SetValue("version", "3.2");
    HV::OSRegisterUninstall(script, product);
    const std::string after = machine.Registry();
    EXPECT_EQ(after.find(before), 0U) << after;
    EXPECT_NE(after.find(R"(\Tessaly Suite v3.2])"), std::string::npos) << after;
}

TEST_F(InstalledProgramsTest, GetTheSameEntryAgainFromALaterRun) {
    HV::OSRegisterUninstall(R"(C:\Scripts\remove me.bat)", product);
    ExpectEntry("Tessaly Suite v3.1", "Tessaly Suite", "00000003", "00000001");
}
