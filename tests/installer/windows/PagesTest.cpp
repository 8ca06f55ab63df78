#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "installer/windows/FinalPage.h"
#include "installer/windows/InstallingPage.h"
#include "installer/windows/SelectionPage.h"
#include "installer/windows/WelcomePage.h"
#include "installer/windows/WizardMetrics.h"
#include "tests/installer/SetupFolder.h"
#include "tests/installer/windows/WindowTest.h"

namespace {

constexpr RECT kPage{170, 37, 580, 345};
constexpr DWORD kPageStyle = 0x50000000;

/// Pages over the texts that this program carries, for a suite.
class PagesTest : public WindowTest {
protected:
    PagesTest() {
        setup.HasSuite();
        release.Load();
    }

    // Whether the page fills its background with the page's colour.
    static bool FillsItsBackground(HWND page) {
        Canvas canvas(410, 308);
        return ::SendMessageW(page, WM_ERASEBKGND, reinterpret_cast<WPARAM>(canvas.Device()), 0) != 0 &&
               canvas.Count(HV::WizardMetrics::PageColor) == 410 * 308;
    }

    Machine machine;
    SetupFolder setup{machine};
    HV::InstallerModel release{SetupRelease()};
};

class WelcomePageTest : public PagesTest {
protected:
    WelcomePageTest() { page.Create(Parent(), kPage, "", kPageStyle); }
    HV::WelcomePage page{controller, release};
};

TEST_F(WelcomePageTest, HasItsButtonsOnOneRow) {
    EXPECT_EQ(ControlsOf(page),
              (std::vector<Control>{
                  {HV::kReadLicenseCommand, L"Button", L"Read License...", {0, 271, 100, 296}, 0x5001000B},
                  {HV::kDisagreeCommand, L"Button", L"Disagree", {240, 271, 310, 296}, 0x5001000B},
                  {HV::kAgreeCommand, L"Button", L"Agree", {320, 271, 390, 296}, 0x5001000B},
              }));
}

TEST_F(WelcomePageTest, HasItsTexts) {
    EXPECT_EQ(page.paragraph,
              "This will install Tessaly Suite 4.2.0 on your computer.\r\nIt is recommended you close all other "
              "applications before continuing.");
    EXPECT_EQ(page.requirementsHeading, "System Requirements");
    EXPECT_EQ(page.requirements, "Windows 10\r\nAfter Effects/Premiere Pro CC 2018+");
    EXPECT_EQ(page.agreementNotice,
              "To continue with the install you must agree \rto the terms of the software license agreement.");
    EXPECT_EQ(page.agreementChoice, "Click Agree to continue or Disagree to cancel \rand quit the installation.");
}

TEST_F(WelcomePageTest, GivesItsButtonsTheBodyFont) {
    int buttons = 0;
    for (const Control& control : ControlsOf(page)) {
        EXPECT_EQ(FontOf(::GetDlgItem(page, control.identifier)), HV::WizardMetrics::Instance().BodyFont);
        ++buttons;
    }
    EXPECT_EQ(buttons, 3);
}

TEST_F(WelcomePageTest, OwnsItsButtonsInItsOwnColour) {
    Gdiplus::Color color;
    static_cast<Gdiplus::SolidBrush*>(page.BackgroundBrush())->GetColor(&color);
    EXPECT_EQ(color.GetValue(), 0xFF1A1A1AU);
    EXPECT_EQ(page.readLicenseButton.owner, &page);
    EXPECT_EQ(page.agreeButton.owner, &page);
    EXPECT_EQ(page.disagreeButton.owner, &page);
}

TEST_F(WelcomePageTest, FillsItsBackground) {
    EXPECT_TRUE(FillsItsBackground(page));
}

TEST_F(WelcomePageTest, HandsAPressToTheController) {
    Press(page, HV::kDisagreeCommand);
    EXPECT_EQ(toolkit.quits, std::vector<int>{0});
}

TEST_F(WelcomePageTest, HandsOverNothingElse) {
    Press(page, HV::kDisagreeCommand, BN_SETFOCUS);
    Press(page, HV::kDisagreeCommand, BN_DOUBLECLICKED);
    Press(page, HV::kCancelCommand);
    EXPECT_EQ(toolkit.quits, std::vector<int>{});
}

class InstallingPageTest : public PagesTest {
protected:
    InstallingPageTest() {
        page.Create(Parent(), kPage, "", kPageStyle);
        ::ValidateRect(page, nullptr);
    }

    // The part of the page that is to be painted.
    [[nodiscard]] RECT ToBePainted() const {
        RECT area{};
        ::GetUpdateRect(page, &area, FALSE);
        return area;
    }

    HV::InstallingPage page{controller, release, "Detecting host applications...", 0};
};

TEST_F(InstallingPageTest, StartsAsItWasMade) {
    EXPECT_EQ(page.StatusText(), "Detecting host applications...");
    EXPECT_EQ(page.Percent(), 0);
    EXPECT_TRUE(ControlsOf(page).empty());
}

TEST_F(InstallingPageTest, PaintsTheBarAloneForAPercent) {
    page.SetPercent(50);
    EXPECT_EQ(page.Percent(), 50);
    EXPECT_EQ(ToBePainted(), (RECT{0, 76, 390, 88}));
}

TEST_F(InstallingPageTest, PaintsTheStatusAloneForAText) {
    page.SetStatusText("Installing packages...");
    EXPECT_EQ(page.StatusText(), "Installing packages...");
    EXPECT_EQ(ToBePainted(), (RECT{1, 94, 370, 113}));
}

TEST_F(InstallingPageTest, StoresAHundredForMoreWhenItPaints) {
    page.SetPercent(250);
    EXPECT_EQ(page.Percent(), 250);
    ::UpdateWindow(page);
    EXPECT_EQ(page.Percent(), 100);
}

TEST_F(InstallingPageTest, KeepsAFailuresPercent) {
    page.SetPercent(-1);
    ::UpdateWindow(page);
    EXPECT_EQ(page.Percent(), -1);
}

TEST_F(InstallingPageTest, FillsItsBackground) {
    EXPECT_TRUE(FillsItsBackground(page));
}

/// Counts how often its background is erased.
class CountingPage : public HV::InstallingPage {
public:
    using HV::InstallingPage::InstallingPage;

    BOOL ProcessWindowMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) override {
        erased += message == WM_ERASEBKGND ? 1 : 0;
        return HV::InstallingPage::ProcessWindowMessage(window, message, wParam, lParam, result);
    }

    int erased = 0;
};

TEST_F(PagesTest, InstallingPageErasesWhatItPaintsAgain) {
    CountingPage page(controller, release, "Detecting host applications...", 0);
    ASSERT_NE(page.Create(Parent(), kPage, "", kPageStyle), nullptr);
    ::UpdateWindow(page);
    const int before = page.erased;
    page.SetPercent(50);
    ::UpdateWindow(page);
    EXPECT_EQ(page.erased, before + 1);
    page.SetStatusText("Installing packages...");
    ::UpdateWindow(page);
    EXPECT_EQ(page.erased, before + 2);
    ::DestroyWindow(page);
}

TEST_F(PagesTest, HaveNoIcon) {
    HV::WelcomePage welcome(controller, release);
    HV::SelectionPage selection(controller);
    HV::InstallingPage installing(controller, release, "", 0);
    HV::FinalPage final(controller);
    ASSERT_NE(welcome.Create(Parent(), kPage, "", kPageStyle), nullptr);
    ASSERT_NE(selection.Create(Parent(), kPage, "", kPageStyle), nullptr);
    ASSERT_NE(installing.Create(Parent(), kPage, "", kPageStyle), nullptr);
    ASSERT_NE(final.Create(Parent(), kPage, "", kPageStyle), nullptr);
    int pages = 0;
    for (const HWND page : {welcome.m_hWnd, selection.m_hWnd, installing.m_hWnd, final.m_hWnd}) {
        EXPECT_EQ(::GetClassLongPtrW(page, GCLP_HICON), 0U) << pages;
        EXPECT_EQ(::GetClassLongPtrW(page, GCLP_HICONSM), 0U) << pages;
        ::DestroyWindow(page);
        ++pages;
    }
    EXPECT_EQ(pages, 4);
}

TEST_F(PagesTest, FinalPageLeavesItsBackgroundToItsPicture) {
    HV::FinalPage page(controller);
    ASSERT_NE(page.Create(Parent(), {0, 0, 800, 354}, "", kPageStyle), nullptr);
    Canvas canvas(10, 10);
    EXPECT_NE(::SendMessageW(page, WM_ERASEBKGND, reinterpret_cast<WPARAM>(canvas.Device()), 0), 0);
    EXPECT_EQ(canvas.Count(0), 100);
    EXPECT_TRUE(ControlsOf(page).empty());
    ::DestroyWindow(page);
}

}  // namespace
