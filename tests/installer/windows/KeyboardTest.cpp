#include <gtest/gtest.h>

#include <vector>

#include "installer/windows/EULAWindowController.h"
#include "installer/windows/InstallerWindow.h"
#include "platform/windows/wtl.h"
#include "tests/installer/SetupFolder.h"
#include "tests/installer/windows/WindowTest.h"

namespace {

constexpr LPARAM kPressed = 1;
constexpr LPARAM kReleased = static_cast<LPARAM>(0xC0000001);
constexpr int kCloseViewer = 161;
constexpr int kSaveLicense = 1184;
constexpr int kAgreementItself = 0;

/// Windows of the wizard, served by the loop that serves them in the program.
class KeyboardTest : public WindowTest {
protected:
    KeyboardTest() { setup.HasSuite(); }

    // The key goes down and up, at whatever has the focus, and everything that follows of it is over.
    void Type(WPARAM key) {
        const HWND focus = ::GetFocus();
        ::PostMessageW(focus, WM_KEYDOWN, key, kPressed);
        ::PostMessageW(focus, WM_KEYUP, key, kReleased);
        ::PostQuitMessage(0);
        loop.Run();
    }

    // What has the focus after each of so many presses of Tab.
    std::vector<int> Tab(int times) {
        std::vector<int> reached;
        for (int press = 0; press < times; ++press) {
            Type(VK_TAB);
            reached.push_back(::GetDlgCtrlID(::GetFocus()));
        }
        return reached;
    }

    Machine machine;
    SetupFolder setup{machine};
    WTL::CMessageLoop loop;
};

/// The main window with the first page.
class FirstPageKeyboardTest : public KeyboardTest {
protected:
    FirstPageKeyboardTest() {
        controller.window = window = toolkit.CreateInstallerWindow(controller, "Installer");
        controller.welcomePage = toolkit.CreateWelcomePage(controller, *window);
        toolkit.ShowWindow(HV::WizardPart::MainWindow, SW_SHOW);
        ::SetFocus(*window);
    }

    HV::InstallerWindow* window = nullptr;
};

TEST_F(FirstPageKeyboardTest, TabReachesTheButtonsOfThePageToo) {
    EXPECT_EQ(Tab(5), (std::vector<int>{1126, 1127, 1129, 1128, 1126}));
}

TEST_F(FirstPageKeyboardTest, SpacePressesAButton) {
    Tab(4);
    Type(VK_SPACE);
    EXPECT_TRUE(controller.agreed);
}

TEST_F(FirstPageKeyboardTest, TabGoesOnAfterTheButtonThatDisabledItself) {
    Tab(4);
    Type(VK_RETURN);
    ASSERT_TRUE(controller.agreed);
    EXPECT_EQ(Tab(3), (std::vector<int>{1124, 1126, 1127}));
}

TEST_F(FirstPageKeyboardTest, EscapeDoesNothing) {
    Tab(1);
    Type(VK_ESCAPE);
    EXPECT_EQ(toolkit.quits, std::vector<int>{});
    EXPECT_NE(::IsWindow(*window), FALSE);
}

TEST_F(KeyboardTest, TabGoesAroundInTheViewer) {
    HV::EULAWindowController viewers;
    viewers.ShowAgreement();
    const HWND viewer = ::FindWindowW(nullptr, L"Halvorn Software License");
    ASSERT_NE(viewer, nullptr);
    ::SetFocus(viewer);
    EXPECT_EQ(Tab(4), (std::vector<int>{kCloseViewer, kSaveLicense, kAgreementItself, kCloseViewer}));
    Type(VK_RETURN);
    EXPECT_EQ(::IsWindow(viewer), FALSE);
}

TEST_F(KeyboardTest, EscapeClosesTheViewerFromItsText) {
    HV::EULAWindowController viewers;
    viewers.ShowAgreement();
    const HWND viewer = ::FindWindowW(nullptr, L"Halvorn Software License");
    ASSERT_NE(viewer, nullptr);
    ::SetFocus(::GetDlgItem(viewer, kAgreementItself));
    Type(VK_ESCAPE);
    EXPECT_EQ(::IsWindow(viewer), FALSE);
}

}  // namespace
