// The machine in its folder: names, faults and the registry's file. Only hosted is there such a folder.

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <climits>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "platform/arguments.h"
#include "platform/filesystem.h"
#include "platform/hosted/machine.h"
#include "platform/utf8.h"
#include "platform/win32.h"
#include "tests/support/Faults.h"
#include "tests/support/Machine.h"

namespace {

using hosted::Operation;

std::string ReadHostFile(const std::string& name) {
    std::ifstream stream(name, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>()};
}

void WriteHostFile(const std::string& name, const std::string& content) {
    std::ofstream(name, std::ios::binary) << content;
}

class HostedMachineTest : public testing::Test {
protected:
    static hosted::Machine& Current() { return hosted::Machine::Current(); }
    static std::string Folder() { return Current().Folder(); }
    static std::string RegistryFile() { return Folder() + "/registry.reg"; }
    static std::string DriveC(const std::string& rest) { return Folder() + "/drive_c" + rest; }
    /// What the host refuses for its length, whoever asks.
    static std::string Refused() { return std::string(PATH_MAX, '?'); }
    static std::string User() { return "/users/" + Current().Account(); }

    Machine machine;
    MachineFaults faults{machine};
};

struct Name {
    std::wstring windows;
    std::string host;
};

TEST_F(HostedMachineTest, FindsEveryPathOnTheHost) {
    const std::vector<Name> names = {{L"C:", DriveC("")},
                                     {L"C:\\", DriveC("")},
                                     {L"c:/", DriveC("")},
                                     {L"C:\\a\\b.txt", DriveC("/a/b.txt")},
                                     {L"C:/a//b\\\\c", DriveC("/a/b/c")},
                                     {L"C:a", DriveC("/a")},
                                     {L"C:\\a\\.\\b\\..\\c", DriveC("/a/c")},
                                     {L"C:\\..\\..\\etc", DriveC("/etc")},
                                     {L"C:\\a\\..\\..\\b", DriveC("/b")},
                                     {L"C:\\name. .", DriveC("/name")},
                                     {L"C:\\folder.\\b", DriveC("/folder/b")},
                                     {L"C:\\folder \\b", DriveC("/folder /b")},
                                     {L"C:\\.hidden", DriveC("/.hidden")},
                                     {L"C:\\ü€\U0001F3AC", DriveC("/\xC3\xBC\xE2\x82\xAC\xF0\x9F\x8E\xAC")},
                                     {L"\\\\?\\C:\\a", DriveC("/a")},
                                     {L"Z:\\", "/"},
                                     {L"z:\\tmp\\x", "/tmp/x"},
                                     {L"Z:\\..\\tmp", "/tmp"},
                                     {L"Z:\\a:b", "/a:b"},
                                     {L"/", DriveC("")},
                                     {L"\\", DriveC("")},
                                     {L"/tmp/x", DriveC("/tmp/x")},
                                     {L"/tmp\\x", DriveC("/tmp/x")},
                                     {L"\\tmp/x", DriveC("/tmp/x")},
                                     {L"/../../x", DriveC("/x")},
                                     {L"", ""},
                                     {L".", "."},
                                     {L"a\\b", "a/b"},
                                     {L"a\\..\\b", "b"},
                                     {L"..\\a\\..\\..\\b", "../../b"},
                                     {L"\\\\server\\share\\x", "/dev/null/nowhere"},
                                     {L"//tmp/x", "/dev/null/nowhere"},
                                     {L"\\/tmp/x", "/dev/null/nowhere"},
                                     {L"Q:\\x", "/dev/null/nowhere"},
                                     {L"C:\\a:b", Refused()},
                                     {L"C:\\a?\\b", Refused()},
                                     {L"C:\\a\tb", Refused()},
                                     {L"C:\\a\\nul", Refused()},
                                     {L"C:\\nul .x", Refused()},
                                     {L"C:\\Com9.log", Refused()},
                                     {L"C:\\com0", DriveC("/com0")},
                                     {L"C:\\nulls", DriveC("/nulls")},
                                     {L"C:\\aux\\x", DriveC("/aux/x")}};
    std::size_t ran = 0;
    for (const Name& name : names) {
        EXPECT_EQ(Current().HostPath(name.windows), name.host);
        EXPECT_EQ(Current().HostPath(platform::Utf8FromWide(name.windows)), name.host);
        ++ran;
    }
    EXPECT_EQ(ran, 43u);
}

TEST_F(HostedMachineTest, FindsBaseFoldersInAnyCase) {
    const std::vector<Name> names = {
        {L"C:\\Windows\\System32\\x.dll", DriveC("/windows/system32/x.dll")},
        {L"C:\\WINDOWS\\SYSTEM32\\X.DLL", DriveC("/windows/system32/X.DLL")},
        {L"C:\\Users\\Public\\Documents", DriveC("/users/Public/Documents")},
        {L"c:\\program files\\common files\\OFX", DriveC("/Program Files/Common Files/OFX")},
        {L"C:\\PROGRAMDATA\\microsoft\\windows\\start menu\\programs\\a",
         DriveC("/ProgramData/Microsoft/Windows/Start Menu/Programs/a")},
        {L"C:\\Program Files\\..\\USERS\\x", DriveC("/users/x")},
        {L"C:\\other\\..\\USERS", DriveC("/users")},
        {L"C:\\other\\USERS", DriveC("/other/USERS")},
        {L"C:\\Users\\x\\..\\PUBLIC", DriveC("/users/Public")}};
    std::size_t ran = 0;
    for (const Name& name : names) {
        EXPECT_EQ(Current().HostPath(name.windows), name.host);
        ++ran;
    }
    EXPECT_EQ(ran, 9u);
}

TEST_F(HostedMachineTest, KeepsTheCaseOfAllOtherNames) {
    machine.Has(R"(C:\ProgramData\Halvorn\file)", "x");
    EXPECT_FALSE(machine.Exists(R"(C:\ProgramData\HALVORN\file)"));
}

TEST_F(HostedMachineTest, HasASecondDriveWhenItsFolderIsThere) {
    std::filesystem::create_directory(Folder() + "/drive_d");
    EXPECT_EQ(Current().HostPath(std::wstring(L"D:\\x")), Folder() + "/drive_d/x");
}

/// The process's current directory while it lives.
class WorksIn {
public:
    explicit WorksIn(const std::filesystem::path& folder) { std::filesystem::current_path(folder); }
    ~WorksIn() { std::filesystem::current_path(before_); }
    WorksIn(const WorksIn&) = delete;
    WorksIn& operator=(const WorksIn&) = delete;

private:
    std::filesystem::path before_ = std::filesystem::current_path();
};

TEST_F(HostedMachineTest, APathWithoutADriveIsOnDriveCWhereverTheCurrentFolderIs) {
    std::size_t ran = 0;
    for (const std::string& folder : {std::string("/"), Folder(), DriveC("/users")}) {
        const WorksIn work(folder);
        EXPECT_EQ(Current().HostPath(std::wstring(L"\\x")), DriveC("/x")) << folder;
        EXPECT_EQ(fs::absolute("\\x").native(), L"C:\\x") << folder;
        ++ran;
    }
    EXPECT_EQ(ran, 3u);
}

TEST_F(HostedMachineTest, ARelativePathDoesNotClimbOutOfDriveC) {
    const WorksIn work(DriveC("/users"));
    const std::vector<Name> names = {{L"x", DriveC("/users/x")},           {L"..\\x", DriveC("/x")},
                                     {L"..\\..\\..\\..\\x", DriveC("/x")}, {L".", DriveC("/users")},
                                     {L"..\\WINDOWS", DriveC("/windows")}, {L"a?b", Refused()}};
    std::size_t ran = 0;
    for (const Name& name : names) {
        EXPECT_EQ(Current().HostPath(name.windows), name.host);
        EXPECT_EQ(Current().HostPath(platform::Utf8FromWide(name.windows)), name.host);
        ++ran;
    }
    EXPECT_EQ(ran, 6u);
}

// The system directories that name no drive are written below drive C, and nowhere else.
TEST_F(HostedMachineTest, WhatNamesNoDriveIsWrittenIntoTheMachine) {
    std::size_t ran = 0;
    for (const char* path : {"/Applications", R"(\Halvorn)", "/Library"}) {
        EXPECT_EQ(_mkdir(path), 0) << path;
        EXPECT_TRUE(std::filesystem::is_directory(DriveC("/" + std::string(path + 1)))) << path;
        ++ran;
    }
    EXPECT_EQ(ran, 3u);
}

TEST_F(HostedMachineTest, ASeparatorBehindANameMeansAFolder) {
    machine.Has(R"(C:\folder\file)", "x");
    EXPECT_EQ(Current().HostPath(std::wstring(L"C:\\folder\\")), DriveC("/folder"));
    EXPECT_EQ(Current().HostPath(std::wstring(L"C:\\folder//")), DriveC("/folder"));
    EXPECT_EQ(Current().HostPath(std::wstring(L"C:\\folder\\file\\")), Refused());
    EXPECT_EQ(Current().HostPath(std::wstring(L"C:\\missing\\")), DriveC("/missing/"));
}

TEST_F(HostedMachineTest, AMalformedNameIsOneNameInBothKindsOfText) {
    EXPECT_EQ(Current().HostPath(std::string("C:\\a\xFF.txt")), DriveC("/a\xEF\xBF\xBD.txt"));
    EXPECT_EQ(Current().HostPath(std::string("Z:\\a\xFF")), "/a\xEF\xBF\xBD");
}

TEST(ProgramArgumentsTest, APathOfTheHostIsOneOnDriveZ) {
    const char* const words[] = {"program", "dir=/tmp/a b", "log=/x", "/tmp/out.hvpkg", "dir=packages", "--verbose",
                                 "/?",      "=/x",          "/",      "skip=a/b",       R"(log=C:\x)",  "dir="};
    const std::vector<std::string> expected = {R"(dir=Z:\tmp\a b)", R"(log=Z:\x)", R"(Z:\tmp\out.hvpkg)",
                                               "dir=packages",      "--verbose",   "/?",
                                               R"(=Z:\x)",          "/",           "skip=a/b",
                                               R"(log=C:\x)",       "dir="};
    EXPECT_EQ(platform::ProgramArguments(static_cast<int>(std::size(words)), words), expected);
    EXPECT_TRUE(platform::ProgramArguments(0, words).empty());
}

TEST_F(HostedMachineTest, NamesEveryHostPathInWindowsTerms) {
    const std::vector<Name> names = {{L"C:\\", DriveC("")},
                                     {L"C:\\a\\b", DriveC("/a/b")},
                                     {L"Z:\\", "/"},
                                     {L"Z:\\tmp\\\u00FC", "/tmp/\xC3\xBC"},
                                     {L"a\\b", "a/b"}};
    std::size_t ran = 0;
    for (const Name& name : names) {
        EXPECT_EQ(Current().WindowsPath(name.host), name.windows);
        ++ran;
    }
    EXPECT_EQ(ran, 5u);
    EXPECT_EQ(
        Current().WindowsPath(Folder() + "/drive_cc"), L"Z:" + [&] {
            std::wstring folder = platform::WideFromUtf8(Folder() + "/drive_cc");
            for (wchar_t& c : folder) {
                c = c == L'/' ? L'\\' : c;
            }
            return folder;
        }());
}

TEST_F(HostedMachineTest, HasTheFoldersOfAWinePrefix) {
    std::size_t ran = 0;
    for (const std::string& folder :
         {std::string("/Program Files/Common Files"), std::string("/Program Files (x86)"),
          std::string("/windows/system32"), std::string("/ProgramData/Microsoft/Windows/Start Menu/Programs"),
          std::string("/users/Public/Documents"), User() + "/AppData/Local/Temp", User() + "/AppData/Roaming"}) {
        EXPECT_TRUE(std::filesystem::is_directory(DriveC(folder))) << folder;
        ++ran;
    }
    EXPECT_EQ(ran, 7u);
}

TEST_F(HostedMachineTest, AVariableOfTheProcessComesFirst) {
    setenv("PrOgRaMdAtA", "C:\\Mine", 1);
    EXPECT_EQ(Current().GetEnvironment().Get("ProgramData"), "C:\\Mine");
}

TEST_F(HostedMachineTest, PassesSetVariablesOnToChildren) {
    SetEnvironmentVariableA("HV_TEST_CHILD", "x");
    EXPECT_STREQ(std::getenv("HV_TEST_CHILD"), "x");
    SetEnvironmentVariableA("hv_test_child", nullptr);
    EXPECT_EQ(std::getenv("HV_TEST_CHILD"), nullptr);
}

// The process that dies is a copy of this one, on the same machine, so that it leaves no folder of its own behind.
using HostedMachineDeathTest = HostedMachineTest;

TEST_F(HostedMachineDeathTest, EndsClearlyWhenItsFolderCannotBeMade) {
    EXPECT_EXIT(hosted::Machine::Use("/dev/null/machine"), testing::ExitedWithCode(1),
                "cannot make the machine's folder /dev/null");
}

TEST_F(HostedMachineDeathTest, EndsClearlyOnRegistryTextThatCannotBeRead) {
    WriteHostFile(RegistryFile(), "REGEDIT4\n\nwords\n");
    EXPECT_EXIT(hosted::Machine::Use(Folder()), testing::ExitedWithCode(1), "registry.reg:3: neither a key");
}

TEST_F(HostedMachineDeathTest, EndsClearlyOnAFixtureThatCannotBeRead) {
    WriteHostFile(Folder() + "/fixture.reg", "REGEDIT4\n[HKEY_X\\y]\n");
    EXPECT_EXIT(Current().GetRegistry().LoadFile(Folder() + "/fixture.reg"), testing::ExitedWithCode(1),
                "fixture.reg:2: \"HKEY_X\" is no hive");
    EXPECT_EXIT(Current().GetRegistry().LoadFile(Folder() + "/none.reg"), testing::ExitedWithCode(1),
                "cannot read the registry text .*none.reg");
}

TEST_F(HostedMachineDeathTest, EndsClearlyOnFaultsThatCannotBeRead) {
    setenv("HV_MACHINE_FAULTS", "write=3;nonsense=1", 1);
    EXPECT_EXIT(hosted::Machine::Use(Folder()), testing::ExitedWithCode(1),
                "HV_MACHINE_FAULTS: cannot read \"nonsense=1\"");
}

class HostedRegistryTest : public HostedMachineTest {
protected:
    static hosted::Registry& Registry() { return Current().GetRegistry(); }
    static void Set(const char* key, const char* name, const std::string& text) {
        EXPECT_EQ(
            RegSetKeyValueA(HKEY_LOCAL_MACHINE, key, name, REG_SZ, text.c_str(), static_cast<DWORD>(text.size() + 1)),
            ERROR_SUCCESS);
    }
};

TEST_F(HostedRegistryTest, IsAFileFromTheStart) {
    EXPECT_EQ(ReadHostFile(RegistryFile()), "REGEDIT4\n");
}

TEST_F(HostedRegistryTest, WritesEachChangeAtOnce) {
    Set(R"(SOFTWARE\Halvorn)", "b", "1");
    const std::string after =
        "REGEDIT4\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Halvorn]\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Halvorn]\n\"b\"=\"1\"\n";
    EXPECT_EQ(ReadHostFile(RegistryFile()), after);
    Set(R"(software\halvorn)", "a", "2");
    EXPECT_EQ(ReadHostFile(RegistryFile()), after + "\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Halvorn]\n\"a\"=\"2\"\n");
}

TEST_F(HostedRegistryTest, IsSortedWhenItIsFlushed) {
    Set(R"(SOFTWARE\Halvorn\z)", "b", "1");
    Set(R"(SOFTWARE\Halvorn\A)", "B", "1");
    Set(R"(SOFTWARE\Halvorn\A)", "a", "2");
    Registry().Flush();
    const std::string sorted =
        "REGEDIT4\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Halvorn]\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Halvorn\\A]\n"
        "\"a\"=\"2\"\n\"B\"=\"1\"\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Halvorn\\z]\n\"b\"=\"1\"\n";
    EXPECT_EQ(ReadHostFile(RegistryFile()), sorted);
    EXPECT_EQ(Registry().Text(), sorted);
    EXPECT_FALSE(std::filesystem::exists(RegistryFile() + ".new"));
}

TEST_F(HostedRegistryTest, GoesOnInTheNewFileAfterAFlush) {
    Set(R"(SOFTWARE\Halvorn)", "a", "1");
    Registry().Flush();
    Set(R"(SOFTWARE\Halvorn)", "b", "2");
    Registry().Reload();
    EXPECT_NE(Registry().Text().find("\"a\"=\"1\"\n\"b\"=\"2\""), std::string::npos);
}

TEST_F(HostedRegistryTest, IsTheSameAfterReadingItsFileAgain) {
    Set(R"(SOFTWARE\Halvorn\a)", "x\\\"y", "text \\ \"quoted\"\nwith a line end");
    Set(R"(SOFTWARE\Halvorn\b\c)", "", "default");
    Set(R"(SOFTWARE\Halvorn\d\e)", "x", "y");
    const std::string binary(300, '\xAB');
    RegSetKeyValueA(HKEY_CURRENT_USER, "Software\\Halvorn", "bin", REG_BINARY, binary.data(), 300);
    RegSetKeyValueA(HKEY_CLASSES_ROOT, ".hvpkg", nullptr, REG_MULTI_SZ, "a\0b\0", 5);
    RegDeleteTreeA(HKEY_LOCAL_MACHINE, R"(SOFTWARE\Halvorn\d)");
    const std::string text = Registry().Text();
    EXPECT_EQ(text.find("Halvorn\\d"), std::string::npos);
    Registry().Reload();
    EXPECT_EQ(Registry().Text(), text);
    Registry().Flush();
    Registry().Reload();
    EXPECT_EQ(Registry().Text(), text);
}

TEST_F(HostedRegistryTest, RemembersWhatAnEmptiedKeyLost) {
    Set(R"(SOFTWARE\Halvorn\a)", "x", "1");
    Set(R"(SOFTWARE\Halvorn)", "y", "2");
    HKEY key = nullptr;
    ASSERT_EQ(RegOpenKeyExA(HKEY_LOCAL_MACHINE, R"(SOFTWARE\Halvorn)", 0, KEY_ALL_ACCESS, &key), ERROR_SUCCESS);
    ASSERT_EQ(RegDeleteTreeA(key, nullptr), ERROR_SUCCESS);
    RegCloseKey(key);
    Registry().Reload();
    EXPECT_EQ(Registry().Text(), "REGEDIT4\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Halvorn]\n");
}

TEST_F(HostedRegistryTest, MergesAFixture) {
    Set(R"(SOFTWARE\Halvorn)", "old", "1");
    WriteHostFile(Folder() + "/fixture.reg",
                  "REGEDIT4\r\n\r\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Halvorn]\r\n\"new\"=\"2\"");
    Registry().LoadFile(Folder() + "/fixture.reg");
    Set(R"(SOFTWARE\Halvorn)", "newer", "3");
    const std::string expected =
        "REGEDIT4\n\n[HKEY_LOCAL_MACHINE\\SOFTWARE\\Halvorn]\n\"new\"=\"2\"\n\"newer\"=\"3\"\n\"old\"=\"1\"\n";
    EXPECT_EQ(Registry().Text(), expected);
    Registry().Reload();
    EXPECT_EQ(Registry().Text(), expected);
}

TEST_F(HostedRegistryTest, AreInOrderOfTheirUpperCaseOutsideAsciiToo) {
    for (const char* name : {"\xC3\xBC", "z", "\xC3\x96", "\xC3\xA4", "_", "\xC4\xB1", "A"}) {
        Set("SOFTWARE\\Halvorn", name, "x");
    }
    std::vector<std::size_t> places;
    const std::string text = Registry().Text();
    for (const char* name :
         {"\"A\"", "\"z\"", "\"_\"", "\"\xC3\xA4\"", "\"\xC3\x96\"", "\"\xC3\xBC\"", "\"\xC4\xB1\""}) {
        places.push_back(text.find(name));
    }
    EXPECT_TRUE(std::is_sorted(places.begin(), places.end())) << text;
    EXPECT_NE(places.back(), std::string::npos);
}

// Windows takes 255 characters of UTF-16 in the name of a key. Wine takes more of those outside ASCII, so that it is
// not asked.
TEST_F(HostedRegistryTest, RefusesANameOfMoreThan255Characters) {
    const auto create = [](const char* letter, int count) {
        std::string name;
        for (int at = 0; at < count; ++at) {
            name += letter;
        }
        HKEY made = nullptr;
        return RegCreateKeyExA(HKEY_CURRENT_USER, name.c_str(), 0, nullptr, 0, KEY_ALL_ACCESS, nullptr, &made, nullptr);
    };
    EXPECT_EQ(create("\xC3\xBC", 255), ERROR_SUCCESS);
    EXPECT_EQ(create("\xC3\xBC", 256), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(create("\xF0\x9F\x8E\xAC", 127), ERROR_SUCCESS);
    EXPECT_EQ(create("\xF0\x9F\x8E\xAC", 128), ERROR_INVALID_PARAMETER);
}

TEST_F(HostedRegistryTest, RefusesNamesThatTextCannotHold) {
    HKEY key = nullptr;
    EXPECT_EQ(RegCreateKeyExA(HKEY_CURRENT_USER, "a\nb", 0, nullptr, 0, KEY_ALL_ACCESS, nullptr, &key, nullptr),
              ERROR_INVALID_PARAMETER);
}

// What is made must be text that can be read again.
TEST_F(HostedRegistryTest, RefusesAKeyThatLiesTooDeep) {
    std::string deep;
    for (int i = 0; i < 508; ++i) {
        deep += "k\\";
    }
    HKEY made = nullptr;
    const auto create = [&made](HKEY parent, const std::string& path) {
        return RegCreateKeyExA(parent, path.c_str(), 0, nullptr, 0, KEY_ALL_ACCESS, nullptr, &made, nullptr);
    };
    // Two names and the hive are above it.
    ASSERT_EQ(create(HKEY_CLASSES_ROOT, deep + "k"), ERROR_SUCCESS);
    EXPECT_EQ(create(made, "k"), ERROR_INVALID_PARAMETER);
    EXPECT_EQ(create(HKEY_CLASSES_ROOT, deep + "x\\x"), ERROR_INVALID_PARAMETER);
    Current().GetRegistry().Reload();
    EXPECT_EQ(create(HKEY_CLASSES_ROOT, deep + "k"), ERROR_SUCCESS);
}

TEST_F(HostedRegistryTest, FailsOnDemandAndChangesNothing) {
    Set(R"(SOFTWARE\Halvorn)", "a", "1");
    const std::string before = Registry().Text();
    faults.FailNth(Operation::RegistrySet, 1);
    EXPECT_EQ(RegSetKeyValueA(HKEY_LOCAL_MACHINE, R"(SOFTWARE\Halvorn)", "a", REG_SZ, "2", 2), ERROR_ACCESS_DENIED);
    EXPECT_EQ(Registry().Text(), before);
    Set(R"(SOFTWARE\Halvorn)", "a", "2");
    EXPECT_EQ(faults.Count(Operation::RegistrySet), 2u);
}

TEST_F(HostedRegistryTest, ManyThreadsSetValuesAtOnce) {
    std::vector<std::thread> threads;
    for (int number = 0; number < 4; ++number) {
        threads.emplace_back([number] {
            for (int value = 0; value < 100; ++value) {
                const std::string name = std::to_string(number) + "-" + std::to_string(value);
                Set(R"(SOFTWARE\Halvorn)", name.c_str(), "x");
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    Registry().Reload();
    const std::string text = Registry().Text();
    std::size_t values = 0;
    for (std::size_t at = text.find("=\"x\""); at != std::string::npos; at = text.find("=\"x\"", at + 1)) {
        ++values;
    }
    EXPECT_EQ(values, 400u);
}

class FaultsTest : public HostedMachineTest {
protected:
    static errno_t Write(const std::string& path, const std::string& content) {
        FILE* stream = nullptr;
        if (const errno_t error = fopen_s(&stream, path.c_str(), "wb")) {
            return error;
        }
        errno = 0;
        const bool written = std::fwrite(content.data(), 1, content.size(), stream) == content.size();
        const int error = errno;
        const bool closed = std::fclose(stream) == 0;
        return written && closed ? 0 : error != 0 ? error : errno;
    }
    const std::string file = R"(C:\ProgramData\file)";
};

TEST_F(FaultsTest, FailTheNthOperationAndNoOther) {
    faults.FailNth(Operation::Create, 2);
    EXPECT_EQ(_mkdir(R"(C:\a)"), 0);
    EXPECT_EQ(_mkdir(R"(C:\b)"), -1);
    EXPECT_EQ(errno, EACCES);
    EXPECT_EQ(_mkdir(R"(C:\b)"), 0);
    EXPECT_EQ(faults.Count(Operation::Create), 3u);
}

TEST_F(FaultsTest, FailAWriteBeforeAByteIsWritten) {
    faults.FailNth(Operation::Write, 1);
    EXPECT_EQ(Write(file, "content"), EIO);
    EXPECT_EQ(machine.Content(file), "");
}

TEST_F(FaultsTest, FailAWriteInTextMode) {
    faults.FailNth(Operation::Write, 1);
    FILE* stream = nullptr;
    ASSERT_EQ(fopen_s(&stream, file.c_str(), "w"), 0);
    std::fputs("text\n", stream);
    EXPECT_NE(std::fclose(stream), 0);
}

TEST_F(FaultsTest, FailADeletion) {
    machine.Has(file, "x");
    faults.FailNth(Operation::Delete, 1);
    EXPECT_EQ(_unlink(file.c_str()), -1);
    EXPECT_TRUE(machine.HasFile(file));
    EXPECT_EQ(_unlink(file.c_str()), 0);
}

TEST_F(FaultsTest, RefuseSpaceWhenItIsUsedUp) {
    faults.LimitSpace(10);
    EXPECT_EQ(Write(file, "12345678"), 0);
    EXPECT_EQ(Write(file, "123"), ENOSPC);
    EXPECT_EQ(Write(file, "12"), 0);
    EXPECT_EQ(Write(file, "1"), ENOSPC);
}

TEST_F(FaultsTest, AHeldFileCanOnlyBeRead) {
    machine.Has(file, "kept");
    faults.Lock(file);
    EXPECT_EQ(Write(file, "new"), EACCES);
    EXPECT_EQ(_unlink(file.c_str()), -1);
    FILE* stream = nullptr;
    ASSERT_EQ(fopen_s(&stream, file.c_str(), "rb"), 0);
    std::fclose(stream);
    EXPECT_EQ(machine.Content(file), "kept");
    faults.Unlock(file);
    EXPECT_EQ(_unlink(file.c_str()), 0);
}

TEST_F(FaultsTest, AHeldFolderRefusesChangesInIt) {
    machine.HasFolder(R"(C:\ProgramData\held)");
    faults.Lock(R"(C:\ProgramData\held)");
    EXPECT_EQ(_mkdir(R"(C:\ProgramData\held\x)"), -1);
    EXPECT_EQ(_mkdir(R"(C:\ProgramData\held2)"), 0);
}

TEST_F(FaultsTest, AFolderAboveAHeldFileCannotBeRenamed) {
    hosted::Faults own;
    own.Lock("/a/b/c");
    EXPECT_EQ(own.CheckRename("/a/b", "/x"), EACCES);
    EXPECT_EQ(own.CheckRename("/x", "/a/b"), EACCES);
    EXPECT_EQ(own.CheckRename("/a/bb", "/x"), 0);
    EXPECT_EQ(own.Check(Operation::Delete, "/a/b"), 0);
    EXPECT_EQ(own.Count(Operation::Rename), 3u);
}

TEST_F(FaultsTest, AreTakenBack) {
    faults.FailNth(Operation::Create, 1);
    faults.LimitSpace(0);
    faults.Lock(file);
    faults.Disarm();
    EXPECT_FALSE(Current().GetFaults().Armed());
    EXPECT_EQ(Write(file, "x"), 0);
}

TEST_F(FaultsTest, CountWithoutFailing) {
    faults.StartCounting();
    EXPECT_EQ(Write(file, "x"), 0);
    EXPECT_EQ(_unlink(file.c_str()), 0);
    EXPECT_EQ(faults.Count(Operation::Create), 1u);
    EXPECT_EQ(faults.Count(Operation::Write), 1u);
    EXPECT_EQ(faults.Count(Operation::Delete), 1u);
    EXPECT_EQ(faults.Count(Operation::Rename), 0u);
}

// Windows refuses it on its own; Wine does not when it runs as root, so this is not asked of it.
TEST_F(FaultsTest, AReadOnlyFileIsNotWrittenEvenByRoot) {
    machine.HasReadOnly(file, "kept");
    EXPECT_EQ(Write(file, "new"), EACCES);
    FILE* stream = nullptr;
    EXPECT_EQ(fopen_s(&stream, file.c_str(), "ab"), EACCES);
    EXPECT_EQ(fopen_s(&stream, file.c_str(), "r+b"), EACCES);
    EXPECT_EQ(machine.Content(file), "kept");
}

std::string Same(const std::string& path) {
    return path;
}

TEST_F(FaultsTest, AreArmedFromText) {
    hosted::Faults own;
    own.Arm("create=2;space=5;lock=/x/y", Same);
    EXPECT_EQ(own.Check(Operation::Create, "/a"), 0);
    EXPECT_EQ(own.Check(Operation::Create, "/a"), EACCES);
    EXPECT_EQ(own.Check(Operation::Write, "/a", 6), ENOSPC);
    EXPECT_EQ(own.Check(Operation::Delete, "/x/y"), EACCES);
}

TEST_F(FaultsTest, AreArmedFromTheEnvironment) {
    setenv("HV_MACHINE_FAULTS", R"(create=1;lock=C:\ProgramData\file)", 1);
    hosted::Machine::Use(Folder());
    EXPECT_EQ(_mkdir(R"(C:\a)"), -1);
    EXPECT_EQ(_mkdir(R"(C:\a)"), 0);
    EXPECT_EQ(Write(file, "x"), EACCES);
}

TEST_F(FaultsTest, RefuseTextThatTheyCannotRead) {
    std::size_t ran = 0;
    for (const char* text : {"write", "write=", "write=x", "write=0", "write=-1", "write=1x", "space=", "lock=", "=1",
                             "create=1;;", "write=99999999999999999999"}) {
        hosted::Faults own;
        EXPECT_THROW(own.Arm(text, Same), std::invalid_argument) << text;
        EXPECT_FALSE(own.Armed()) << text;
        ++ran;
    }
    EXPECT_EQ(ran, 11u);
}

}  // namespace
