#include <algorithm>
#include <filesystem>
#include <map>

#include "tests/support/Link.h"
#include "tests/support/RunProgram.h"
#include "tests/wizard/WizardTest.h"

namespace {

/// What an installation has left on the machine.
struct Left {
    std::map<std::string, std::string> files;
    std::string registry;
    bool operator==(const Left&) const = default;
};

std::vector<std::string> NamesIn(const std::string& folder) {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(folder)) {
        names.push_back(entry.path().filename().string());
    }
    return names;
}

class InstallTest : public WizardTest {
protected:
    /// A shortcut by what it says; its bytes hold times.
    [[nodiscard]] Left WhatIsLeft() const {
        Left left{machine().Files(), Registry()};
        for (auto& [name, content] : left.files) {
            if (name.ends_with(".lnk")) {
                const LinkContent link = LinkOf(machine(), name);
                content = link.target + '\n' + link.description + '\n' + link.icon;
            }
        }
        return left;
    }

    /// The same installation by the argument line, on another machine of the same kind.
    Left ByArgumentLine(const std::vector<std::string>& more) {
        StartOver();
        HasEveryHost();
        std::vector<std::string> arguments = {"dir=" + folder + "\\packages", "--legacyuninstall",
                                              R"(log=C:\ProgramData\Halvorn\Logs\line.log)"};
        arguments.insert(arguments.end(), more.begin(), more.end());
        EXPECT_EQ(RunProgram("hvdeploy", arguments).exitStatus, 0);
        return WhatIsLeft();
    }

    /// Installed files whose names hold one of these.
    [[nodiscard]] std::vector<std::string> Naming(const std::vector<std::string>& parts, const Left& left) const {
        std::vector<std::string> names;
        for (const auto& [name, content] : left.files) {
            const auto isIn = [&path = name](const std::string& part) { return path.find(part) != std::string::npos; };
            if (name.rfind(folder, 0) != 0 && std::any_of(parts.begin(), parts.end(), isIn)) {
                names.push_back(name);
            }
        }
        return names;
    }

    /// The names of those that differ; contents would drown a report.
    static std::vector<std::string> Differences(const Left& one, const Left& other) {
        std::vector<std::string> names;
        for (const auto& [name, content] : one.files) {
            const auto found = other.files.find(name);
            if (found == other.files.end() || found->second != content) {
                names.push_back(name);
            }
        }
        for (const auto& [name, content] : other.files) {
            if (one.files.count(name) == 0) {
                names.push_back(name);
            }
        }
        return names;
    }
};

TEST_F(InstallTest, InstallsTheReleaseToTheFinalPage) {
    HasEveryHost();
    RunningWizard wizard(folder);
    const HWND window = wizard.Window();
    const RECT start = OnScreen(window);
    GoToInstalling(wizard);

    // The window is 600, 650, 700, 750 and 800 wide in turn, and never anything else.
    std::vector<LONG> widths;
    EXPECT_TRUE(Eventually([&] {
        const RECT now = OnScreen(window);
        const LONG width = now.right - now.left;
        if (widths.empty() || widths.back() != width) {
            widths.push_back(width);
            EXPECT_EQ((width - 600) % 50, 0) << width;
            EXPECT_EQ(now,
                      (RECT{start.left - (width - 600) / 2, start.top, start.right + (width - 600) / 2, start.bottom}));
        }
        return width >= 800;
    }));
    EXPECT_EQ(widths.front(), 600);
    EXPECT_EQ(widths.back(), 800);
    EXPECT_TRUE(std::is_sorted(widths.begin(), widths.end()));

    ExpectControls(window, {{id::Continue, {495, 358, 575, 383}, 0x5801000B, false, false},
                            {id::Back, {405, 358, 485, 383}, 0x5801000B, false, false},
                            {id::Cancel, {195, 358, 275, 383}, 0x5001000B, false, true},
                            {id::WhatsNew, {145, 358, 275, 383}, 0x5001000B, true, true},
                            {id::Resources, {280, 358, 410, 383}, 0x5001000B, true, true},
                            {id::Close, {645, 358, 775, 383}, 0x5001000B, true, true}});
    const HWND page = wizard.PageWithoutControls();
    EXPECT_EQ(InParent(page), (RECT{0, 0, 800, 354}));
    RECT client{};
    GetClientRect(window, &client);
    EXPECT_TRUE(wizard.Shows(window, {look::ImageWithin(HV_RESOURCES "/final.bmp", {0, 0, client.right, 350}),
                                      look::Button("What's New...", {145, 358, 275, 383}, look::Face, look::Strip),
                                      look::Button("Resources...", {280, 358, 410, 383}, look::Face, look::Strip),
                                      look::Button("Close", {645, 358, 775, 383}, look::Face, look::Strip),
                                      look::Filled({0, 383, client.right, client.bottom}, look::Strip)}));
    KeepPicture("final", window);
    wizard.Press(window, id::Close);
    EXPECT_EQ(wizard.ExitStatus(), 0U);
    EXPECT_TRUE(IsRegistered());
}

TEST_F(InstallTest, LeavesWhatTheArgumentLineLeaves) {
    HasEveryHost();
    {
        RunningWizard wizard(folder);
        GoToFinal(wizard);
        wizard.Press(wizard.Window(), id::Close);
        EXPECT_EQ(wizard.ExitStatus(), 0U);
    }
    const Left byWizard = WhatIsLeft();
    EXPECT_GT(byWizard.files.size(), 150U);
    const Left byLine = ByArgumentLine({});
    EXPECT_EQ(Differences(byWizard, byLine), std::vector<std::string>());
    EXPECT_TRUE(byWizard.registry == byLine.registry) << "the registries differ";
}

TEST_F(InstallTest, LeavesOutWhatIsSwitchedOff) {
    HasEveryHost();
    {
        RunningWizard wizard(folder);
        GoToSelection(wizard);
        wizard.Press(wizard.Page(), ProductId(1));
        wizard.Press(wizard.Page(), ProductId(7));
        wizard.Press(wizard.Window(), id::Continue);
        EXPECT_TRUE(Eventually([&] { return GetDlgItem(wizard.Window(), id::Close) != nullptr; }));
        wizard.Press(wizard.Window(), id::Close);
        EXPECT_EQ(wizard.ExitStatus(), 0U);
    }
    const Left byWizard = WhatIsLeft();
    EXPECT_EQ(Naming({"TessalyGlow.", "tessaly.glow_v", "TessalyTitler.", "tessaly.titler_v"}, byWizard),
              std::vector<std::string>());
    EXPECT_FALSE(Naming({"TessalyGrain."}, byWizard).empty());
    const Left byLine = ByArgumentLine({"skip=com.halvorn.tessaly.glow,com.halvorn.tessaly.titler"});
    EXPECT_EQ(Differences(byWizard, byLine), std::vector<std::string>());
    EXPECT_TRUE(byWizard.registry == byLine.registry) << "the registries differ";
}

/// How many columns of the bar are filled; -1 when it is no bar.
int FillOf(const Picture& page) {
    int fill = 0;
    while (fill < 390 && page.At(fill, 76) == look::Fill) {
        ++fill;
    }
    const bool isBar = page.IsAll({0, 76, fill, 88}, look::Fill) && page.IsAll({fill, 76, 390, 88}, look::Track);
    return isBar ? fill : -1;
}

bool IsWholePercent(int fill) {
    for (int percent = 0; percent <= 100; ++percent) {
        if (percent * 390 / 100 == fill) {
            return true;
        }
    }
    return false;
}

TEST_F(InstallTest, ShowsHowFarItIs) {
    HasEveryHost();
    HoldAtScript("requirements");
    RunningWizard wizard(folder);
    GoToInstalling(wizard);
    const HWND window = wizard.Window();
    const HWND page = wizard.PageWithoutControls();
    EXPECT_EQ(InParent(page), (RECT{170, 37, 580, 345}));
    WaitUntilHeld();

    EXPECT_TRUE(
        wizard.Shows(page, {look::Words("Installing Tessaly Suite, please wait...", {1, 46, 390, 68}, look::Wait,
                                        look::OneLine, look::Text, look::Page),
                            look::Filled({0, 0, 410, 46}, look::Page), look::Filled({390, 46, 410, 308}, look::Page),
                            look::Filled({0, 113, 410, 308}, look::Page)}));
    int fill = 0;
    EXPECT_TRUE(Eventually([&] { return (fill = FillOf(Picture::OfClient(page))) > 0; }));
    EXPECT_LT(fill, 390);
    EXPECT_TRUE(IsWholePercent(fill)) << fill;
    EXPECT_FALSE(Picture::OfClient(page).IsAll({1, 94, 370, 113}, look::Page)) << "no status is to be seen";
    EXPECT_TRUE(wizard.Shows(window, {look::Button("Install", {495, 358, 575, 383}, look::DisabledFace, look::Strip),
                                      look::Button("Back", {405, 358, 485, 383}, look::DisabledFace, look::Strip),
                                      look::Button("Cancel", {195, 358, 275, 383}, look::Face, look::Strip)}));
    KeepPicture("installing", window);

    LetGo();
    EXPECT_TRUE(Eventually([&] { return GetDlgItem(window, id::Close) != nullptr; }));
}

// A program of that name beside the release would come before the system's own.
TEST_F(InstallTest, RunsScriptsInTheSystemsFolder) {
    HasEveryHost();
    HoldAtScript("requirements");
    std::filesystem::current_path(folder);
    RunningWizard wizard(folder);
    GoToSelection(wizard);
    const HWND window = wizard.Window();
    EXPECT_EQ(wizard.CurrentFolder(), folder);
    wizard.Press(window, id::Continue);
    WaitUntilHeld();
    EXPECT_EQ(wizard.CurrentFolder(), R"(C:\windows\system32)");
    LetGo();
    EXPECT_TRUE(Eventually([&] { return GetDlgItem(window, id::Close) != nullptr; }));
    std::filesystem::current_path("C:\\");
}

TEST_F(InstallTest, RunsScriptsByTheSystemsOwnProcessorWhateverTheEnvironmentSays) {
    HasEveryHost();
    SetEnvironmentVariableA("COMSPEC", "Z:" HV_PROGRAM_FOLDER "/planted_program.exe");
    RunningWizard wizard(folder);
    GoToFinal(wizard);
    EXPECT_FALSE(machine().HasFile(R"(C:\planted.txt)"));
}

TEST_F(InstallTest, EndsAtOnceWhenCancelledInTheMiddle) {
    HasEveryHost();
    HoldAtScript("requirements");
    RunningWizard wizard(folder);
    GoToInstalling(wizard);
    WaitUntilHeld();
    wizard.Press(wizard.Window(), id::Cancel);
    // The script still waits; nobody waits for it.
    EXPECT_EQ(wizard.ExitStatus(), 0U);
    EXPECT_TRUE(machine().HasFile(R"(C:\hold.txt)"));
    LetGo();
    EXPECT_FALSE(IsRegistered());
}

// The way back is cut off. What was there before lies where the documents say.
TEST_F(InstallTest, LeavesWhatItReplacedInTheStashWhenCancelled) {
    HasEveryHost();
    const std::string library = R"(C:\Program Files\Halvorn\Tessaly\Libraries\TessalyColor.dll)";
    machine().Has(library, "the old one");
    HoldAtScript("requirements");
    {
        RunningWizard wizard(folder);
        GoToInstalling(wizard);
        WaitUntilHeld();
        wizard.Press(wizard.Window(), id::Cancel);
        EXPECT_EQ(wizard.ExitStatus(), 0U);
    }
    LetGo();
    EXPECT_NE(machine().Content(library), "the old one");
    std::vector<std::string> stashed;
    for (const std::string& entry : machine().TempEntries()) {
        if (entry.rfind("hvdeploystash", 0) == 0) {
            stashed = NamesIn(machine().TempFolder() + "\\" + entry);
            ASSERT_EQ(stashed.size(), 1U);
            EXPECT_EQ(machine().Content(machine().TempFolder() + "\\" + entry + "\\" + stashed.front()), "the old one");
        }
    }
    ASSERT_EQ(stashed.size(), 1U);
    EXPECT_EQ(stashed.front().rfind("TessalyColor.dll", 0), 0U) << stashed.front();
    EXPECT_EQ(stashed.front().size(), std::string("TessalyColor.dll").size() + 36);
}

TEST_F(InstallTest, EndsWhenCancelledBeforeItsFirstStep) {
    HasEveryHost();
    RunningWizard wizard(folder);
    GoToSelection(wizard);
    wizard.PressBoth(wizard.Window(), id::Continue, id::Cancel);
    EXPECT_EQ(wizard.ExitStatus(), 0U);
    EXPECT_FALSE(IsRegistered());
}

}  // namespace
