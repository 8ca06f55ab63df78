#include <gtest/gtest.h>

#include <stdexcept>

#include "platform/windows/wtl.h"
#include "tests/platform/windows/ProbeWindow.h"

namespace {

constexpr int kButton = 7;
constexpr LPARAM kFirstPress = 1;
constexpr LPARAM kHeldDown = 0x40000001;

/// A window with one button that its owner draws.
class MessageLoopTest : public testing::Test {
protected:
    MessageLoopTest() {
        window.onMessage = [this](UINT message, WPARAM wParam, LRESULT&) {
            if (message == WM_COMMAND) {
                commands.push_back(static_cast<int>(LOWORD(wParam)));
            }
            return FALSE;
        };
        window.CreateAnywhere();
        button = ::CreateWindowExW(0, L"BUTTON", L"Press", WS_CHILD | WS_VISIBLE | WS_TABSTOP | BS_OWNERDRAW, 0, 0, 50,
                                   20, window, reinterpret_cast<HMENU>(kButton), nullptr, nullptr);
        ::ShowWindow(window, SW_SHOW);
    }

    ~MessageLoopTest() override {
        ::DestroyWindow(window);
        EmptyQueue();
    }

    // The loop's end comes behind everything that has been posted.
    int RunToTheEnd(int value = 0) {
        ::PostQuitMessage(value);
        return loop.Run();
    }

    ProbeWindow window;
    HWND button = nullptr;
    std::vector<int> commands;
    WTL::CMessageLoop loop;
};

TEST_F(MessageLoopTest, GivesTheValueThatItWasEndedWith) {
    EXPECT_EQ(RunToTheEnd(23), 23);
}

TEST_F(MessageLoopTest, ServesWhatWasPosted) {
    ::PostMessageW(window, kProbe, 0, 0);
    RunToTheEnd();
    EXPECT_NE(std::find(window.messages.begin(), window.messages.end(), kProbe), window.messages.end());
}

TEST_F(MessageLoopTest, ThrowsWhatAHandlerThrew) {
    window.onMessage = [](UINT message, WPARAM, LRESULT&) -> BOOL {
        if (message == kProbe) {
            throw std::out_of_range("invalid string position");
        }
        return FALSE;
    };
    ::PostMessageW(window, kProbe, 0, 0);
    // Nobody else ends the loop.
    EXPECT_THROW(loop.Run(), std::out_of_range);
}

TEST_F(MessageLoopTest, ThrowsTheFirstOfTwoErrors) {
    window.onMessage = [](UINT message, WPARAM wParam, LRESULT&) -> BOOL {
        if (message == kProbe) {
            throw std::runtime_error(wParam == 1 ? "first" : "second");
        }
        return FALSE;
    };
    ::SendMessageW(window, kProbe, 1, 0);
    ::SendMessageW(window, kProbe, 2, 0);
    try {
        loop.Run();
        ADD_FAILURE() << "nothing was thrown";
    } catch (const std::runtime_error& error) {
        EXPECT_STREQ(error.what(), "first");
    }
    EXPECT_EQ(RunToTheEnd(), 0);
}

TEST_F(MessageLoopTest, PressesAButtonByReturn) {
    ::PostMessageW(button, WM_KEYDOWN, VK_RETURN, kFirstPress);
    RunToTheEnd();
    EXPECT_EQ(commands, std::vector<int>{kButton});
}

TEST_F(MessageLoopTest, PressesNothingWhileReturnIsHeldDown) {
    ::PostMessageW(button, WM_KEYDOWN, VK_RETURN, kHeldDown);
    RunToTheEnd();
    EXPECT_EQ(commands, std::vector<int>{});
}

TEST_F(MessageLoopTest, PressesNoDisabledButton) {
    ::EnableWindow(button, FALSE);
    ::PostMessageW(button, WM_KEYDOWN, VK_RETURN, kFirstPress);
    RunToTheEnd();
    EXPECT_EQ(commands, std::vector<int>{});
}

TEST_F(MessageLoopTest, TellsTheWindowOfEscape) {
    ::PostMessageW(button, WM_KEYDOWN, VK_ESCAPE, kFirstPress);
    RunToTheEnd();
    EXPECT_EQ(commands, std::vector<int>{IDCANCEL});
}

TEST_F(MessageLoopTest, MovesTheFocusByTab) {
    ::SetFocus(window);
    ::PostMessageW(window, WM_KEYDOWN, VK_TAB, kFirstPress);
    RunToTheEnd();
    EXPECT_EQ(::GetFocus(), button);
}

}  // namespace
