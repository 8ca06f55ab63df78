// What can be asked only where the link file is written by our own hand: a full disk, the file's every byte, and
// another reader of the format.
#include <gtest/gtest.h>

#include <array>
#include <cstdio>
#include <cstdlib>
#include <memory>

#include "hvframework/Shortcut.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/Faults.h"
#include "tests/support/LinkFileReader.h"
#include "tests/support/Machine.h"

namespace {

using HVL::FileUtils::MakeShortcut;

constexpr const char* kProgram = R"(C:\Program Files\Halvorn\Glow\Glow.exe)";
constexpr const char* kLink = R"(C:\Users\Public\Glow.lnk)";

class ShortcutHostedTest : public testing::Test {
protected:
    ShortcutHostedTest() { machine.Has(kProgram, "program"); }

    Machine machine;
};

std::string OutputOf(const std::string& command) {
    const std::unique_ptr<std::FILE, int (*)(std::FILE*)> pipe(popen(command.c_str(), "r"), pclose);
    std::string output;
    std::array<char, 4096> piece{};
    while (const std::size_t count = std::fread(piece.data(), 1, piece.size(), pipe.get())) {
        output.append(piece.data(), count);
    }
    return output;
}

}  // namespace

TEST_F(ShortcutHostedTest, SpellsItsTargetAsShellItemsToo) {
    EXPECT_EQ(MakeShortcut(kProgram, kLink), 0);
    EXPECT_EQ(ReadLinkFile(machine.Content(kLink)).itemsTarget, kProgram);
}

TEST_F(ShortcutHostedTest, NamesKindAndSizeOfItsTarget) {
    EXPECT_EQ(MakeShortcut(kProgram, kLink), 0);
    EXPECT_EQ(ReadLinkFile(machine.Content(kLink)).attributes, 0x20U);
    EXPECT_EQ(ReadLinkFile(machine.Content(kLink)).size, 7U);
}

TEST_F(ShortcutHostedTest, SaysOfAFolderThatItIsOne) {
    machine.HasFolder(R"(C:\Users\Public\Presets)");
    EXPECT_EQ(MakeShortcut(R"(C:\Users\Public\Presets)", kLink), 0);
    EXPECT_EQ(ReadLinkFile(machine.Content(kLink)).attributes, 0x10U);
    EXPECT_EQ(ReadLinkFile(machine.Content(kLink)).size, 0U);
}

TEST_F(ShortcutHostedTest, IsTheSameFileEachTime) {
    EXPECT_EQ(MakeShortcut(kProgram, kLink), 0);
    EXPECT_EQ(MakeShortcut(kProgram, R"(C:\Users\Public\Again.lnk)"), 0);
    EXPECT_EQ(machine.Content(kLink), machine.Content(R"(C:\Users\Public\Again.lnk)"));
}

TEST_F(ShortcutHostedTest, LeavesNoHalfLinkOnAFullDisk) {
    MachineFaults faults(machine);
    faults.LimitSpace(100);
    std::string errors;
    {
        CapturedStreams streams;
        EXPECT_EQ(MakeShortcut(kProgram, kLink), -1);
        errors = streams.Errors();
    }
    EXPECT_EQ(errors, "ERROR at HVL::FileUtils::MakeShortcut:513\n");
    EXPECT_FALSE(machine.Exists(kLink));
}

TEST_F(ShortcutHostedTest, IsReadByTheToolsOfOthers) {
    ASSERT_FALSE(OutputOf("command -v lnkinfo").empty()) << "lnkinfo is missing; scripts/setup installs it";
    EXPECT_EQ(MakeShortcut(kProgram, kLink), 0);
    const std::string report = OutputOf("lnkinfo '" + machine.HostName(kLink) + "' 2>&1");
    for (const std::string part : {": Halvorn shortcut\n", R"(: C:\Program Files\Halvorn\Glow\Glow.exe)",
                                   "Drive type\t\t\t: Fixed (3)", "Shell item: 6"}) {
        EXPECT_NE(report.find(part), std::string::npos) << part << " is not in\n" << report;
    }
}
