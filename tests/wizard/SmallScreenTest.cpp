#include <richedit.h>

#include "tests/wizard/WizardTest.h"

namespace {

/// The wizard where the screen is lower than the agreement's viewer would be.
class SmallScreenTest : public WizardTest {
protected:
    SmallScreenTest() {
        SystemParametersInfoA(SPI_GETWORKAREA, 0, &screen, 0);
        HasEveryHost();
    }

    [[nodiscard]] bool HasInSight(HWND window) const {
        const RECT part = OnScreen(window);
        return part.left >= screen.left && part.top >= screen.top && part.right <= screen.right &&
               part.bottom <= screen.bottom;
    }

    RECT screen{};
};

TEST_F(SmallScreenTest, TheViewerIsCutToTheScreenAndItsTextScrolls) {
    ASSERT_EQ(screen.bottom - screen.top, 576) << "this is not the screen that the test is about";
    RunningWizard wizard(folder);
    wizard.Press(wizard.PageWith(id::ReadLicense), id::ReadLicense);
    ASSERT_TRUE(Eventually([&] { return wizard.Viewers().size() == 1; }));
    const HWND viewer = wizard.Viewers().front();
    EXPECT_EQ(OnScreen(viewer), (RECT{232, 0, 792, 576}));
    ExpectControls(viewer, {{id::CloseViewer, {350, 501, 430, 526}, 0x5001000B, true, true},
                            {id::SaveLicense, {440, 501, 520, 526}, 0x5001000B, true, true},
                            {0, {30, 50, 510, 481}, 0x50A10844, true, true}});
    for (const Control& control : RunningWizard::Controls(viewer)) {
        EXPECT_TRUE(HasInSight(control.handle)) << control.id;
    }
    EXPECT_TRUE(wizard.Shows(viewer, {look::Button("Close", {350, 501, 430, 526}, look::Face, look::Black),
                                      look::Button("Save License", {440, 501, 520, 526}, look::Highlight, look::Black),
                                      look::Filled({30, 481, 510, 501}, look::Light)}));
    KeepPicture("small-agreement", viewer);

    const HWND text = GetDlgItem(viewer, 0);
    SendMessageA(text, WM_VSCROLL, SB_BOTTOM, 0);
    const LRESULT end = SendMessageA(text, EM_GETFIRSTVISIBLELINE, 0, 0);
    EXPECT_GT(end, 0);
    SendMessageA(text, WM_VSCROLL, SB_LINEDOWN, 0);
    EXPECT_EQ(SendMessageA(text, EM_GETFIRSTVISIBLELINE, 0, 0), end);
    KeepPicture("small-agreement-end", viewer);

    wizard.Press(viewer, id::CloseViewer);
    EXPECT_TRUE(Eventually([&] { return wizard.Viewers().empty(); }));
}

TEST_F(SmallScreenTest, TheMainWindowHasItsWholeSizeFromTheFirstPageToTheLast) {
    RunningWizard wizard(folder);
    const HWND window = wizard.Window();
    EXPECT_EQ(OnScreen(window), (RECT{212, 73, 812, 503}));
    KeepPicture("small-welcome", window);
    GoToFinal(wizard);
    EXPECT_EQ(OnScreen(window), (RECT{112, 73, 912, 503}));
    KeepPicture("small-final", window);
}

TEST_F(SmallScreenTest, AWindowAtTheSideOfTheScreenWidensInwards) {
    RunningWizard wizard(folder);
    const HWND window = wizard.Window();
    SetWindowPos(window, nullptr, 424, 100, 0, 0, SWP_NOSIZE | SWP_NOZORDER | SWP_NOACTIVATE);
    EXPECT_EQ(OnScreen(window), (RECT{424, 100, 1024, 530}));
    GoToFinal(wizard);
    EXPECT_EQ(OnScreen(window), (RECT{224, 100, 1024, 530}));
    EXPECT_TRUE(HasInSight(GetDlgItem(window, id::Close)));
}

}  // namespace
