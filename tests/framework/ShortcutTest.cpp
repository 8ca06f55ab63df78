#include "hvframework/Shortcut.h"

#include <gtest/gtest.h>

#include "tests/support/CapturedStreams.h"
#include "tests/support/Link.h"
#include "tests/support/Machine.h"

namespace {

using HVL::FileUtils::MakeShortcut;

constexpr const char* kProgram = R"(C:\Program Files\Halvorn\Glow\Glow.exe)";
constexpr const char* kLink = R"(C:\Users\Public\Glow.lnk)";

class ShortcutTest : public testing::Test {
protected:
    LinkContent Link(const std::string& path = kLink) const { return LinkOf(machine, path); }

    Machine machine;
};

struct Attempt {
    int result = 0;
    std::string errors;
    std::string output;
};

// What is printed meanwhile is held back.
Attempt Try(const std::string& target, const std::string& link) {
    CapturedStreams streams;
    const int result = MakeShortcut(target, link);
    return {result, streams.Errors(), streams.Output()};
}

constexpr const char* kNotSaved = "ERROR at HVL::FileUtils::MakeShortcut:513\n";

// A path in C:\Users\Public of exactly `length` characters.
std::string PathOfLength(std::size_t length, const std::string& end) {
    const std::string start = R"(C:\Users\Public\)";
    return start + std::string(length - start.size() - end.size(), 'x') + end;
}

}  // namespace

TEST_F(ShortcutTest, PointsToItsTarget) {
    machine.Has(kProgram, "program");
    EXPECT_EQ(MakeShortcut(kProgram, kLink), 0);
    EXPECT_EQ(Link().target, kProgram);
}

TEST_F(ShortcutTest, DescribesItself) {
    machine.Has(kProgram, "program");
    EXPECT_EQ(MakeShortcut(kProgram, kLink), 0);
    EXPECT_EQ(Link().description, "Halvorn shortcut");
}

TEST_F(ShortcutTest, OfAProgramShowsTheProgramsFirstIcon) {
    machine.Has(kProgram, "program");
    EXPECT_EQ(MakeShortcut(kProgram, kLink), 0);
    EXPECT_EQ(Link().icon, kProgram);
    EXPECT_EQ(Link().iconIndex, 0);
}

TEST_F(ShortcutTest, OfAnythingElseNamesNoIcon) {
    int seen = 0;
    for (const std::string target : {R"(C:\Users\Public\Manual.pdf)", R"(C:\Users\Public\Glow.EXE)"}) {
        machine.Has(target, "content");
        EXPECT_EQ(MakeShortcut(target, kLink), 0);
        EXPECT_EQ(Link().icon, "") << target;
        ++seen;
    }
    EXPECT_EQ(seen, 2);
}

TEST_F(ShortcutTest, PointsToAFolder) {
    machine.HasFolder(R"(C:\Users\Public\Presets)");
    EXPECT_EQ(MakeShortcut(R"(C:\Users\Public\Presets)", kLink), 0);
    EXPECT_EQ(Link().target, R"(C:\Users\Public\Presets)");
}

TEST_F(ShortcutTest, KeepsNamesOfAllScripts) {
    const std::string target = "C:\\Users\\Public\\Glühen \xE5\x85\x89 \xF0\x9F\x92\xA1.pdf";
    const std::string link = "C:\\Users\\Public\\Glühen \xE5\x85\x89.lnk";
    machine.Has(target, "content");
    EXPECT_EQ(MakeShortcut(target, link), 0);
    EXPECT_EQ(Link(link).target, target);
}

TEST_F(ShortcutTest, TakesThePlaceOfAnOlderLink) {
    machine.Has(kProgram, "program");
    machine.Has(kLink, std::string(10000, 'o'));
    EXPECT_EQ(MakeShortcut(kProgram, kLink), 0);
    EXPECT_EQ(Link().target, kProgram);
}

TEST_F(ShortcutTest, IsMadeOntoNothingToo) {
    EXPECT_EQ(MakeShortcut(R"(C:\Users\Public\Nothing.pdf)", kLink), 0);
    EXPECT_EQ(Link().description, "Halvorn shortcut");
}

TEST_F(ShortcutTest, SaysOnStandardErrorThatItCouldNotBeSaved) {
    machine.Has(kProgram, "program");
    const Attempt attempt = Try(kProgram, R"(C:\Users\Public\No such folder\Glow.lnk)");
    EXPECT_EQ(attempt.result, -1);
    EXPECT_EQ(attempt.errors, kNotSaved);
    EXPECT_EQ(attempt.output, "");
}

TEST_F(ShortcutTest, CannotTakeThePlaceOfAFolder) {
    machine.Has(kProgram, "program");
    machine.HasFolder(kLink);
    const auto before = machine.Files();
    const Attempt attempt = Try(kProgram, kLink);
    EXPECT_EQ(attempt.result, -1);
    EXPECT_EQ(attempt.errors, kNotSaved);
    EXPECT_EQ(machine.Files(), before);
}

TEST_F(ShortcutTest, TakesATargetThatFillsTheShellsBuffer) {
    const std::string target = PathOfLength(259, ".pdf");
    machine.Has(target, "content");
    EXPECT_EQ(MakeShortcut(target, kLink), 0);
    EXPECT_EQ(Link().target, target);
}

TEST_F(ShortcutTest, RefusesATargetThatOverflowsTheShellsBuffer) {
    int seen = 0;
    for (const std::string& target : {PathOfLength(260, ".pdf"), std::string(1000000, 'x')}) {
        const Attempt attempt = Try(target, kLink);
        EXPECT_EQ(attempt.result, -1);
        EXPECT_EQ(attempt.errors, "");
        EXPECT_FALSE(machine.Exists(kLink));
        ++seen;
    }
    EXPECT_EQ(seen, 2);
}

TEST_F(ShortcutTest, RefusesALinkPathThatOverflowsTheShellsBuffer) {
    machine.Has(kProgram, "program");
    const auto before = machine.Files();
    const Attempt attempt = Try(kProgram, PathOfLength(260, ".lnk"));
    EXPECT_EQ(attempt.result, -1);
    EXPECT_EQ(attempt.errors, kNotSaved);
    EXPECT_EQ(machine.Files(), before);
}
