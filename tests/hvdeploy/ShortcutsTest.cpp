// The shortcuts of a payload: where they go, and what they are found to point to.
#include "platform/win32.h"
#include "tests/hvdeploy/SideActionsTest.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/Link.h"

namespace {

constexpr const char* kProgram = R"(C:\Glow\bin\Glow.exe)";
constexpr const char* kStartMenuLink = R"(C:\ProgramData\Microsoft\Windows\Start Menu\Programs\Glow.lnk)";

class ShortcutsTest : public SideActionsTest {
protected:
    ShortcutsTest() {
        shortcut.sysdir = "startmenu";
        shortcut.original = "Glow.exe";
        machine.Has(kProgram, "program");
        placed = {R"(C:\Glow\Readme.txt)", kProgram};
    }

    HV::EngineResult Make() { return engine.MakeShortcut(shortcut, placed, installed); }

    /// The same, with what is printed held back.
    HV::EngineResult MakeSilently() {
        const CapturedStreams streams;
        return Make();
    }

    /// Makes it, and gives what it points to.
    std::string TargetAt(const std::string& link) {
        EXPECT_EQ(Make(), 1) << log.Text();
        return LinkOf(machine, link).target;
    }

    /// Nothing was made, and the last line of the log says why.
    void ExpectRefusal(const std::string& reason) {
        const auto before = machine.Files();
        EXPECT_EQ(Make(), -1);
        EXPECT_EQ(log.Lines().back(), ErrorLine(reason));
        EXPECT_TRUE(installed.empty());
        EXPECT_EQ(machine.Files(), before);
    }

    HV::Shortcut shortcut;
    std::vector<std::string> placed;
    std::vector<std::string> installed;
};

}  // namespace

TEST_F(ShortcutsTest, PointToTheInstalledFileAndAreListedWithTheFiles) {
    installed = {"what was there"};
    EXPECT_EQ(TargetAt(kStartMenuLink), kProgram);
    EXPECT_EQ(installed, (std::vector<std::string>{"what was there", kStartMenuLink}));
    EXPECT_EQ(log.Lines(), std::vector<std::string>{DebugLine("HV::Deploy::HV::Deploy::MakeShortcut")});
}

TEST_F(ShortcutsTest, GoIntoTheFolderOfTheirKeyword) {
    const std::string user = machine.UserFolder();
    const std::vector<std::pair<std::string, std::string>> folders{
        {"commondocs", R"(C:\Users\Public\Documents)"},
        {"localappdata", user + R"(\AppData\Local)"},
        {"ofx", R"(C:\Program Files\Common Files\OFX\Plugins)"},
        {"programdata", R"(C:\ProgramData)"},
        {"programfiles", R"(C:\Program Files)"},
        {"programfiles32", R"(C:\Program Files (x86))"},
        {"logs", R"(C:\ProgramData\Halvorn\logs)"},
        {"userlogs", user + R"(\AppData\Roaming\Halvorn\logs)"},
        {"history", R"(C:\ProgramData\Halvorn\.hvdeploy\history)"},
        {"startmenu", R"(C:\ProgramData\Microsoft\Windows\Start Menu\Programs)"},
        {"temp", machine.TempFolder()},
        {"winsys", R"(C:\Windows\System32)"},
    };
    std::size_t seen = 0;
    for (const auto& [keyword, folder] : folders) {
        shortcut.sysdir = keyword;
        EXPECT_EQ(Make(), 1) << keyword << "\n" << log.Text();
        ASSERT_EQ(installed.size(), ++seen);
        EXPECT_EQ(installed.back(), folder + R"(\Glow.lnk)");
        EXPECT_TRUE(machine.HasFile(installed.back())) << installed.back();
    }
    EXPECT_EQ(seen, 12U);
}

TEST_F(ShortcutsTest, KnowOneFolderByTwoKeywords) {
    shortcut.sysdir = "commonappdata";
    EXPECT_EQ(TargetAt(R"(C:\ProgramData\Glow.lnk)"), kProgram);
}

TEST_F(ShortcutsTest, RefuseEveryOtherKeyword) {
    int seen = 0;
    for (const std::string keyword : {"applications", "appsupport", "frameworks", "launchdaemons", "userappsupport",
                                      "usersshared", "STARTMENU", "desktop", ""}) {
        shortcut.sysdir = keyword;
        ExpectRefusal("Invalid sysdir specified for shortcut.");
        ++seen;
    }
    EXPECT_EQ(seen, 9);
}

TEST_F(ShortcutsTest, GoBelowTheFolderOfTheirKeyword) {
    shortcut.subdir = R"(Halvorn\Glow)";
    EXPECT_EQ(TargetAt(R"(C:\ProgramData\Microsoft\Windows\Start Menu\Programs\Halvorn\Glow\Glow.lnk)"), kProgram);
}

TEST_F(ShortcutsTest, GoWhereAnAbsolutePathSays) {
    shortcut.sysdir = "absolutepath";
    shortcut.subdir = R"(C:\Links\Halvorn)";
    EXPECT_EQ(TargetAt(R"(C:\Links\Halvorn\Glow.lnk)"), kProgram);
}

TEST_F(ShortcutsTest, NeedAFolder) {
    shortcut.sysdir = "absolutepath";
    ExpectRefusal("Empty shortcut system directory specification.");
    shortcut.sysdir = "localappdata";
    SetEnvironmentVariableA("LOCALAPPDATA", nullptr);
    ExpectRefusal("Empty shortcut system directory specification.");
}

TEST_F(ShortcutsTest, CutTheEndingOfAProgramAndOfNothingElse) {
    const std::vector<std::pair<std::string, std::string>> names{
        {"Glow.exe", "Glow.lnk"},
        {"Glow.EXE", "Glow.EXE.lnk"},
        {"Manual.pdf", "Manual.pdf.lnk"},
        {R"(bin\Tool.exe)", "Tool.lnk"},
    };
    int seen = 0;
    for (const auto& [original, link] : names) {
        machine.Has(R"(C:\Glow\)" + original, "content");
        placed = {R"(C:\Glow\)" + original};
        shortcut.original = original;
        shortcut.subdir = "folder " + std::to_string(seen);
        EXPECT_EQ(Make(), 1) << original;
        EXPECT_TRUE(installed.back().ends_with("\\folder " + std::to_string(seen) + "\\" + link)) << installed.back();
        ++seen;
    }
    EXPECT_EQ(seen, 4);
}

TEST_F(ShortcutsTest, PointToTheFirstFileThatEndsInTheName) {
    machine.Has(R"(C:\Other\AfterGlow.exe)", "program");
    placed = {R"(C:\Glow\Glow.exe.txt)", R"(C:\Other\AfterGlow.exe)", kProgram};
    EXPECT_EQ(TargetAt(kStartMenuLink), R"(C:\Other\AfterGlow.exe)");
}

TEST_F(ShortcutsTest, FindNoTargetInAnotherCase) {
    shortcut.original = "glow.exe";
    ExpectRefusal("Shortcut source path not found.");
}

TEST_F(ShortcutsTest, FindNoTargetAmongNoFiles) {
    placed.clear();
    ExpectRefusal("Shortcut source path not found.");
}

TEST_F(ShortcutsTest, DoNotPointToWhatIsGone) {
    placed = {R"(C:\Gone\Glow.exe)", kProgram};
    ExpectRefusal("Shortcut source path not found.");
}

TEST_F(ShortcutsTest, HaveNoFolderMadeForATargetThatIsNotFound) {
    shortcut.subdir = R"(Halvorn\Glow)";
    placed.clear();
    ExpectRefusal("Shortcut source path not found.");
    placed = {R"(C:\Gone\Glow.exe)"};
    ExpectRefusal("Shortcut source path not found.");
}

TEST_F(ShortcutsTest, AskForTheKeywordThenTheFolderThenTheTarget) {
    placed.clear();
    shortcut.sysdir = "desktop";
    ExpectRefusal("Invalid sysdir specified for shortcut.");
    shortcut.sysdir = "absolutepath";
    ExpectRefusal("Empty shortcut system directory specification.");
    shortcut.subdir = kProgram;
    ExpectRefusal("Shortcut source path not found.");
}

TEST_F(ShortcutsTest, OfFoldersPointToTheTextFromTheFirstSharedCharacterOn) {
    int seen = 0;
    for (const std::string type : {"dir", "bundle"}) {
        shortcut.originalType = type;
        shortcut.original = "Glow";
        shortcut.subdir = type;
        EXPECT_EQ(Make(), 1) << log.Text();
        EXPECT_EQ(LinkOf(machine, installed.back()).target, R"(C:\Glow)");
        ++seen;
    }
    EXPECT_EQ(seen, 2);
}

TEST_F(ShortcutsTest, OfFoldersDoNotLookForTheWholeName) {
    // The first character that the path shares with the name is the "o" of "Program", so that the target would be
    // "C:\Progra".
    machine.Has(R"(C:\Program Files\Glow\Glow.txt)", "text");
    placed = {R"(C:\Program Files\Glow\Glow.txt)"};
    shortcut.originalType = "dir";
    shortcut.original = "Glow";
    ExpectRefusal("Shortcut source path not found.");
}

TEST_F(ShortcutsTest, OfFoldersTakeTheFirstPathThatSharesACharacter) {
    machine.Has(R"(C:\Glow\a.txt)", "text");
    placed = {R"(Z:\x\y)", R"(C:\Glow\a.txt)"};
    shortcut.originalType = "dir";
    shortcut.original = "Glow";
    EXPECT_EQ(TargetAt(R"(C:\ProgramData\Microsoft\Windows\Start Menu\Programs\Glow.lnk)"), R"(C:\Glow)");
}

TEST_F(ShortcutsTest, OfUnknownTypesAreThoseOfFiles) {
    shortcut.originalType = "Dir";
    EXPECT_EQ(TargetAt(kStartMenuLink), kProgram);
}

TEST_F(ShortcutsTest, FailWhereAFileStandsInTheFoldersPlace) {
    machine.Has(R"(C:\Links)", "a file");
    shortcut.sysdir = "absolutepath";
    shortcut.subdir = R"(C:\Links)";
    ExpectRefusal(R"(Failed to create shortcut directory at C:\Links)");
}

TEST_F(ShortcutsTest, AreKeptWhereTheyExist) {
    machine.Has(kStartMenuLink, "the user's own");
    EXPECT_EQ(Make(), 0);
    EXPECT_EQ(machine.Content(kStartMenuLink), "the user's own");
    EXPECT_TRUE(installed.empty());
}

TEST_F(ShortcutsTest, FailWhereAFolderHasTheirName) {
    machine.HasFolder(kStartMenuLink);
    const auto before = machine.Files();
    EXPECT_EQ(MakeSilently(), -1);
    EXPECT_EQ(log.Lines().back(), ErrorLine("MakeShortcut() returned -1"));
    EXPECT_TRUE(installed.empty());
    EXPECT_EQ(machine.Files(), before);
}

TEST_F(ShortcutsTest, FailWhenTheirPathDoesNotFitTheShell) {
    shortcut.sysdir = "absolutepath";
    shortcut.subdir = R"(C:\)" + std::string(120, 'a') + "\\" + std::string(100, 'b');
    shortcut.original = std::string(60, 'c');
    placed = {R"(C:\Glow\)" + shortcut.original};
    machine.Has(placed[0], "content");
    EXPECT_EQ(MakeSilently(), -1);
    EXPECT_EQ(log.Lines().back(), ErrorLine("MakeShortcut() returned -1"));
    EXPECT_TRUE(installed.empty());
}
