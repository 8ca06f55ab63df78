// The registry's calls, held against those of Windows: what is said here is so on both targets.

#include <gtest/gtest.h>

#include <cstring>
#include <string>
#include <vector>

#include "platform/win32.h"
#include "tests/support/Machine.h"

namespace {

constexpr const char* Path = R"(Software\Halvorn\Test)";

struct Answer {
    LSTATUS error = ERROR_SUCCESS;
    DWORD type = REG_NONE;
    DWORD size = 0;
    std::string data;
};

class RegistryCalls : public testing::Test {
protected:
    RegistryCalls() { EXPECT_EQ(Create(HKEY_CURRENT_USER, Path, key), ERROR_SUCCESS); }
    ~RegistryCalls() override { RegCloseKey(key); }

    static LSTATUS Create(HKEY parent, const char* path, HKEY& result, DWORD* disposition = nullptr) {
        return RegCreateKeyExA(parent, path, 0, nullptr, REG_OPTION_NON_VOLATILE, KEY_ALL_ACCESS, nullptr, &result,
                               disposition);
    }
    static void Make(HKEY parent, const char* path) {
        HKEY made = nullptr;
        ASSERT_EQ(Create(parent, path, made), ERROR_SUCCESS) << path;
        RegCloseKey(made);
    }
    static LSTATUS Open(HKEY parent, const char* path) {
        HKEY opened = nullptr;
        const LSTATUS error = RegOpenKeyExA(parent, path, 0, KEY_READ, &opened);
        if (error == ERROR_SUCCESS) {
            RegCloseKey(opened);
        }
        return error;
    }
    LSTATUS Set(const char* name, DWORD type, const std::string& data) const {
        return RegSetValueExA(key, name, 0, type, reinterpret_cast<const BYTE*>(data.data()),
                              static_cast<DWORD>(data.size()));
    }
    Answer Get(const char* name, DWORD flags = RRF_RT_ANY, DWORD room = 256) const {
        std::string buffer(room, '#');
        Answer answer;
        answer.size = room;
        answer.error = RegGetValueA(key, nullptr, name, flags, &answer.type, buffer.data(), &answer.size);
        if (answer.error == ERROR_SUCCESS) {
            answer.data = buffer.substr(0, answer.size);
        }
        return answer;
    }
    static std::vector<std::string> SubKeys(HKEY of) {
        std::vector<std::string> names;
        char name[256];
        for (DWORD index = 0;; ++index) {
            DWORD length = sizeof name;
            if (RegEnumKeyExA(of, index, name, &length, nullptr, nullptr, nullptr, nullptr) != ERROR_SUCCESS) {
                return names;
            }
            EXPECT_EQ(length, std::strlen(name));
            names.emplace_back(name);
        }
    }

    Machine machine;
    HKEY key = nullptr;
};

std::string Bytes(std::initializer_list<int> values) {
    std::string bytes;
    for (const int value : values) {
        bytes += static_cast<char>(value);
    }
    return bytes;
}

TEST_F(RegistryCalls, CreatingSaysWhetherTheKeyIsNew) {
    DWORD disposition = 0;
    HKEY made = nullptr;
    ASSERT_EQ(Create(key, R"(a\b\c)", made, &disposition), ERROR_SUCCESS);
    EXPECT_EQ(disposition, static_cast<DWORD>(REG_CREATED_NEW_KEY));
    RegCloseKey(made);
    ASSERT_EQ(Create(key, R"(A\B\C)", made, &disposition), ERROR_SUCCESS);
    EXPECT_EQ(disposition, static_cast<DWORD>(REG_OPENED_EXISTING_KEY));
    RegCloseKey(made);
}

TEST_F(RegistryCalls, OpeningAMissingKeyFindsNoFile) {
    EXPECT_EQ(Open(key, "missing"), ERROR_FILE_NOT_FOUND);
    EXPECT_EQ(Open(key, R"(missing\below)"), ERROR_FILE_NOT_FOUND);
}

TEST_F(RegistryCalls, KeysAreFoundInAnyCase) {
    Make(key, "MixedCase");
    EXPECT_EQ(Open(key, "mixedCASE"), ERROR_SUCCESS);
    EXPECT_EQ(Open(HKEY_CURRENT_USER, R"(SOFTWARE\halvorn\TEST\mixedcase)"), ERROR_SUCCESS);
}

TEST_F(RegistryCalls, LettersOutsideAsciiAreFoundInAnyCase) {
    Make(key, "\xC3\xBC\xCE\xB1\xD1\x8F");
    EXPECT_EQ(Open(key, "\xC3\x9C\xCE\x91\xD0\xAF"), ERROR_SUCCESS);
    ASSERT_EQ(Set("\xC3\xA4", REG_SZ, std::string("x\0", 2)), ERROR_SUCCESS);
    ASSERT_EQ(Set("\xC3\x84", REG_SZ, std::string("y\0", 2)), ERROR_SUCCESS);
    EXPECT_EQ(Get("\xC3\xA4").data, std::string("y\0", 2));
    // A letter without a dot is another letter.
    Make(key, "\xC4\xB1");
    EXPECT_EQ(Open(key, "I"), ERROR_FILE_NOT_FOUND);
}

TEST_F(RegistryCalls, AnEmptyPathReopensTheKey) {
    EXPECT_EQ(Open(key, ""), ERROR_SUCCESS);
    EXPECT_EQ(Open(key, nullptr), ERROR_SUCCESS);
}

TEST_F(RegistryCalls, AHiveOpenedWithoutAPathIsTheHiveItself) {
    HKEY opened = nullptr;
    ASSERT_EQ(RegOpenKeyExA(HKEY_LOCAL_MACHINE, "", 0, KEY_READ, &opened), ERROR_SUCCESS);
    EXPECT_EQ(opened, HKEY_LOCAL_MACHINE);
}

TEST_F(RegistryCalls, ATrailingSeparatorIsPassedOver) {
    Make(key, "one");
    EXPECT_EQ(Open(key, R"(one\)"), ERROR_SUCCESS);
}

TEST_F(RegistryCalls, AHandleThatIsNoneIsRefused) {
    HKEY closed = nullptr;
    ASSERT_EQ(Create(key, "closed", closed), ERROR_SUCCESS);
    ASSERT_EQ(RegCloseKey(closed), ERROR_SUCCESS);
    EXPECT_EQ(Open(closed, "x"), ERROR_INVALID_HANDLE);
    EXPECT_EQ(RegCloseKey(closed), ERROR_INVALID_HANDLE);
}

TEST_F(RegistryCalls, ClosingAHiveDoesNoHarm) {
    EXPECT_EQ(RegCloseKey(HKEY_LOCAL_MACHINE), ERROR_SUCCESS);
    EXPECT_EQ(Open(HKEY_LOCAL_MACHINE, "SOFTWARE"), ERROR_SUCCESS);
}

TEST_F(RegistryCalls, AKeyOpenedForReadingRefusesValues) {
    HKEY reading = nullptr;
    ASSERT_EQ(RegOpenKeyExA(HKEY_CURRENT_USER, Path, 0, KEY_READ, &reading), ERROR_SUCCESS);
    EXPECT_EQ(RegSetValueExA(reading, "x", 0, REG_SZ, reinterpret_cast<const BYTE*>("y"), 2), ERROR_ACCESS_DENIED);
    RegCloseKey(reading);
}

TEST_F(RegistryCalls, SubKeysComeSortedWithoutRegardToCase) {
    for (const char* name : {"delta", "Alpha", "charlie 10", "Bravo", "charlie 2", "a"}) {
        Make(key, name);
    }
    const std::vector<std::string> expected = {"a", "Alpha", "Bravo", "charlie 10", "charlie 2", "delta"};
    EXPECT_EQ(SubKeys(key), expected);
}

TEST_F(RegistryCalls, SubKeysAreCountedAnewAfterAChange) {
    Make(key, "b");
    Make(key, "c");
    char name[256];
    DWORD length = sizeof name;
    ASSERT_EQ(RegEnumKeyExA(key, 1, name, &length, nullptr, nullptr, nullptr, nullptr), ERROR_SUCCESS);
    EXPECT_STREQ(name, "c");
    Make(key, "a");
    length = sizeof name;
    ASSERT_EQ(RegEnumKeyExA(key, 1, name, &length, nullptr, nullptr, nullptr, nullptr), ERROR_SUCCESS);
    EXPECT_STREQ(name, "b");
}

TEST_F(RegistryCalls, EnumeratingEndsWithNoMoreItems) {
    char name[256];
    DWORD length = sizeof name;
    EXPECT_EQ(RegEnumKeyExA(key, 0, name, &length, nullptr, nullptr, nullptr, nullptr), ERROR_NO_MORE_ITEMS);
}

TEST_F(RegistryCalls, ANameThatDoesNotFitIsMoreData) {
    Make(key, "12345");
    char name[256];
    DWORD length = 5;
    EXPECT_EQ(RegEnumKeyExA(key, 0, name, &length, nullptr, nullptr, nullptr, nullptr), ERROR_MORE_DATA);
    length = 6;
    EXPECT_EQ(RegEnumKeyExA(key, 0, name, &length, nullptr, nullptr, nullptr, nullptr), ERROR_SUCCESS);
    EXPECT_EQ(length, 5u);
}

TEST_F(RegistryCalls, ValuesComeBackWithTypeAndSize) {
    struct Case {
        const char* name;
        DWORD type;
        std::string data;
    };
    const std::vector<Case> cases = {{"text", REG_SZ, std::string("text\0", 5)},
                                     {"empty", REG_SZ, std::string(1, '\0')},
                                     {"umlaut", REG_SZ, std::string("\xC3\xBC\0", 3)},
                                     {"bytes", REG_BINARY, Bytes({0, 255, 10})},
                                     {"no bytes", REG_BINARY, ""},
                                     {"number", REG_DWORD, Bytes({1, 2, 3, 4})},
                                     {"long", REG_QWORD, Bytes({1, 2, 3, 4, 5, 6, 7, 8})},
                                     {"list", REG_MULTI_SZ, std::string("a\0b\0\0", 5)},
                                     {"none", REG_NONE, Bytes({7})}};
    std::size_t ran = 0;
    for (const Case& one : cases) {
        ASSERT_EQ(Set(one.name, one.type, one.data), ERROR_SUCCESS) << one.name;
        const Answer answer = Get(one.name);
        EXPECT_EQ(answer.error, ERROR_SUCCESS) << one.name;
        EXPECT_EQ(answer.type, one.type) << one.name;
        EXPECT_EQ(answer.data, one.data) << one.name;
        ++ran;
    }
    EXPECT_EQ(ran, 9u);
}

TEST_F(RegistryCalls, AMissingValueIsNoFile) {
    EXPECT_EQ(Get("missing").error, ERROR_FILE_NOT_FOUND);
}

TEST_F(RegistryCalls, ValueNamesAreFoundInAnyCase) {
    ASSERT_EQ(Set("Name", REG_SZ, std::string("x\0", 2)), ERROR_SUCCESS);
    ASSERT_EQ(Set("NAME", REG_SZ, std::string("y\0", 2)), ERROR_SUCCESS);
    EXPECT_EQ(Get("name").data, std::string("y\0", 2));
}

TEST_F(RegistryCalls, TheDefaultValueHasNoName) {
    ASSERT_EQ(Set("", REG_SZ, std::string("x\0", 2)), ERROR_SUCCESS);
    EXPECT_EQ(Get(nullptr).data, std::string("x\0", 2));
}

TEST_F(RegistryCalls, ASmallBufferIsToldTheSizeNeeded) {
    ASSERT_EQ(Set("text", REG_SZ, std::string("12345\0", 6)), ERROR_SUCCESS);
    const Answer small = Get("text", RRF_RT_ANY, 5);
    EXPECT_EQ(small.error, ERROR_MORE_DATA);
    EXPECT_GE(small.size, 6u);
    EXPECT_EQ(Get("text", RRF_RT_ANY, 6).error, ERROR_SUCCESS);
}

TEST_F(RegistryCalls, WithoutABufferTheSizeAloneIsGiven) {
    ASSERT_EQ(Set("bytes", REG_BINARY, "12345"), ERROR_SUCCESS);
    DWORD size = 0;
    EXPECT_EQ(RegGetValueA(key, nullptr, "bytes", RRF_RT_ANY, nullptr, nullptr, &size), ERROR_SUCCESS);
    EXPECT_EQ(size, 5u);
}

TEST_F(RegistryCalls, TextStoredWithoutATerminatorIsGivenWithOne) {
    ASSERT_EQ(Set("text", REG_SZ, "abc"), ERROR_SUCCESS);
    const Answer answer = Get("text");
    EXPECT_EQ(answer.error, ERROR_SUCCESS);
    EXPECT_EQ(answer.data, std::string("abc\0", 4));
}

TEST_F(RegistryCalls, ExpandableTextIsExpandedAndCalledText) {
    SetEnvironmentVariableA("HV_TEST_PLACE", "here");
    ASSERT_EQ(Set("text", REG_EXPAND_SZ, std::string("<%hv_test_place%> %HV_NO_SUCH% 100%\0", 36)), ERROR_SUCCESS);
    const Answer answer = Get("text");
    EXPECT_EQ(answer.error, ERROR_SUCCESS);
    EXPECT_EQ(answer.type, static_cast<DWORD>(REG_SZ));
    EXPECT_STREQ(answer.data.c_str(), "<here> %HV_NO_SUCH% 100%");
}

TEST_F(RegistryCalls, ExpandableTextStaysAsItIsWhenAsked) {
    ASSERT_EQ(Set("text", REG_EXPAND_SZ, std::string("%TEMP%\0", 7)), ERROR_SUCCESS);
    const Answer answer = Get("text", RRF_RT_ANY | RRF_NOEXPAND);
    EXPECT_EQ(answer.type, static_cast<DWORD>(REG_EXPAND_SZ));
    EXPECT_EQ(answer.data, std::string("%TEMP%\0", 7));
}

TEST_F(RegistryCalls, AskingForExpandableTextAloneIsRefusedUnlessItStaysAsItIs) {
    ASSERT_EQ(Set("text", REG_EXPAND_SZ, std::string("x\0", 2)), ERROR_SUCCESS);
    EXPECT_EQ(Get("text", RRF_RT_REG_EXPAND_SZ).error, ERROR_INVALID_PARAMETER);
    EXPECT_EQ(Get("text", RRF_RT_REG_EXPAND_SZ | RRF_NOEXPAND).error, ERROR_SUCCESS);
}

TEST_F(RegistryCalls, AnotherTypeThanTheOneAskedForIsUnsupported) {
    ASSERT_EQ(Set("number", REG_DWORD, Bytes({1, 0, 0, 0})), ERROR_SUCCESS);
    EXPECT_EQ(Get("number", RRF_RT_REG_SZ).error, ERROR_UNSUPPORTED_TYPE);
    EXPECT_EQ(Get("number", RRF_RT_REG_SZ | RRF_RT_REG_DWORD).error, ERROR_SUCCESS);
}

TEST_F(RegistryCalls, ABufferWithoutASizeIsRefused) {
    char buffer[8];
    EXPECT_EQ(RegGetValueA(key, nullptr, "x", RRF_RT_ANY, nullptr, buffer, nullptr), ERROR_INVALID_PARAMETER);
}

TEST_F(RegistryCalls, ValuesAreReadThroughASubKey) {
    ASSERT_EQ(RegSetKeyValueA(key, R"(below\deep)", "x", REG_SZ, "y", 2), ERROR_SUCCESS);
    char buffer[8];
    DWORD size = sizeof buffer;
    EXPECT_EQ(RegGetValueA(key, R"(below\deep)", "x", RRF_RT_ANY, nullptr, buffer, &size), ERROR_SUCCESS);
    EXPECT_STREQ(buffer, "y");
    EXPECT_EQ(RegGetValueA(key, "elsewhere", "x", RRF_RT_ANY, nullptr, buffer, &size), ERROR_FILE_NOT_FOUND);
}

TEST_F(RegistryCalls, SettingWithoutASubKeySetsInTheKey) {
    ASSERT_EQ(RegSetKeyValueA(key, nullptr, "x", REG_EXPAND_SZ, "y", 2), ERROR_SUCCESS);
    EXPECT_EQ(Get("x").data, std::string("y\0", 2));
}

TEST_F(RegistryCalls, DeletingATreeTakesAllBelowIt) {
    Make(key, R"(tree\a\b)");
    ASSERT_EQ(RegDeleteTreeA(key, "tree"), ERROR_SUCCESS);
    EXPECT_EQ(Open(key, "tree"), ERROR_FILE_NOT_FOUND);
    EXPECT_EQ(RegDeleteTreeA(key, "tree"), ERROR_FILE_NOT_FOUND);
}

TEST_F(RegistryCalls, DeletingATreeWithoutANameEmptiesTheKey) {
    Make(key, R"(a\b)");
    ASSERT_EQ(Set("x", REG_SZ, std::string("y\0", 2)), ERROR_SUCCESS);
    ASSERT_EQ(RegDeleteTreeA(key, nullptr), ERROR_SUCCESS);
    EXPECT_TRUE(SubKeys(key).empty());
    EXPECT_EQ(Get("x").error, ERROR_FILE_NOT_FOUND);
}

TEST_F(RegistryCalls, AHandleToADeletedKeyIsDead) {
    HKEY doomed = nullptr;
    ASSERT_EQ(Create(key, "doomed", doomed), ERROR_SUCCESS);
    ASSERT_EQ(RegDeleteTreeA(key, "doomed"), ERROR_SUCCESS);
    EXPECT_EQ(RegSetValueExA(doomed, "x", 0, REG_SZ, reinterpret_cast<const BYTE*>("y"), 2), ERROR_KEY_DELETED);
    EXPECT_EQ(RegCloseKey(doomed), ERROR_SUCCESS);
}

TEST_F(RegistryCalls, TheClassesOfTheMachineAreAHiveOfTheirOwn) {
    Make(HKEY_CLASSES_ROOT, "Halvorn.Test");
    EXPECT_EQ(Open(HKEY_LOCAL_MACHINE, R"(SOFTWARE\Classes\Halvorn.Test)"), ERROR_SUCCESS);
}

TEST_F(RegistryCalls, ALongNameIsRefused) {
    HKEY made = nullptr;
    EXPECT_NE(Create(key, std::string(300, 'x').c_str(), made), ERROR_SUCCESS);
    ASSERT_EQ(Create(key, std::string(255, 'x').c_str(), made), ERROR_SUCCESS);
    RegCloseKey(made);
}

std::string Repeated(const char* text, std::size_t count) {
    std::string repeated;
    for (std::size_t at = 0; at < count; ++at) {
        repeated += text;
    }
    return repeated;
}

TEST_F(RegistryCalls, ALongNameIsCountedInCharactersAndNotInBytes) {
    HKEY made = nullptr;
    ASSERT_EQ(Create(key, Repeated("\xC3\xBC", 255).c_str(), made), ERROR_SUCCESS);
    RegCloseKey(made);
}

TEST_F(RegistryCalls, ALongNameOfAValueIsRefused) {
    EXPECT_EQ(Set(std::string(16383, 'x').c_str(), REG_SZ, std::string("y\0", 2)), ERROR_SUCCESS);
    EXPECT_EQ(Set(std::string(16384, 'x').c_str(), REG_SZ, std::string("y\0", 2)), ERROR_INVALID_PARAMETER);
}

TEST_F(RegistryCalls, TheFreshMachineHasAListOfInstalledPrograms) {
    EXPECT_EQ(Open(HKEY_LOCAL_MACHINE, R"(SOFTWARE\Microsoft\Windows\CurrentVersion\Uninstall)"), ERROR_SUCCESS);
}

}  // namespace
