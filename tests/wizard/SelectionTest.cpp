#include "tests/wizard/WizardTest.h"

namespace {

class SelectionTest : public WizardTest {
protected:
    /// The check boxes as they are to be seen.
    static std::vector<look::Mark> Boxes(const std::vector<bool>& checked, const std::vector<bool>& enabled) {
        std::vector<look::Mark> marks;
        for (int i = 0; i < static_cast<int>(ProductNames().size()); ++i) {
            const auto at = static_cast<std::size_t>(i);
            marks.push_back(look::CheckBox(ProductNames()[at], ProductPart(i), checked[at], enabled[at]));
        }
        return marks;
    }

    static std::vector<bool> All(bool value) { return std::vector<bool>(ProductNames().size(), value); }
};

TEST_F(SelectionTest, OffersEveryProductInTwoColumns) {
    HasEveryHost();
    RunningWizard wizard(folder);
    GoToSelection(wizard);
    const HWND window = wizard.Window();
    const HWND page = wizard.Page();

    EXPECT_EQ(InParent(page), (RECT{170, 37, 580, 345}));
    std::vector<Expected> controls = {{id::DeselectAll, {0, 30, 70, 55}, 0x5001000B, true, true},
                                      {id::SelectAll, {80, 30, 150, 55}, 0x5001000B, true, true}};
    for (int i = 0; i < static_cast<int>(ProductNames().size()); ++i) {
        controls.push_back({ProductId(i), ProductPart(i), 0x5001010B, true, true});
    }
    ExpectControls(page, controls);
    EXPECT_EQ(controls.size(), 12U);

    EXPECT_TRUE(wizard.Shows(
        page, {look::Words("Select which plugins you want to install.", {0, 0, 410, 25}, look::Body, look::Wrapped,
                           look::Text, look::Page),
               look::Button("Deselect All", {0, 30, 70, 55}, look::Face, look::Page),
               look::Button("Select All", {80, 30, 150, 55}, look::Face, look::Page),
               look::Filled({150, 25, 410, 80}, look::Page), look::Filled({0, 212, 410, 308}, look::Page)}));
    EXPECT_TRUE(wizard.Shows(page, Boxes(All(true), All(true))));
    EXPECT_TRUE(wizard.Shows(window, {look::Button("Install", {495, 358, 575, 383}, look::Highlight, look::Strip),
                                      look::Button("Back", {405, 358, 485, 383}, look::Face, look::Strip)}));
    KeepPicture("selection", window);
}

TEST_F(SelectionTest, ChecksAndUnchecksOneByOneAndAllTogether) {
    HasEveryHost();
    RunningWizard wizard(folder);
    GoToSelection(wizard);
    const HWND page = wizard.Page();

    std::vector<bool> checked = All(true);
    for (const int i : {1, 7}) {
        wizard.Press(page, ProductId(i));
        checked[static_cast<std::size_t>(i)] = false;
    }
    EXPECT_TRUE(wizard.Shows(page, Boxes(checked, All(true))));
    KeepPicture("selection-some-off", wizard.Window());
    wizard.Press(page, ProductId(7));
    checked[7] = true;
    EXPECT_TRUE(wizard.Shows(page, Boxes(checked, All(true))));
    wizard.Press(page, id::DeselectAll);
    EXPECT_TRUE(wizard.Shows(page, Boxes(All(false), All(true))));
    wizard.Press(page, id::SelectAll);
    EXPECT_TRUE(wizard.Shows(page, Boxes(All(true), All(true))));
}

TEST_F(SelectionTest, TogglesABoxAtEachOfManyQuickClicks) {
    HasEveryHost();
    RunningWizard wizard(folder);
    GoToSelection(wizard);
    const HWND page = wizard.Page();
    RunningWizard::ClickQuickly(page, ProductId(1), 2);
    RunningWizard::ClickQuickly(page, ProductId(2), 3);
    RunningWizard::ClickQuickly(page, ProductId(3), 4);
    RunningWizard::ClickQuickly(page, ProductId(4), 5);
    std::vector<bool> checked = All(true);
    checked[2] = checked[4] = false;
    EXPECT_TRUE(wizard.Shows(page, Boxes(checked, All(true))));
}

TEST_F(SelectionTest, ComesByADoubleClickOnContinueAndStays) {
    HasEveryHost();
    RunningWizard wizard(folder);
    const HWND welcome = wizard.PageWith(id::Agree);
    const HWND window = wizard.Window();
    wizard.Press(welcome, id::Agree);
    RunningWizard::ClickQuickly(window, id::Continue, 2);
    // What comes after it has been dealt with shows that it has been, too.
    RunningWizard::ClickQuickly(welcome, id::ReadLicense, 1);
    EXPECT_TRUE(Eventually([&] { return wizard.Viewers().size() == 1; }));
    EXPECT_EQ(TextOf(GetDlgItem(window, id::Continue)), "Install");
    EXPECT_TRUE(IsWindowEnabled(GetDlgItem(window, id::Continue)));
    EXPECT_NE(GetDlgItem(wizard.Page(), id::DeselectAll), nullptr) << "it is not the selection page";
    EXPECT_FALSE(wizard.HasBox());
    EXPECT_FALSE(IsRegistered());
}

TEST_F(SelectionTest, KeepsTheChoiceThroughATripToTheFirstPage) {
    HasEveryHost();
    RunningWizard wizard(folder);
    GoToSelection(wizard);
    const HWND window = wizard.Window();
    wizard.Press(wizard.Page(), ProductId(3));

    wizard.Press(window, id::Back);
    const HWND welcome = wizard.PageWith(id::Agree);
    EXPECT_FALSE(IsWindowEnabled(GetDlgItem(window, id::Back)));
    EXPECT_TRUE(IsWindowEnabled(GetDlgItem(window, id::Continue)));
    EXPECT_FALSE(IsWindowEnabled(GetDlgItem(welcome, id::Agree)));
    // The button keeps the text that it has.
    EXPECT_TRUE(wizard.Shows(window, {look::Button("Install", {495, 358, 575, 383}, look::Highlight, look::Strip),
                                      look::Button("Back", {405, 358, 485, 383}, look::DisabledFace, look::Strip)}));

    wizard.Press(window, id::Continue);
    std::vector<bool> checked = All(true);
    checked[3] = false;
    EXPECT_TRUE(wizard.Shows(wizard.PageWith(id::DeselectAll), Boxes(checked, All(true))));
}

TEST_F(SelectionTest, AsksForAProductWhenNoneIsChosen) {
    HasEveryHost();
    RunningWizard wizard(folder);
    GoToSelection(wizard);
    const HWND window = wizard.Window();
    wizard.Press(wizard.Page(), id::DeselectAll);
    wizard.PressForBox(window, id::Continue);
    const Box box = wizard.WaitForBox("No Products Selected");
    ExpectBox(box, "Please select at least one plugin to install.", {IDOK}, false, window);
    wizard.AnswerOk(box);
    EXPECT_TRUE(wizard.Shows(wizard.PageWith(id::DeselectAll), Boxes(All(false), All(true))));
    EXPECT_TRUE(Eventually([&] { return IsWindowEnabled(window) != FALSE; }));
    EXPECT_FALSE(IsRegistered());
}

TEST_F(SelectionTest, GreysWhatLacksItsHostsAndLeavesItOff) {
    RunningWizard wizard(folder);
    const Box box = wizard.WaitForBox("Warning: missing hosts.");
    ExpectBox(box,
              "Some products require host applications which are not installed on this computer. Selection of these "
              "products for install will be disabled.",
              {IDOK}, true, nullptr);
    EXPECT_TRUE(IsWindowVisible(wizard.Window()));
    KeepPicture("missing-hosts", wizard.Window());
    wizard.AnswerOk(box);

    GoToSelection(wizard);
    const HWND page = wizard.Page();
    // The presets' lookup tables, Titler's editor and Viewer need no host.
    std::vector<bool> usable = All(false);
    usable[4] = usable[7] = usable[9] = true;
    EXPECT_TRUE(wizard.Shows(page, Boxes(usable, usable)));
    EXPECT_EQ(RunningWizard::ControlOf(page, ProductId(0)).enabled, false);
    EXPECT_EQ(RunningWizard::ControlOf(page, ProductId(7)).enabled, true);
    KeepPicture("selection-without-hosts", wizard.Window());

    wizard.Press(page, id::DeselectAll);
    EXPECT_TRUE(wizard.Shows(page, Boxes(All(false), usable)));
    wizard.Press(page, id::SelectAll);
    EXPECT_TRUE(wizard.Shows(page, Boxes(usable, usable)));
}

}  // namespace
