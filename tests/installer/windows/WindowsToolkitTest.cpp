#include "installer/windows/WindowsToolkit.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "installer/windows/InstallerWindow.h"
#include "tests/installer/windows/WindowTest.h"

namespace {

using HV::WizardPart;

/// The toolkit with a main window and a first page.
class WindowsToolkitTest : public WindowTest {
protected:
    WindowsToolkitTest() {
        window = toolkit.CreateInstallerWindow(controller, model, "Installer");
        toolkit.CreateWelcomePage(controller, model, *window);
        toolkit.ShowWindow(WizardPart::MainWindow, SW_SHOW);
    }

    [[nodiscard]] HWND Page() const { return ::FindWindowExW(*window, nullptr, nullptr, L""); }
    [[nodiscard]] HWND ButtonOfPage(int identifier) const { return ::GetDlgItem(Page(), identifier); }

    HV::InstallerWindow* window = nullptr;
};

TEST_F(WindowsToolkitTest, PutsPagesAsChildrenAtTheirPlace) {
    const Control page = ControlsOf(*window).front();
    EXPECT_EQ(page.place, (RECT{170, 37, 580, 345}));
    EXPECT_EQ(page.style, 0x50000000U);
    RECT client{};
    ::GetClientRect(Page(), &client);
    EXPECT_EQ(client, (RECT{0, 0, 410, 308}));
}

TEST_F(WindowsToolkitTest, PutsTheFinalPageOverTheWholeWindowAndFourRowsMore) {
    toolkit.CreateFinalPage(controller, *window);
    const Control page = ControlsOf(*window).front();
    EXPECT_EQ(page.place, (RECT{0, 0, 800, 354}));
    EXPECT_EQ(page.style, 0x50000000U);
}

TEST_F(WindowsToolkitTest, ShowsAndHidesAPage) {
    const HWND page = Page();
    toolkit.ShowWindow(WizardPart::WelcomePage, SW_HIDE);
    EXPECT_EQ(::IsWindowVisible(page), FALSE);
    toolkit.ShowWindow(WizardPart::WelcomePage, SW_SHOW);
    EXPECT_NE(::IsWindowVisible(page), FALSE);
}

TEST_F(WindowsToolkitTest, EnablesAndDisablesButtons) {
    toolkit.EnableWindow(WizardPart::ContinueButton, true);
    toolkit.EnableWindow(WizardPart::BackButton, true);
    toolkit.EnableWindow(WizardPart::AgreeButton, false);
    toolkit.EnableWindow(WizardPart::DisagreeButton, false);
    EXPECT_NE(::IsWindowEnabled(::GetDlgItem(*window, HV::kContinueCommand)), FALSE);
    EXPECT_NE(::IsWindowEnabled(::GetDlgItem(*window, HV::kBackCommand)), FALSE);
    EXPECT_EQ(::IsWindowEnabled(ButtonOfPage(HV::kAgreeCommand)), FALSE);
    EXPECT_EQ(::IsWindowEnabled(ButtonOfPage(HV::kDisagreeCommand)), FALSE);
}

TEST_F(WindowsToolkitTest, PassesOverPartsThatHaveNotBeenMade) {
    toolkit.ShowWindow(WizardPart::FinalPage, SW_HIDE);
    toolkit.EnableWindow(WizardPart::SelectionPage, false);
    toolkit.RedrawWindow(WizardPart::InstallingPage);
    EXPECT_NE(::IsWindowVisible(*window), FALSE);
    EXPECT_NE(::IsWindowEnabled(*window), FALSE);
}

TEST_F(WindowsToolkitTest, ChangesTheContinueButton) {
    toolkit.SetContinueText(*window, "Install");
    toolkit.SetContinueHighlighted(*window, true);
    EXPECT_EQ(window->continueButton.text, "Install");
    EXPECT_TRUE(window->continueButton.highlighted);
}

TEST_F(WindowsToolkitTest, GivesTheFocusToTheWindowWhenItsControlIsDisabled) {
    const HWND agree = ButtonOfPage(HV::kAgreeCommand);
    ::SetFocus(agree);
    ASSERT_EQ(::GetFocus(), agree);
    toolkit.EnableWindow(WizardPart::AgreeButton, false);
    EXPECT_EQ(::GetFocus(), window->m_hWnd);
}

TEST_F(WindowsToolkitTest, GivesTheFocusToTheWindowWhenItsPageIsHidden) {
    ::SetFocus(ButtonOfPage(HV::kAgreeCommand));
    toolkit.ShowWindow(WizardPart::WelcomePage, SW_HIDE);
    EXPECT_EQ(::GetFocus(), window->m_hWnd);
}

TEST_F(WindowsToolkitTest, LeavesTheFocusWhereItCanBeUsed) {
    const HWND agree = ButtonOfPage(HV::kAgreeCommand);
    ::SetFocus(agree);
    toolkit.EnableWindow(WizardPart::ContinueButton, true);
    EXPECT_EQ(::GetFocus(), agree);
}

TEST_F(WindowsToolkitTest, AsksTheSelectionPage) {
    HV::SelectionPage* const page = toolkit.CreateSelectionPage(
        controller, *window, {{"Glow", "glow", true, true}, {"Keyer", "keyer", false, false}});
    EXPECT_EQ(toolkit.CheckedCount(*page), 1);
    EXPECT_EQ(toolkit.UncheckedIdentifiers(*page), std::vector<std::string>{"keyer"});
}

TEST_F(WindowsToolkitTest, SetsAndTellsWhatTheInstallingPageShows) {
    HV::InstallingPage* const page = toolkit.CreateInstallingPage(controller, model, *window, "first", 0);
    EXPECT_EQ(toolkit.StatusText(*page), "first");
    toolkit.SetStatusText(*page, "second");
    toolkit.SetPercent(*page, 37);
    EXPECT_EQ(toolkit.StatusText(*page), "second");
    EXPECT_EQ(toolkit.Percent(*page), 37);
}

TEST_F(WindowsToolkitTest, SetsAndEndsTimersOfTheWindow) {
    toolkit.SetTimer(*window, HV::kProgressTimer, 60000);
    toolkit.KillTimer(*window, HV::kProgressTimer);
    EXPECT_EQ(::KillTimer(*window, HV::kProgressTimer), FALSE);
    toolkit.SetTimer(*window, HV::kGrowTimer, 60000);
    EXPECT_NE(::KillTimer(*window, HV::kGrowTimer), FALSE);
}

TEST_F(WindowsToolkitTest, OpensAViewer) {
    HV::EULAWindowController* const viewers = toolkit.CreateEULAWindowController();
    toolkit.ShowAgreement(*viewers);
    EXPECT_NE(::FindWindowW(nullptr, L"Halvorn Software License"), nullptr);
}

}  // namespace
