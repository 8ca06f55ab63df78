#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "installer/windows/EULAWindow.h"
#include "installer/windows/EULAWindowController.h"
#include "installer/windows/InstallerWindow.h"
#include "installer/windows/SelectionPage.h"
#include "installer/windows/WelcomePage.h"
#include "platform/windows/wtl.h"
#include "tests/installer/windows/WindowTest.h"

namespace {

constexpr LPARAM kPressed = 1;
constexpr LPARAM kReleased = static_cast<LPARAM>(0xC0000001);
constexpr int kAgreementItself = 0;

/// Windows of the wizard, served by the loop that serves them in the program.
class KeyboardTest : public WindowTest {
protected:
    // The key goes down and up, at whatever has the focus, and everything that follows of it is over.
    void Type(WPARAM key) {
        const HWND focus = ::GetFocus();
        ::PostMessageW(focus, WM_KEYDOWN, key, kPressed);
        ::PostMessageW(focus, WM_KEYUP, key, kReleased);
        ::PostQuitMessage(0);
        loop.Run();
    }

    static int Focus() { return ::GetDlgCtrlID(::GetFocus()); }

    // What has the focus after each of these keys.
    std::vector<int> Press(const std::vector<WPARAM>& keys) {
        std::vector<int> reached;
        for (const WPARAM key : keys) {
            Type(key);
            reached.push_back(Focus());
        }
        return reached;
    }
    std::vector<int> Tab(std::size_t times) { return Press(std::vector<WPARAM>(times, VK_TAB)); }

    WTL::CMessageLoop loop;
};

/// The main window with the first page.
class FirstPageKeyboardTest : public KeyboardTest {
protected:
    FirstPageKeyboardTest() {
        controller.window = window = toolkit.CreateInstallerWindow(controller, model, "Installer");
        controller.welcomePage = toolkit.CreateWelcomePage(controller, model, *window);
        toolkit.ShowWindow(HV::WizardPart::MainWindow, SW_SHOW);
        ::SetFocus(*window);
    }

    HV::InstallerWindow* window = nullptr;
};

TEST_F(FirstPageKeyboardTest, TabReachesTheButtonsOfThePageToo) {
    EXPECT_EQ(Tab(5), (std::vector<int>{HV::kReadLicenseCommand, HV::kDisagreeCommand, HV::kAgreeCommand,
                                        HV::kCancelCommand, HV::kReadLicenseCommand}));
}

TEST_F(FirstPageKeyboardTest, SpacePressesAButton) {
    Tab(3);
    Type(VK_SPACE);
    EXPECT_TRUE(controller.agreed);
}

TEST_F(FirstPageKeyboardTest, TabGoesOnAfterTheButtonThatDisabledItself) {
    Tab(3);
    Type(VK_RETURN);
    ASSERT_TRUE(controller.agreed);
    EXPECT_EQ(Tab(4), (std::vector<int>{HV::kReadLicenseCommand, HV::kContinueCommand, HV::kCancelCommand,
                                        HV::kReadLicenseCommand}));
}

TEST_F(FirstPageKeyboardTest, ArrowsGoAlongTheButtonsOfARowAndPressNothing) {
    ::SetFocus(::GetDlgItem(*window, HV::kCancelCommand));
    Type(VK_RIGHT);
    EXPECT_EQ(Focus(), HV::kCancelCommand) << "what is disabled is passed over";
    ::SetFocus(controller.welcomePage->readLicenseButton.handle);
    EXPECT_EQ(Press({VK_RIGHT, VK_RIGHT, VK_RIGHT, VK_LEFT, VK_UP, VK_UP, VK_DOWN}),
              (std::vector<int>{HV::kDisagreeCommand, HV::kAgreeCommand, HV::kAgreeCommand, HV::kDisagreeCommand,
                                HV::kReadLicenseCommand, HV::kReadLicenseCommand, HV::kDisagreeCommand}));
    EXPECT_FALSE(controller.agreed);
    EXPECT_EQ(toolkit.quits, std::vector<int>{});
}

TEST_F(FirstPageKeyboardTest, ArrowsGoAlongTheBottomStripAsItStandsOnTheScreen) {
    toolkit.EnableWindow(HV::WizardPart::ContinueButton, true);
    toolkit.EnableWindow(HV::WizardPart::BackButton, true);
    ::SetFocus(::GetDlgItem(*window, HV::kCancelCommand));
    EXPECT_EQ(Press({VK_RIGHT, VK_RIGHT, VK_RIGHT, VK_LEFT, VK_LEFT, VK_LEFT}),
              (std::vector<int>{HV::kBackCommand, HV::kContinueCommand, HV::kContinueCommand, HV::kBackCommand,
                                HV::kCancelCommand, HV::kCancelCommand}));
}

TEST_F(FirstPageKeyboardTest, ArrowsDoNothingWhereNoControlHasTheFocus) {
    int typed = 0;
    for (const WPARAM arrow : {VK_LEFT, VK_UP, VK_RIGHT, VK_DOWN}) {
        ::SetFocus(*window);
        Type(arrow);
        EXPECT_EQ(::GetFocus(), window->m_hWnd);
        ++typed;
    }
    EXPECT_EQ(typed, 4);
}

TEST_F(FirstPageKeyboardTest, TheFocusComesBackWithTheWindow) {
    const HWND agree = controller.welcomePage->agreeButton.handle;
    ::SetFocus(agree);
    ::SetActiveWindow(Parent());
    ASSERT_NE(::GetFocus(), agree);
    ::SetActiveWindow(*window);
    EXPECT_EQ(::GetFocus(), agree);
}

TEST_F(FirstPageKeyboardTest, TheFocusDoesNotComeBackToWhatCannotBeUsed) {
    ::SetFocus(controller.welcomePage->agreeButton.handle);
    ::SetActiveWindow(Parent());
    toolkit.EnableWindow(HV::WizardPart::AgreeButton, false);
    ::SetActiveWindow(*window);
    EXPECT_EQ(::GetFocus(), window->m_hWnd);
}

TEST_F(FirstPageKeyboardTest, TheFocusStaysOnTheFrameThatHadIt) {
    ::SetFocus(controller.welcomePage->agreeButton.handle);
    ::SetFocus(*window);
    ::SetActiveWindow(Parent());
    ::SetActiveWindow(*window);
    EXPECT_EQ(::GetFocus(), window->m_hWnd);
}

/// The products of a release, in their two columns: 0 to 5 on the left, 6 to 9 on the right.
class ProductsKeyboardTest : public KeyboardTest {
protected:
    ProductsKeyboardTest() {
        controller.window = toolkit.CreateInstallerWindow(controller, model, "Installer");
        std::vector<HV::ProductItem> items;
        for (int number = 0; number < 10; ++number) {
            // The third one lacks its hosts.
            items.push_back({"Product", std::to_string(number), number != 2, number != 2});
        }
        page = toolkit.CreateSelectionPage(controller, *controller.window, items);
        toolkit.ShowWindow(HV::WizardPart::MainWindow, SW_SHOW);
    }

    // The identifiers of these products' boxes.
    static std::vector<int> Boxes(std::vector<int> products) {
        for (int& product : products) {
            product += HV::kFirstCheckControl;
        }
        return products;
    }

    void StartAt(int product) const { ::SetFocus(page->CheckButtons().at(static_cast<std::size_t>(product)).handle); }

    HV::SelectionPage* page = nullptr;
};

TEST_F(ProductsKeyboardTest, DownAndUpGoThroughTheColumns) {
    StartAt(0);
    EXPECT_EQ(Press({VK_DOWN, VK_DOWN, VK_DOWN, VK_DOWN, VK_DOWN, VK_DOWN, VK_DOWN, VK_DOWN, VK_DOWN}),
              Boxes({1, 3, 4, 5, 6, 7, 8, 9, 9}));
    EXPECT_EQ(Press({VK_UP, VK_UP, VK_UP, VK_UP}), Boxes({8, 7, 6, 5}));
}

TEST_F(ProductsKeyboardTest, RightAndLeftGoAlongARow) {
    StartAt(1);
    EXPECT_EQ(Press({VK_RIGHT, VK_RIGHT, VK_LEFT, VK_LEFT}), Boxes({7, 7, 1, 1}));
    StartAt(5);
    EXPECT_EQ(Press({VK_RIGHT}), Boxes({5})) << "there is no product on the right of it";
}

TEST_F(ProductsKeyboardTest, ArrowsChangeNoChoiceAndABlankDoes) {
    StartAt(0);
    Press({VK_DOWN, VK_RIGHT});
    EXPECT_EQ(page->UncheckedIdentifiers(), std::vector<std::string>{"2"});
    Type(VK_SPACE);
    EXPECT_EQ(page->UncheckedIdentifiers(), (std::vector<std::string>{"2", "7"}));
}

TEST_F(ProductsKeyboardTest, ArrowsKeepTheTwoButtonsApartFromTheProducts) {
    ::SetFocus(::GetDlgItem(*page, HV::kDeselectAllControl));
    EXPECT_EQ(Press({VK_RIGHT, VK_DOWN, VK_LEFT, VK_UP}),
              (std::vector<int>{HV::kSelectAllControl, HV::kSelectAllControl, HV::kDeselectAllControl,
                                HV::kDeselectAllControl}));
}

TEST_F(FirstPageKeyboardTest, EscapeDoesNothing) {
    Tab(1);
    Type(VK_ESCAPE);
    EXPECT_EQ(toolkit.quits, std::vector<int>{});
    EXPECT_NE(::IsWindow(*window), FALSE);
}

/// A viewer of the agreement, as it opens.
class ViewerKeyboardTest : public KeyboardTest {
protected:
    ViewerKeyboardTest() {
        viewers.ShowAgreement();
        viewer = ::FindWindowW(nullptr, L"Halvorn Software License");
        text = ::FindWindowExW(viewer, nullptr, L"RICHEDIT50W", nullptr);
    }

    // How far the text has been scrolled.
    [[nodiscard]] LONG HiddenRows() const {
        POINT hidden{-1, -1};
        ::SendMessageW(text, EM_GETSCROLLPOS, 0, reinterpret_cast<LPARAM>(&hidden));
        return hidden.y;
    }
    // From and to.
    [[nodiscard]] std::pair<LONG, LONG> Selection() const {
        CHARRANGE range{};
        ::SendMessageW(text, EM_EXGETSEL, 0, reinterpret_cast<LPARAM>(&range));
        return {range.cpMin, range.cpMax};
    }

    HV::EULAWindowController viewers;
    HWND viewer = nullptr;
    HWND text = nullptr;
};

TEST_F(ViewerKeyboardTest, OpensWithTheFocusInTheTextAndTheCaretAtItsStart) {
    ASSERT_NE(text, nullptr);
    EXPECT_EQ(::GetFocus(), text);
    EXPECT_EQ(Selection(), std::pair(0L, 0L));
    EXPECT_EQ(HiddenRows(), 0);
}

TEST_F(ViewerKeyboardTest, KeysScrollAtOnce) {
    const auto rowsAfter = [this](WPARAM key) {
        Type(key);
        return HiddenRows();
    };
    ASSERT_EQ(HiddenRows(), 0);
    const LONG oneDown = rowsAfter(VK_DOWN);
    EXPECT_GT(oneDown, 0);
    const LONG twoDown = rowsAfter(VK_DOWN);
    EXPECT_GT(twoDown, oneDown);
    EXPECT_EQ(rowsAfter(VK_UP), oneDown);
    EXPECT_GT(rowsAfter(VK_NEXT), oneDown + 200);
    EXPECT_EQ(rowsAfter(VK_PRIOR), oneDown);
    const LONG end = rowsAfter(VK_END);
    EXPECT_GT(end, oneDown + 200);
    EXPECT_EQ(rowsAfter(VK_DOWN), end);
    EXPECT_EQ(rowsAfter(VK_HOME), 0);
    EXPECT_EQ(rowsAfter(VK_UP), 0);
}

TEST_F(ViewerKeyboardTest, TabGoesAroundAndSelectsNothing) {
    EXPECT_EQ(Tab(4), (std::vector<int>{HV::kCloseViewerControl, HV::kSaveLicenseControl, kAgreementItself,
                                        HV::kCloseViewerControl}));
    EXPECT_EQ(Selection(), std::pair(0L, 0L));
    EXPECT_EQ(HiddenRows(), 0);
    Type(VK_RETURN);
    EXPECT_EQ(::IsWindow(viewer), FALSE);
}

TEST_F(ViewerKeyboardTest, ArrowsGoBetweenItsButtons) {
    Tab(1);
    EXPECT_EQ(Press({VK_RIGHT, VK_RIGHT, VK_LEFT}),
              (std::vector<int>{HV::kSaveLicenseControl, HV::kSaveLicenseControl, HV::kCloseViewerControl}));
}

TEST_F(ViewerKeyboardTest, EscapeClosesTheViewerFromItsText) {
    ASSERT_EQ(::GetFocus(), text);
    Type(VK_ESCAPE);
    EXPECT_EQ(::IsWindow(viewer), FALSE);
}

TEST_F(FirstPageKeyboardTest, TheFocusComesBackFromTheViewer) {
    HV::EULAWindowController viewers;
    const HWND readLicense = controller.welcomePage->readLicenseButton.handle;
    ::SetFocus(readLicense);
    viewers.ShowAgreement();
    ASSERT_NE(::GetFocus(), readLicense);
    Type(VK_ESCAPE);
    EXPECT_EQ(::GetFocus(), readLicense);
}

}  // namespace
