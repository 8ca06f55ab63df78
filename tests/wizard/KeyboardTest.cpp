#include <richedit.h>

#include <utility>

#include "tests/wizard/WizardTest.h"

namespace {

/// The wizard without a mouse.
class KeyboardTest : public WizardTest {
protected:
    KeyboardTest() { HasEveryHost(); }

    /// The first page, with the focus where a key finds it.
    static HWND FirstPage(RunningWizard& wizard) {
        const HWND page = wizard.PageWith(id::Agree);
        EXPECT_TRUE(Eventually([&] { return wizard.Focus() != nullptr; })) << "the window is not active";
        return page;
    }

    static void TypeUntil(RunningWizard& wizard, WPARAM key, const std::vector<int>& reached) {
        for (const int id : reached) {
            wizard.Type(key);
            EXPECT_TRUE(wizard.ComesToFocus(id)) << id << " is not reached";
        }
    }

    static HWND OpenViewer(RunningWizard& wizard) {
        FirstPage(wizard);
        TypeUntil(wizard, VK_TAB, {id::ReadLicense});
        wizard.Type(VK_SPACE);
        EXPECT_TRUE(Eventually([&] { return wizard.Viewers().size() == 1; }));
        return wizard.Viewers().front();
    }

    static int FirstLine(HWND text) { return static_cast<int>(SendMessageA(text, EM_GETFIRSTVISIBLELINE, 0, 0)); }
    /// From and to, of a text that is short enough for it.
    static std::pair<WORD, WORD> Selection(HWND text) {
        const auto both = static_cast<DWORD>(SendMessageA(text, EM_GETSEL, 0, 0));
        return {LOWORD(both), HIWORD(both)};
    }
};

TEST_F(KeyboardTest, TabGoesThroughThePageBeforeItComesToCancel) {
    RunningWizard wizard(folder);
    FirstPage(wizard);
    TypeUntil(wizard, VK_TAB, {id::ReadLicense, id::Disagree, id::Agree, id::Cancel, id::ReadLicense});
    EXPECT_TRUE(wizard.IsRunning());
}

TEST_F(KeyboardTest, InstallsWithoutAMouse) {
    RunningWizard wizard(folder);
    FirstPage(wizard);
    const HWND window = wizard.Window();
    TypeUntil(wizard, VK_TAB, {id::ReadLicense, id::Disagree, id::Agree});
    wizard.Type(VK_SPACE);
    // The button has disabled itself, and the way begins anew.
    EXPECT_TRUE(Eventually([&] { return wizard.Focus() == window; }));
    TypeUntil(wizard, VK_TAB, {id::ReadLicense, id::Continue});
    wizard.Type(VK_RETURN);
    wizard.PageWith(id::DeselectAll);
    TypeUntil(wizard, VK_TAB, {id::Back, id::Cancel, id::DeselectAll, id::SelectAll, ProductId(0)});
    TypeUntil(wizard, VK_DOWN, {ProductId(1), ProductId(2)});
    TypeUntil(wizard, VK_RIGHT, {ProductId(8)});
    TypeUntil(wizard, VK_UP, {ProductId(7)});
    wizard.Type(VK_SPACE);
    EXPECT_TRUE(wizard.Shows(wizard.Page(), {look::CheckBox(ProductNames()[7], ProductPart(7), false, true),
                                             look::CheckBox(ProductNames()[8], ProductPart(8), true, true)}));
    TypeUntil(wizard, VK_TAB, {ProductId(8), ProductId(9), id::Continue});
    wizard.Type(VK_RETURN);
    EXPECT_TRUE(Eventually([&] { return GetDlgItem(window, id::Close) != nullptr; }));
    EXPECT_TRUE(Eventually([&] { return wizard.Focus() == window; }));
    TypeUntil(wizard, VK_TAB, {id::WhatsNew, id::Resources, id::Close});
    TypeUntil(wizard, VK_LEFT, {id::Resources});
    TypeUntil(wizard, VK_RIGHT, {id::Close});
    wizard.Type(VK_SPACE);
    EXPECT_EQ(wizard.ExitStatus(), 0U);
    EXPECT_TRUE(IsRegistered());
}

TEST_F(KeyboardTest, ComesBackFromABoxToWhereItWas) {
    RunningWizard wizard(folder);
    GoToSelection(wizard);
    const HWND window = wizard.Window();
    wizard.Press(wizard.Page(), id::DeselectAll);
    EXPECT_TRUE(Eventually([&] { return wizard.Focus() != nullptr; }));
    for (int presses = 0; presses < 20 && GetDlgCtrlID(wizard.Focus()) != id::Continue; ++presses) {
        const HWND before = wizard.Focus();
        wizard.Type(VK_TAB);
        EXPECT_TRUE(Eventually([&] { return wizard.Focus() != before; }));
    }
    ASSERT_EQ(GetDlgCtrlID(wizard.Focus()), id::Continue);
    wizard.Type(VK_RETURN);
    const Box box = wizard.WaitForBox("No Products Selected");
    EXPECT_TRUE(Eventually([&] { return GetAncestor(wizard.Focus(), GA_ROOT) == box.handle; }));
    wizard.Type(VK_RETURN);
    EXPECT_TRUE(Eventually([&] { return !IsWindow(box.handle); }));
    EXPECT_TRUE(wizard.ComesToFocus(id::Continue));
    EXPECT_EQ(wizard.Focus(), GetDlgItem(window, id::Continue));
}

TEST_F(KeyboardTest, ComesBackFromTheViewerToWhereItWas) {
    RunningWizard wizard(folder);
    OpenViewer(wizard);
    EXPECT_TRUE(wizard.ComesToFocus(0)) << "the text has not the focus";
    wizard.Type(VK_ESCAPE);
    EXPECT_TRUE(Eventually([&] { return wizard.Viewers().empty(); }));
    EXPECT_TRUE(wizard.ComesToFocus(id::ReadLicense));
}

TEST_F(KeyboardTest, ReadsTheAgreementAtOnce) {
    RunningWizard wizard(folder);
    const HWND viewer = OpenViewer(wizard);
    const HWND text = GetDlgItem(viewer, 0);
    EXPECT_TRUE(Eventually([&] { return wizard.Focus() == text; })) << "the text has not the focus";
    EXPECT_EQ(Selection(text), std::pair(WORD{0}, WORD{0}));
    EXPECT_EQ(FirstLine(text), 0);
    KeepPicture("agreement-opened", viewer);

    // A caret would need many more to come to the last line in sight.
    for (int presses = 0; presses < 10; ++presses) {
        wizard.Type(VK_DOWN);
    }
    EXPECT_TRUE(Eventually([&] { return FirstLine(text) > 0; }));
    wizard.Type(VK_HOME);
    EXPECT_TRUE(Eventually([&] { return FirstLine(text) == 0; }));
    wizard.Type(VK_NEXT);
    EXPECT_TRUE(Eventually([&] { return FirstLine(text) > 3; }));
    const int page = FirstLine(text);
    KeepPicture("agreement-page-down", viewer);

    TypeUntil(wizard, VK_TAB, {id::CloseViewer, id::SaveLicense, 0, id::CloseViewer});
    EXPECT_EQ(Selection(text), std::pair(WORD{0}, WORD{0}));
    EXPECT_EQ(FirstLine(text), page) << "to come to the text does not move it";
}

}  // namespace
