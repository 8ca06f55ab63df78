#include <algorithm>
#include <fstream>
#include <sstream>

#include "tests/wizard/WizardTest.h"

namespace {

// The box for the name in the system's dialogue.
constexpr int kNameBox = 1148;

class AgreementTest : public WizardTest {
protected:
    /// One viewer more, opened by the wizard's button.
    static HWND Open(RunningWizard& wizard) {
        const std::vector<HWND> before = wizard.Viewers();
        wizard.Press(wizard.PageWith(id::ReadLicense), id::ReadLicense);
        HWND opened = nullptr;
        EXPECT_TRUE(Eventually([&] {
            for (const HWND viewer : wizard.Viewers()) {
                if (std::find(before.begin(), before.end(), viewer) == before.end()) {
                    opened = viewer;
                }
            }
            return opened != nullptr;
        }));
        return opened;
    }

    static std::string HostFile(const std::string& name) {
        std::ifstream file("Z:" HV_RESOURCES "/" + name, std::ios::binary);
        EXPECT_TRUE(file) << name;
        std::ostringstream content;
        content << file.rdbuf();
        return content.str();
    }
};

TEST_F(AgreementTest, ShowsTheAgreementInAWindowOfItsOwn) {
    HasEveryHost();
    RunningWizard wizard(folder);
    const HWND viewer = Open(wizard);

    RECT work{};
    SystemParametersInfoA(SPI_GETWORKAREA, 0, &work, 0);
    const RECT part = OnScreen(viewer);
    EXPECT_EQ(part.right - part.left, 560);
    EXPECT_EQ(part.bottom - part.top, 640);
    EXPECT_EQ(part.left, (work.left + work.right - 560) / 2);
    EXPECT_EQ(part.top, (work.top + work.bottom - 640) / 2);
    EXPECT_EQ(TextOf(viewer), "Halvorn Software License");
    EXPECT_EQ(GetWindowLongA(viewer, GWL_STYLE) & ~(WS_VISIBLE | WS_CLIPSIBLINGS), 0x00C80000);
    EXPECT_EQ(GetWindow(viewer, GW_OWNER), nullptr);
    EXPECT_TRUE(IsWindowEnabled(wizard.Window()));

    ExpectControls(viewer, {{id::CloseViewer, {350, 565, 430, 590}, 0x5001000B, true, true},
                            {id::SaveLicense, {440, 565, 520, 590}, 0x5001000B, true, true},
                            {0, {30, 50, 510, 545}, 0x50A10844, true, true}});
    // Windows keeps a class under the name that it was registered by, whose capitals are its own.
    EXPECT_STRCASEEQ(ClassOf(GetDlgItem(viewer, 0)).c_str(), "RICHEDIT50W");
    // The buttons have no owner that says what they are drawn on: their corners are black.
    EXPECT_TRUE(wizard.Shows(
        viewer, {look::Filled({0, 0, 550, 50}, look::Light), look::Filled({0, 0, 30, 600}, look::Light),
                 look::Filled({510, 0, 550, 565}, look::Light), look::Filled({0, 545, 550, 565}, look::Light),
                 look::Button("Close", {350, 565, 430, 590}, look::Face, look::Black),
                 look::Button("Save License", {440, 565, 520, 590}, look::Highlight, look::Black)}));
    KeepPicture("agreement", viewer);
}

TEST_F(AgreementTest, SetsTheTextInFromTheEdges) {
    HasEveryHost();
    RunningWizard wizard(folder);
    const HWND text = GetDlgItem(Open(wizard), 0);
    RECT client{};
    GetClientRect(text, &client);
    RECT format{};
    SendMessageA(text, EM_GETRECT, 0, reinterpret_cast<LPARAM>(&format));
    EXPECT_GE(format.left, client.left + 10);
    EXPECT_GE(format.top, client.top + 10);
    EXPECT_LE(format.right, client.right - 10);
    const std::string shown = TextOf(text);
    EXPECT_GT(shown.size(), 1000U);
    EXPECT_NE(shown.find("Halvorn"), std::string::npos);
    EXPECT_EQ(shown.find("{\\rtf"), std::string::npos) << "the text's source is to be seen";
}

TEST_F(AgreementTest, OpensAnotherViewerEachTimeAndTheWizardGoesOn) {
    HasEveryHost();
    RunningWizard wizard(folder);
    const HWND first = Open(wizard);
    const HWND second = Open(wizard);
    EXPECT_EQ(wizard.Viewers().size(), 2U);
    wizard.Press(first, id::CloseViewer);
    EXPECT_TRUE(Eventually([&] { return wizard.Viewers() == std::vector<HWND>{second}; }));
    RunningWizard::CloseFromTitleBar(second);
    EXPECT_TRUE(Eventually([&] { return wizard.Viewers().empty(); }));
    EXPECT_TRUE(wizard.IsRunning());
    wizard.Press(wizard.Page(), id::Agree);
    EXPECT_TRUE(IsWindowEnabled(GetDlgItem(wizard.Window(), id::Continue)));
    EXPECT_NE(Open(wizard), nullptr);
}

TEST_F(AgreementTest, OpensOneViewerForADoubleClick) {
    HasEveryHost();
    RunningWizard wizard(folder);
    const HWND page = wizard.PageWith(id::ReadLicense);
    RunningWizard::ClickQuickly(page, id::ReadLicense, 2);
    // Dealt with after it.
    RunningWizard::ClickQuickly(page, id::Agree, 1);
    EXPECT_TRUE(Eventually([&] { return IsWindowEnabled(GetDlgItem(page, id::Agree)) == FALSE; }));
    EXPECT_EQ(wizard.Viewers().size(), 1U);
}

TEST_F(AgreementTest, SavesTheBytesOfTheDocument) {
    HasEveryHost();
    RunningWizard wizard(folder);
    const HWND viewer = Open(wizard);
    wizard.PressForBox(viewer, id::SaveLicense);
    const Box dialogue = wizard.WaitForBox("Save As");
    EXPECT_EQ(dialogue.owner, viewer);
    HWND name = nullptr;
    EXPECT_TRUE(Eventually([&] { return (name = GetDlgItem(dialogue.handle, kNameBox)) != nullptr; }));
    EXPECT_TRUE(Eventually([&] { return TextOf(name) == "Halvorn Software License"; })) << TextOf(name);
    machine().HasFolder(R"(C:\Kept)");
    SendMessageA(name, WM_SETTEXT, 0, reinterpret_cast<LPARAM>(R"(C:\Kept\Agreement)"));
    wizard.Answer(dialogue, IDOK);
    EXPECT_TRUE(Eventually([&] { return machine().HasFile(R"(C:\Kept\Agreement.rtf)"); }));
    const std::string expected = HostFile("agreement.rtf");
    EXPECT_GT(expected.size(), 1000U);
    EXPECT_TRUE(Eventually([&] { return machine().Content(R"(C:\Kept\Agreement.rtf)").size() == expected.size(); }));
    EXPECT_EQ(machine().Content(R"(C:\Kept\Agreement.rtf)"), expected);
    // The dialogue had gone to the folder of the file.
    EXPECT_EQ(wizard.CurrentFolder(), R"(C:\windows\system32)");
}

TEST_F(AgreementTest, AsksBeforeItReplacesAFile) {
    HasEveryHost();
    machine().Has(R"(C:\Kept\Agreement.rtf)", "somebody's own");
    RunningWizard wizard(folder);
    const HWND viewer = Open(wizard);
    wizard.PressForBox(viewer, id::SaveLicense);
    const Box dialogue = wizard.WaitForBox("Save As");
    HWND name = nullptr;
    EXPECT_TRUE(Eventually([&] { return (name = GetDlgItem(dialogue.handle, kNameBox)) != nullptr; }));
    EXPECT_TRUE(Eventually([&] { return TextOf(name) == "Halvorn Software License"; })) << TextOf(name);
    SendMessageA(name, WM_SETTEXT, 0, reinterpret_cast<LPARAM>(R"(C:\Kept\Agreement)"));
    PostMessageA(GetDlgItem(dialogue.handle, IDOK), BM_CLICK, 0, 0);
    // The title is the system's, and this is what Wine calls the question.
    const Box question = wizard.WaitForBox("Error");
    EXPECT_EQ(question.owner, dialogue.handle);
    EXPECT_EQ(question.buttons, (std::vector<int>{IDYES, IDNO}));
    wizard.Answer(question, IDNO);
    EXPECT_TRUE(Eventually([&] { return IsWindowEnabled(dialogue.handle) != FALSE; }));
    wizard.Answer(dialogue, IDCANCEL);
    EXPECT_EQ(machine().Content(R"(C:\Kept\Agreement.rtf)"), "somebody's own");
}

TEST_F(AgreementTest, WritesNothingWhenSavingIsCancelled) {
    HasEveryHost();
    RunningWizard wizard(folder);
    const HWND viewer = Open(wizard);
    const auto before = machine().Files();
    wizard.PressForBox(viewer, id::SaveLicense);
    const Box dialogue = wizard.WaitForBox("Save As");
    wizard.Answer(dialogue, IDCANCEL);
    EXPECT_TRUE(Eventually([&] { return IsWindowEnabled(viewer) != FALSE; }));
    EXPECT_EQ(machine().Files(), before);
    EXPECT_EQ(wizard.Viewers().size(), 1U);
}

}  // namespace
