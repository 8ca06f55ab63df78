#include "platform/hosted/registry_text.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

using hosted::ParseRegistryText;
using hosted::RegistryChange;
using hosted::RegistryTextError;
using Kind = RegistryChange::Kind;

const std::string Key = "[HKEY_LOCAL_MACHINE\\Software\\x]\n";

std::vector<RegistryChange> Parse(const std::string& body) {
    return ParseRegistryText("REGEDIT4\n\n" + body);
}

/// The one value that `line` sets.
RegistryChange Value(const std::string& line) {
    const std::vector<RegistryChange> changes = Parse(Key + line + "\n");
    EXPECT_EQ(changes.size(), 2u) << line;
    return changes.size() == 2 ? changes[1] : RegistryChange();
}

std::size_t LineOfError(const std::string& text) {
    try {
        ParseRegistryText(text);
    } catch (const RegistryTextError& error) {
        EXPECT_STRNE(error.what(), "");
        return error.Line();
    }
    return 0;
}

TEST(RegistryText, HoldsNothingBehindItsFirstLine) {
    EXPECT_TRUE(ParseRegistryText("REGEDIT4").empty());
    EXPECT_TRUE(ParseRegistryText("\xEF\xBB\xBFREGEDIT4\r\n\r\n; a remark\r\n").empty());
}

TEST(RegistryText, MakesAndDeletesKeys) {
    const auto changes = Parse("[HKEY_CURRENT_USER\\a]\n[-HKEY_CURRENT_USER\\b]\n");
    ASSERT_EQ(changes.size(), 2u);
    EXPECT_EQ(changes[0].kind, Kind::MakeKey);
    EXPECT_EQ(changes[0].key, "HKEY_CURRENT_USER\\a");
    EXPECT_EQ(changes[1].kind, Kind::DeleteKey);
    EXPECT_EQ(changes[1].key, "HKEY_CURRENT_USER\\b");
}

TEST(RegistryText, AKeysNameMayHoldBrackets) {
    EXPECT_EQ(Parse("[HKEY_CURRENT_USER\\a[1]]\n")[0].key, "HKEY_CURRENT_USER\\a[1]");
}

TEST(RegistryText, ReadsEveryFormOfAValue) {
    struct Case {
        std::string line;
        std::string name;
        std::uint32_t type;
        std::string data;
    };
    const std::vector<Case> cases = {
        {R"("a"="text")", "a", 1, std::string("text\0", 5)},
        {R"(@="default")", "", 1, std::string("default\0", 8)},
        {R"("a"="C:\\x \"y\"")", "a", 1, std::string("C:\\x \"y\"\0", 9)},
        {R"("a=\"b\""="")", "a=\"b\"", 1, std::string(1, '\0')},
        {R"(  "a" = "b" ; remark)", "a", 1, std::string("b\0", 2)},
        {R"("a"=dword:0000002a)", "a", 4, std::string("\x2A\0\0\0", 4)},
        {R"("a"=dword:89ABCDEF)", "a", 4, "\xEF\xCD\xAB\x89"},
        {R"("a"=hex:)", "a", 3, ""},
        {R"("a"=hex:0a,ff)", "a", 3, "\x0A\xFF"},
        {R"("a"=hex(0):01)", "a", 0, "\x01"},
        {R"("a"=hex(2):25,00)", "a", 2, std::string("%\0", 2)},
        {R"("a"=hex(6):78,00)", "a", 6, std::string("x\0", 2)},
        {R"("a"=hex(7):61,00,62,00,00)", "a", 7, std::string("a\0b\0\0", 5)},
        {R"("a"=hex(b):01,00,00,00,00,00,00,00)", "a", 11, std::string("\x01\0\0\0\0\0\0\0", 8)},
        {"\"a\"=hex:01,\\\n  02,\\\n  03", "a", 3, "\x01\x02\x03"}};
    std::size_t ran = 0;
    for (const Case& one : cases) {
        const RegistryChange value = Value(one.line);
        EXPECT_EQ(value.kind, Kind::SetValue) << one.line;
        EXPECT_EQ(value.key, "HKEY_LOCAL_MACHINE\\Software\\x") << one.line;
        EXPECT_EQ(value.name, one.name) << one.line;
        EXPECT_EQ(value.type, one.type) << one.line;
        EXPECT_EQ(value.data, one.data) << one.line;
        ++ran;
    }
    EXPECT_EQ(ran, 15u);
}

TEST(RegistryText, DeletesValues) {
    const RegistryChange value = Value(R"("a"=-)");
    EXPECT_EQ(value.kind, Kind::DeleteValue);
    EXPECT_EQ(value.name, "a");
}

TEST(RegistryText, NamesTheLineThatCannotBeRead) {
    const std::vector<std::string> bad = {"[HKEY_LOCAL_MACHINE\\x",
                                          "[HKEY_NOWHERE\\x]",
                                          "[HKLM\\x]",
                                          "[-HKEY_LOCAL_MACHINE]",
                                          "\"a\"",
                                          "\"a\"=",
                                          "\"a\"=x",
                                          "\"a=\"b",
                                          "\"a\"=\"b",
                                          "\"a\"=\"b\"c",
                                          "\"a\"=dword:",
                                          "\"a\"=dword:xyz",
                                          "\"a\"=dword:123456789",
                                          "\"a\"=hex:xy",
                                          "\"a\"=hex:123",
                                          "\"a\"=hex(:01",
                                          "\"a\"=hex(z):01",
                                          "\"a\"=hex:01,\\",
                                          "words"};
    std::size_t ran = 0;
    for (const std::string& line : bad) {
        EXPECT_EQ(LineOfError("REGEDIT4\r\n" + Key + line), 3u) << line;
        ++ran;
    }
    EXPECT_EQ(ran, 19u);
}

TEST(RegistryText, RefusesAnotherFormat) {
    EXPECT_EQ(LineOfError(""), 1u);
    EXPECT_EQ(LineOfError("Windows Registry Editor Version 5.00\n"), 1u);
}

TEST(RegistryText, RefusesAValueWithoutAKey) {
    EXPECT_EQ(LineOfError("REGEDIT4\n\"a\"=\"b\"\n"), 2u);
    EXPECT_EQ(LineOfError("REGEDIT4\n[-HKEY_CURRENT_USER\\x]\n\"a\"=\"b\"\n"), 3u);
}

/// The line of a key with so many names, that of the hive among them.
std::string DeepKey(const std::string& hive, std::size_t names) {
    std::string path = hive;
    for (std::size_t i = 1; i < names; ++i) {
        path += "\\k";
    }
    return "[" + path + "]\n";
}

TEST(RegistryText, RefusesAKeyThatLiesTooDeep) {
    EXPECT_EQ(Parse(DeepKey("HKEY_CURRENT_USER", 512)).size(), 1u);
    EXPECT_EQ(LineOfError("REGEDIT4\n" + DeepKey("HKEY_CURRENT_USER", 513)), 2u);
    EXPECT_EQ(LineOfError("REGEDIT4\n" + DeepKey("HKEY_CURRENT_USER", 200000)), 2u);
}

TEST(RegistryText, LeavesRoomForWhereAViewsKeysReallyLie) {
    std::size_t ran = 0;
    for (const std::string hive : {"HKEY_CLASSES_ROOT", "HKEY_CURRENT_CONFIG"}) {
        EXPECT_EQ(Parse(DeepKey(hive, 508)).size(), 1u) << hive;
        EXPECT_EQ(LineOfError("REGEDIT4\n" + DeepKey(hive, 509)), 2u) << hive;
        ++ran;
    }
    EXPECT_EQ(ran, 2u);
}

TEST(RegistryText, ReadsBackWhatItWrites) {
    const std::vector<std::pair<std::uint32_t, std::string>> values = {{1, std::string("plain\0", 6)},
                                                                       {1, std::string("C:\\a \"b\"\0", 9)},
                                                                       {1, "no terminator"},
                                                                       {1, std::string("two\0texts\0", 10)},
                                                                       {1, std::string("line\nend\0", 9)},
                                                                       {1, ""},
                                                                       {2, std::string("%x%\0", 4)},
                                                                       {3, std::string(200, '\x7F')},
                                                                       {3, ""},
                                                                       {4, std::string("\x01\x02\x03\x04", 4)},
                                                                       {4, "odd"},
                                                                       {0, "x"},
                                                                       {7, std::string("\0", 1)},
                                                                       {11, "12345678"},
                                                                       {0xFFFF0000, "far"}};
    std::size_t ran = 0;
    for (const auto& [type, data] : values) {
        const std::string text = hosted::RegistryTextHeader() + hosted::KeyLine("HKEY_CURRENT_USER\\x") +
                                 hosted::ValueLine("na\"me\\\n", type, data);
        const std::vector<RegistryChange> changes = ParseRegistryText(text);
        ASSERT_EQ(changes.size(), 2u) << text;
        EXPECT_EQ(changes[1].name, "na\"me\\\n") << text;
        EXPECT_EQ(changes[1].type, type) << text;
        EXPECT_EQ(changes[1].data, data) << text;
        ++ran;
    }
    EXPECT_EQ(ran, 15u);
}

TEST(RegistryText, BreaksLongBytesIntoLines) {
    const std::string line = hosted::ValueLine("a", 3, std::string(100, '\x01'));
    std::size_t longest = 0;
    for (std::size_t at = 0; at < line.size();) {
        const std::size_t end = line.find('\n', at);
        longest = std::max(longest, end - at);
        at = end + 1;
    }
    EXPECT_LE(longest, 80u);
}

}  // namespace
