#include "platform/win32.h"
#include "tests/hvdeploy/SideActionsTest.h"

namespace {

/// A value as it lies in the registry.
struct Stored {
    LSTATUS status = ERROR_SUCCESS;
    DWORD type = REG_NONE;
    std::string data;
};

Stored Read(HKEY hive, const std::string& key, const std::string& name) {
    Stored value;
    DWORD size = 0;
    value.status =
        RegGetValueA(hive, key.c_str(), name.c_str(), RRF_RT_ANY | RRF_NOEXPAND, &value.type, nullptr, &size);
    if (value.status == ERROR_SUCCESS) {
        value.data.resize(size);
        value.status = RegGetValueA(hive, key.c_str(), name.c_str(), RRF_RT_ANY | RRF_NOEXPAND, &value.type,
                                    value.data.data(), &size);
        value.data.resize(size);
    }
    return value;
}

std::string Terminated(const std::string& text) {
    return text + '\0';
}

class RegistryEntriesTest : public SideActionsTest {
protected:
    RegistryEntriesTest() {
        entry.os = "windows";
        entry.root = "HKEY_LOCAL_MACHINE";
        entry.key = R"(SOFTWARE\Halvorn\Glow)";
        entry.name = "Folder";
        entry.value = R"(%ProgramFiles%\Glow)";
    }

    HV::RegistryEntry entry;
};

}  // namespace

TEST_F(RegistryEntriesTest, AreStoredAsExpandableText) {
    EXPECT_EQ(engine.MakeRegistryEntry(entry), 0);
    const Stored value = Read(HKEY_LOCAL_MACHINE, entry.key, entry.name);
    EXPECT_EQ(value.type, DWORD{REG_EXPAND_SZ});
    EXPECT_EQ(value.data, Terminated(entry.value));
    EXPECT_EQ(log.Lines(), std::vector<std::string>{DebugLine("HV::Deploy::HV::Deploy::MakeRegistryEntry")});
}

// Asked of the registry's text, because reading a value puts a terminator after it that may not be stored.
TEST_F(RegistryEntriesTest, AreStoredWithTheirTerminator) {
    entry.value = "ab";
    EXPECT_EQ(engine.MakeRegistryEntry(entry), 0);
    const std::string registry = machine.Registry();
    EXPECT_NE(registry.find("\"Folder\"=hex(2):61,62,00\n"), std::string::npos) << registry;
}

TEST_F(RegistryEntriesTest, OfAnotherSystemAreNotWritten) {
    const std::string before = machine.Registry();
    int seen = 0;
    for (const std::string os : {"mac", "", "Windows", "win"}) {
        entry.os = os;
        EXPECT_EQ(engine.MakeRegistryEntry(entry), 0) << os;
        ++seen;
    }
    EXPECT_EQ(seen, 4);
    EXPECT_EQ(machine.Registry(), before);
}

TEST_F(RegistryEntriesTest, GoBelowTheHiveThatTheyName) {
    const std::vector<std::pair<std::string, HKEY>> hives{
        {"HKEY_LOCAL_MACHINE", HKEY_LOCAL_MACHINE},   {"HKEY_CURRENT_USER", HKEY_CURRENT_USER},
        {"HKEY_CLASSES_ROOT", HKEY_CLASSES_ROOT},     {"HKEY_USERS", HKEY_USERS},
        {"HKEY_CURRENT_CONFIG", HKEY_CURRENT_CONFIG},
    };
    for (const auto& [name, hive] : hives) {
        // Everybody's default user is the one place below all users that is there on every machine.
        entry.key = hive == HKEY_USERS ? R"(.DEFAULT\Software\Halvorn)" : R"(Software\Halvorn)";
        entry.root = name;
        entry.value = name;
        EXPECT_EQ(engine.MakeRegistryEntry(entry), 0) << name;
    }
    int seen = 0;
    for (const auto& [name, hive] : hives) {
        const std::string key = hive == HKEY_USERS ? R"(.DEFAULT\Software\Halvorn)" : R"(Software\Halvorn)";
        EXPECT_EQ(Read(hive, key, entry.name).data, Terminated(name));
        ++seen;
    }
    EXPECT_EQ(seen, 5);
}

TEST_F(RegistryEntriesTest, OfAnUnknownRootGoBelowTheMachinesHive) {
    int seen = 0;
    for (const std::string root : {"", "HKLM", "hkey_current_user"}) {
        entry.root = root;
        entry.value = "root " + root;
        EXPECT_EQ(engine.MakeRegistryEntry(entry), 0);
        EXPECT_EQ(Read(HKEY_LOCAL_MACHINE, entry.key, entry.name).data, Terminated(entry.value));
        ++seen;
    }
    EXPECT_EQ(seen, 3);
}

TEST_F(RegistryEntriesTest, WithoutANameAreTheKeysDefault) {
    entry.name = "";
    EXPECT_EQ(engine.MakeRegistryEntry(entry), 0);
    EXPECT_EQ(Read(HKEY_LOCAL_MACHINE, entry.key, "").data, Terminated(entry.value));
}

TEST_F(RegistryEntriesTest, WithoutAKeyAreValuesOfTheHive) {
    entry.root = "HKEY_CURRENT_USER";
    entry.key = "";
    EXPECT_EQ(engine.MakeRegistryEntry(entry), 0);
    EXPECT_EQ(Read(HKEY_CURRENT_USER, "", entry.name).data, Terminated(entry.value));
}

TEST_F(RegistryEntriesTest, TakeThePlaceOfOlderValuesOfAnyType) {
    machine.Loads("REGEDIT4\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Halvorn\\Glow]\n\"Folder\"=dword:00000007\n");
    EXPECT_EQ(engine.MakeRegistryEntry(entry), 0);
    const Stored value = Read(HKEY_LOCAL_MACHINE, entry.key, entry.name);
    EXPECT_EQ(value.type, DWORD{REG_EXPAND_SZ});
    EXPECT_EQ(value.data, Terminated(entry.value));
}

TEST_F(RegistryEntriesTest, MayBeEmpty) {
    entry.value = "";
    EXPECT_EQ(engine.MakeRegistryEntry(entry), 0);
    EXPECT_EQ(Read(HKEY_LOCAL_MACHINE, entry.key, entry.name).data, Terminated(""));
}

TEST_F(RegistryEntriesTest, StayWholeHoweverLongTheyAre) {
    entry.value.assign(100000, 'x');
    EXPECT_EQ(engine.MakeRegistryEntry(entry), 0);
    EXPECT_EQ(Read(HKEY_LOCAL_MACHINE, entry.key, entry.name).data, Terminated(entry.value));
}

TEST_F(RegistryEntriesTest, KeepTheTextsOfAllScripts) {
    entry.name = "Gl\xC3\xBChen";
    entry.value = "\xE5\x85\x89";
    EXPECT_EQ(engine.MakeRegistryEntry(entry), 0);
    EXPECT_EQ(Read(HKEY_LOCAL_MACHINE, entry.key, entry.name).data, Terminated(entry.value));
}

TEST_F(RegistryEntriesTest, FailWhenTheirKeyCannotBeMade) {
    // No key's name may have more than 255 characters.
    entry.key = R"(SOFTWARE\)" + std::string(300, 'x');
    EXPECT_EQ(engine.MakeRegistryEntry(entry), -1);
}
