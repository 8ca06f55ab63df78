#include "system/RegistryKey.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string_view>
#include <utility>

#include "tests/support/Machine.h"

namespace HV {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr const char* kTestKey = R"(Software\Halvorn\Test)";

bool IsOpen(HKEY key) {
    DWORD length = 0;
    return RegEnumKeyExA(key, 0, nullptr, &length, nullptr, nullptr, nullptr, nullptr) != ERROR_INVALID_HANDLE;
}

class RegistryKey : public testing::Test {
protected:
    ~RegistryKey() override { test.Close(); }

    void Write(const char* name, DWORD type, std::string_view data) {
        ASSERT_EQ(RegSetValueExA(test.key, name, 0, type, reinterpret_cast<const BYTE*>(data.data()),
                                 static_cast<DWORD>(data.size())),
                  ERROR_SUCCESS);
    }

    /// The type that reading `name` returns; its text is left in `text`.
    std::int32_t Read(const char* name) {
        text = "before";
        return test.ReadValue("", name, text);
    }

    Machine machine;
    Win32RegKeyHandle test{HKEY_CURRENT_USER, kTestKey, true};
    std::string text;
};

TEST_F(RegistryKey, TellsWhetherItWasCreated) {
    EXPECT_TRUE(test.created);
    EXPECT_EQ(test.parent, HKEY_CURRENT_USER);
    Win32RegKeyHandle again(HKEY_CURRENT_USER, kTestKey, true);
    EXPECT_NE(again.key, nullptr);
    EXPECT_FALSE(again.created);
    again.Close();
}

TEST_F(RegistryKey, OpensForReadingWhatIsThere) {
    const Win32RegKeyHandle opened(test.key, "", false);
    EXPECT_NE(opened.key, nullptr);
    EXPECT_FALSE(opened.created);
    EXPECT_EQ(opened.parent, test.key);
}

TEST_F(RegistryKey, IsEmptyWhenThereIsNoSuchKey) {
    const Win32RegKeyHandle opened(test.key, "none", false);
    EXPECT_EQ(opened.key, nullptr);
    EXPECT_FALSE(opened.created);
}

TEST_F(RegistryKey, IsEmptyWithoutAParent) {
    const Win32RegKeyHandle opened(nullptr, "none", true);
    EXPECT_EQ(opened.key, nullptr);
    EXPECT_FALSE(opened.created);
}

TEST_F(RegistryKey, IsEmptyWhenNothingHasFilledIt) {
    Win32RegKeyHandle empty;
    EXPECT_EQ(empty.key, nullptr);
    EXPECT_EQ(empty.parent, nullptr);
    EXPECT_FALSE(empty.created);
    std::vector<std::string> names = {"before"};
    empty.GetSubkeyNames(names);
    EXPECT_THAT(names, IsEmpty());
    EXPECT_EQ(empty.ReadValue("", "name", text), -1);
}

TEST_F(RegistryKey, TakesAHiveAsItIs) {
    int hives = 0;
    for (const HKEY hive : {HKEY_LOCAL_MACHINE, HKEY_CURRENT_USER, HKEY_CLASSES_ROOT, HKEY_USERS, HKEY_CURRENT_CONFIG,
                            HKEY_PERFORMANCE_TEXT, HKEY_PERFORMANCE_NLSTEXT}) {
        const Win32RegKeyHandle taken(hive, "", true);
        EXPECT_EQ(taken.key, hive);
        EXPECT_FALSE(taken.created);
        ++hives;
    }
    EXPECT_EQ(hives, 7);
}

TEST_F(RegistryKey, ClosesAKeyBelowAnotherKey) {
    HKEY raw = nullptr;
    {
        const Win32RegKeyHandle below(test.key, "below", true);
        raw = below.key;
        EXPECT_TRUE(IsOpen(raw));
    }
    EXPECT_FALSE(IsOpen(raw));
}

TEST_F(RegistryKey, LeavesAKeyDirectlyBelowAHiveOpen) {
    HKEY raw = nullptr;
    {
        const Win32RegKeyHandle below(HKEY_CURRENT_USER, kTestKey, false);
        raw = below.key;
    }
    EXPECT_TRUE(IsOpen(raw));
    RegCloseKey(raw);
}

TEST_F(RegistryKey, ClosesAKeyDirectlyBelowAHiveWhenAsked) {
    Win32RegKeyHandle below(HKEY_CURRENT_USER, kTestKey, false);
    const HKEY raw = below.key;
    below.Close();
    EXPECT_EQ(below.key, nullptr);
    EXPECT_FALSE(IsOpen(raw));
}

TEST_F(RegistryKey, NeverClosesAHive) {
    Win32RegKeyHandle hive(HKEY_CURRENT_USER, "", false);
    hive.Close();
    EXPECT_EQ(hive.key, nullptr);
    EXPECT_TRUE(IsOpen(HKEY_CURRENT_USER));
}

TEST_F(RegistryKey, HandsItsKeyOverWhenMoved) {
    Win32RegKeyHandle first(test.key, "first", true);
    const HKEY raw = first.key;
    Win32RegKeyHandle second(std::move(first));
    EXPECT_EQ(second.key, raw);
    EXPECT_EQ(second.parent, test.key);
    EXPECT_TRUE(second.created);
    Win32RegKeyHandle third(test.key, "third", true);
    const HKEY released = third.key;
    third = std::move(second);
    EXPECT_EQ(third.key, raw);
    EXPECT_TRUE(IsOpen(raw));
    EXPECT_FALSE(IsOpen(released));
}

TEST_F(RegistryKey, FindsHivesByTheirExactNames) {
    EXPECT_EQ(Win32RegKeyHandle::HiveFromName("HKEY_LOCAL_MACHINE"), HKEY_LOCAL_MACHINE);
    EXPECT_EQ(Win32RegKeyHandle::HiveFromName("HKEY_CURRENT_USER"), HKEY_CURRENT_USER);
    EXPECT_EQ(Win32RegKeyHandle::HiveFromName("HKEY_CLASSES_ROOT"), HKEY_CLASSES_ROOT);
    EXPECT_EQ(Win32RegKeyHandle::HiveFromName("HKEY_USERS"), HKEY_USERS);
    EXPECT_EQ(Win32RegKeyHandle::HiveFromName("HKEY_CURRENT_CONFIG"), HKEY_CURRENT_CONFIG);
}

TEST_F(RegistryKey, FindsNoHiveByAnotherName) {
    int names = 0;
    for (const char* name : {"", "HKLM", "hkey_local_machine", "HKEY_LOCAL_MACHINE ", "HKEY_PERFORMANCE_DATA"}) {
        EXPECT_EQ(Win32RegKeyHandle::HiveFromName(name), nullptr) << name;
        ++names;
    }
    EXPECT_EQ(names, 5);
}

TEST_F(RegistryKey, ListsItsDirectSubkeys) {
    machine.Loads(
        "REGEDIT4\n\n[HKEY_CURRENT_USER\\Software\\Halvorn\\Test\\beta\\deep]\n\n"
        "[HKEY_CURRENT_USER\\Software\\Halvorn\\Test\\Alpha]\n\n[HKEY_CURRENT_USER\\Software\\Halvorn\\Test\\11.0]\n");
    std::vector<std::string> names = {"before"};
    test.GetSubkeyNames(names);
    EXPECT_THAT(names, ElementsAre("11.0", "Alpha", "beta"));
}

TEST_F(RegistryKey, ListsANameOfFullLength) {
    const std::string name(255, 'n');
    const Win32RegKeyHandle below(test.key, name, true);
    std::vector<std::string> names;
    test.GetSubkeyNames(names);
    EXPECT_THAT(names, ElementsAre(name));
}

class PathOpening : public RegistryKey {
protected:
    Win32RegKeyHandle output;
};

TEST_F(PathOpening, CreatesEachLevel) {
    EXPECT_TRUE(Win32RegKeyHandle::OpenPath(test.key, R"(a\b\c)", output, true));
    EXPECT_TRUE(output.created);
    EXPECT_NE(Win32RegKeyHandle(test.key, R"(a\b\c)", false).key, nullptr);
}

TEST_F(PathOpening, OpensWhatIsThere) {
    const Win32RegKeyHandle below(test.key, R"(a\b)", true);
    EXPECT_TRUE(Win32RegKeyHandle::OpenPath(test.key, R"(a\b)", output, false));
    EXPECT_FALSE(output.created);
    EXPECT_TRUE(IsOpen(output.key));
}

TEST_F(PathOpening, FailsAtALevelThatIsMissing) {
    const Win32RegKeyHandle below(test.key, "a", true);
    EXPECT_FALSE(Win32RegKeyHandle::OpenPath(test.key, R"(a\b\c)", output, false));
    EXPECT_EQ(output.key, nullptr);
    EXPECT_TRUE(IsOpen(test.key));
}

TEST_F(PathOpening, TakesAPathWithoutSeparatorsForOneLevel) {
    EXPECT_TRUE(Win32RegKeyHandle::OpenPath(test.key, "a", output, true));
    EXPECT_EQ(output.parent, test.key);
}

TEST_F(PathOpening, PassesThroughTheHiveForALeadingSeparator) {
    EXPECT_TRUE(Win32RegKeyHandle::OpenPath(HKEY_CURRENT_USER, std::string("\\") + kTestKey, output, false));
    EXPECT_TRUE(IsOpen(output.key));
}

TEST_F(PathOpening, ReopensAKeyForALeadingSeparator) {
    const Win32RegKeyHandle below(test.key, "a", true);
    EXPECT_TRUE(Win32RegKeyHandle::OpenPath(test.key, R"(\a)", output, false));
    EXPECT_NE(output.parent, test.key);
    EXPECT_TRUE(IsOpen(test.key));
}

TEST_F(PathOpening, HandsTheRootOverForAnEmptyPath) {
    EXPECT_TRUE(Win32RegKeyHandle::OpenPath(HKEY_CURRENT_USER, "", output, false));
    EXPECT_EQ(output.key, HKEY_CURRENT_USER);
    HKEY root = nullptr;
    ASSERT_EQ(RegOpenKeyExA(test.key, "", 0, KEY_READ, &root), ERROR_SUCCESS);
    EXPECT_TRUE(Win32RegKeyHandle::OpenPath(root, "", output, false));
    EXPECT_EQ(output.key, root);
}

TEST_F(PathOpening, FailsWithoutARoot) {
    EXPECT_FALSE(Win32RegKeyHandle::OpenPath(nullptr, "", output, false));
    EXPECT_FALSE(Win32RegKeyHandle::OpenPath(nullptr, "a", output, true));
}

TEST_F(PathOpening, LetsGoOfTheKeyThatTheOutputHeld) {
    EXPECT_TRUE(Win32RegKeyHandle::OpenPath(test.key, "a", output, true));
    const HKEY before = output.key;
    EXPECT_FALSE(Win32RegKeyHandle::OpenPath(test.key, "none", output, false));
    EXPECT_FALSE(IsOpen(before));
}

TEST_F(PathOpening, ClosesTheKeysItPassesThrough) {
    EXPECT_TRUE(Win32RegKeyHandle::OpenPath(HKEY_CURRENT_USER, std::string(kTestKey) + R"(\a\b)", output, true));
    EXPECT_FALSE(IsOpen(output.parent));
    EXPECT_TRUE(IsOpen(output.key));
}

class ValueReading : public RegistryKey {};

TEST_F(ValueReading, GivesAStringUpToItsFirstNull) {
    Write("v", REG_SZ, std::string_view("text\0more", 10));
    EXPECT_EQ(Read("v"), static_cast<std::int32_t>(REG_SZ));
    EXPECT_EQ(text, "text");
}

TEST_F(ValueReading, GivesAStringThatIsNotTerminated) {
    Write("v", REG_SZ, "text");
    EXPECT_EQ(Read("v"), static_cast<std::int32_t>(REG_SZ));
    EXPECT_EQ(text, "text");
}

TEST_F(ValueReading, GivesAnEmptyString) {
    Write("v", REG_SZ, std::string_view("\0", 1));
    EXPECT_EQ(Read("v"), static_cast<std::int32_t>(REG_SZ));
    EXPECT_EQ(text, "");
    Write("w", REG_SZ, "");
    EXPECT_EQ(Read("w"), static_cast<std::int32_t>(REG_SZ));
    EXPECT_EQ(text, "");
}

// The interface expands such a string and then calls it an ordinary one.
TEST_F(ValueReading, GivesAnExpandedString) {
    SetEnvironmentVariableA("HV_TEST_VALUE", R"(D:\Place)");
    Write("v", REG_EXPAND_SZ, std::string_view("%HV_TEST_VALUE%\\x\0", 18));
    EXPECT_EQ(Read("v"), static_cast<std::int32_t>(REG_SZ));
    EXPECT_EQ(text, R"(D:\Place\x)");
}

TEST_F(ValueReading, GivesBytesAsLowerCaseHexadecimalDigits) {
    Write("v", REG_BINARY, std::string_view("\x0a\xff\x00", 3));
    EXPECT_EQ(Read("v"), static_cast<std::int32_t>(REG_BINARY));
    EXPECT_EQ(text, "0aff00");
    Write("w", REG_BINARY, "");
    EXPECT_EQ(Read("w"), static_cast<std::int32_t>(REG_BINARY));
    EXPECT_EQ(text, "");
}

TEST_F(ValueReading, GivesANumberInDecimal) {
    Write("v", REG_DWORD, std::string_view("\xff\xff\xff\xff", 4));
    EXPECT_EQ(Read("v"), static_cast<std::int32_t>(REG_DWORD));
    EXPECT_EQ(text, "4294967295");
    Write("w", REG_DWORD, std::string_view("\x10\x27\x00\x00", 4));
    EXPECT_EQ(Read("w"), static_cast<std::int32_t>(REG_DWORD));
    EXPECT_EQ(text, "10000");
}

TEST_F(ValueReading, JoinsTheStringsOfAList) {
    Write("v", REG_MULTI_SZ, std::string_view("a\0b\0\0", 5));
    EXPECT_EQ(Read("v"), static_cast<std::int32_t>(REG_MULTI_SZ));
    EXPECT_EQ(text, "a;b");
}

TEST_F(ValueReading, GivesAListOfOneOrNone) {
    Write("v", REG_MULTI_SZ, std::string_view("one\0\0", 5));
    EXPECT_EQ(Read("v"), static_cast<std::int32_t>(REG_MULTI_SZ));
    EXPECT_EQ(text, "one");
    Write("w", REG_MULTI_SZ, std::string_view("\0\0", 2));
    EXPECT_EQ(Read("w"), static_cast<std::int32_t>(REG_MULTI_SZ));
    EXPECT_EQ(text, "");
}

TEST_F(ValueReading, GivesAListThatIsNotTerminated) {
    Write("v", REG_MULTI_SZ, std::string_view("a\0b", 3));
    EXPECT_EQ(Read("v"), static_cast<std::int32_t>(REG_MULTI_SZ));
    EXPECT_EQ(text, "a;b");
}

TEST_F(ValueReading, GivesOnlyTheTypeOfOtherTypes) {
    Write("v", REG_QWORD, std::string_view("\x01\x02\x03\x04\x05\x06\x07\x08", 8));
    EXPECT_EQ(Read("v"), static_cast<std::int32_t>(REG_QWORD));
    EXPECT_EQ(text, "");
    Write("w", REG_NONE, "bytes");
    EXPECT_EQ(Read("w"), static_cast<std::int32_t>(REG_NONE));
    EXPECT_EQ(text, "");
}

TEST_F(ValueReading, FailsForAMissingValue) {
    EXPECT_EQ(Read("none"), -1);
    EXPECT_EQ(text, "");
}

TEST_F(ValueReading, ReadsFromASubkey) {
    const Win32RegKeyHandle below(test.key, R"(a\b)", true);
    ASSERT_EQ(RegSetValueExA(below.key, "v", 0, REG_SZ, reinterpret_cast<const BYTE*>("x"), 2), ERROR_SUCCESS);
    EXPECT_EQ(test.ReadValue(R"(a\b)", "v", text), static_cast<std::int32_t>(REG_SZ));
    EXPECT_EQ(text, "x");
    EXPECT_EQ(test.ReadValue("none", "v", text), -1);
    EXPECT_EQ(text, "");
}

TEST_F(ValueReading, ReadsTheDefaultValue) {
    Write("", REG_SZ, std::string_view("default\0", 8));
    EXPECT_EQ(Read(""), static_cast<std::int32_t>(REG_SZ));
    EXPECT_EQ(text, "default");
}

TEST_F(ValueReading, ReadsWhatDoesNotFitTheFirstBuffer) {
    int sizes = 0;
    for (const std::size_t size : {1023U, 1024U, 1025U, 5000U, 65534U}) {
        const std::string content(size, 'x');
        Write("v", REG_SZ, std::string_view(content.c_str(), size + 1));
        EXPECT_EQ(Read("v"), static_cast<std::int32_t>(REG_SZ)) << size;
        EXPECT_TRUE(text == content) << size;
        ++sizes;
    }
    EXPECT_EQ(sizes, 5);
}

TEST_F(ValueReading, FailsAbove65535Bytes) {
    Write("v", REG_BINARY, std::string(65535, 'x'));
    EXPECT_EQ(Read("v"), static_cast<std::int32_t>(REG_BINARY));
    EXPECT_EQ(text.size(), 2U * 65535U);
    Write("v", REG_BINARY, std::string(65536, 'x'));
    EXPECT_EQ(Read("v"), -1);
    EXPECT_EQ(text, "");
}

class PathParsing : public testing::Test {
protected:
    HKEY hive = nullptr;
    std::string path = "before";
};

TEST_F(PathParsing, DropsTheLeadingComputer) {
    EXPECT_TRUE(Win32RegKeyHandle::ParseRegistryPath(R"(Computer\HKEY_CURRENT_USER\Software\x)", hive, path));
    EXPECT_EQ(hive, HKEY_CURRENT_USER);
    EXPECT_EQ(path, R"(Software\x)");
}

TEST_F(PathParsing, WorksWithoutTheLeadingComputer) {
    EXPECT_TRUE(Win32RegKeyHandle::ParseRegistryPath(R"(HKEY_LOCAL_MACHINE\SOFTWARE)", hive, path));
    EXPECT_EQ(hive, HKEY_LOCAL_MACHINE);
    EXPECT_EQ(path, "SOFTWARE");
}

TEST_F(PathParsing, GivesAnEmptyPathAfterALastSeparator) {
    EXPECT_TRUE(Win32RegKeyHandle::ParseRegistryPath(R"(HKEY_USERS\)", hive, path));
    EXPECT_EQ(path, "");
}

TEST_F(PathParsing, FailsWithoutASeparatorAfterTheHive) {
    EXPECT_FALSE(Win32RegKeyHandle::ParseRegistryPath("HKEY_LOCAL_MACHINE", hive, path));
    EXPECT_FALSE(Win32RegKeyHandle::ParseRegistryPath(R"(Computer\HKEY_LOCAL_MACHINE)", hive, path));
    EXPECT_FALSE(Win32RegKeyHandle::ParseRegistryPath("", hive, path));
    EXPECT_EQ(hive, nullptr);
    EXPECT_EQ(path, "before");
}

TEST_F(PathParsing, FailsForAnUnknownHive) {
    EXPECT_FALSE(Win32RegKeyHandle::ParseRegistryPath(R"(HKLM\SOFTWARE)", hive, path));
    EXPECT_FALSE(Win32RegKeyHandle::ParseRegistryPath(R"(computer\HKEY_LOCAL_MACHINE\SOFTWARE)", hive, path));
    EXPECT_FALSE(Win32RegKeyHandle::ParseRegistryPath(R"(Computer\Computer\HKEY_LOCAL_MACHINE\x)", hive, path));
    EXPECT_FALSE(Win32RegKeyHandle::ParseRegistryPath(R"(\SOFTWARE)", hive, path));
    EXPECT_EQ(hive, nullptr);
}

class UninstallKey : public testing::Test {
protected:
    static constexpr const char* kEntry = R"(SOFTWARE\Microsoft\Windows\CurrentVersion\Uninstall\Glow 2.0)";
    Machine machine;
};

TEST_F(UninstallKey, IsCreatedInTheListOfInstalledPrograms) {
    {
        Win32RegKeyHandle entry;
        EXPECT_TRUE(Win32RegKeyHandle::OpenUninstallKey("Glow 2.0", entry));
        EXPECT_TRUE(entry.created);
        EXPECT_EQ(RegSetKeyValueA(entry.key, nullptr, "DisplayName", REG_SZ, "Glow", 5), ERROR_SUCCESS);
    }
    Win32RegKeyHandle found(HKEY_LOCAL_MACHINE, kEntry, false);
    std::string text;
    EXPECT_EQ(found.ReadValue("", "DisplayName", text), static_cast<std::int32_t>(REG_SZ));
    EXPECT_EQ(text, "Glow");
    found.Close();
}

TEST_F(UninstallKey, IsOpenedWhenItIsThere) {
    Win32RegKeyHandle made(HKEY_LOCAL_MACHINE, kEntry, true);
    made.Close();
    Win32RegKeyHandle entry;
    EXPECT_TRUE(Win32RegKeyHandle::OpenUninstallKey("Glow 2.0", entry));
    EXPECT_FALSE(entry.created);
}

}  // namespace
}  // namespace HV
