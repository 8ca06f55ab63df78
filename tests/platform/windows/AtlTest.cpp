#include "platform/windows/atl.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstdint>
#include <stdexcept>
#include <string>

#include "platform/windows/wtl.h"
#include "tests/platform/windows/ProbeWindow.h"

namespace {

class AtlTest : public testing::Test {
protected:
    ~AtlTest() override { EmptyQueue(); }
};

std::wstring ClassName(HWND window) {
    std::array<wchar_t, 64> name{};
    ::GetClassNameW(window, name.data(), static_cast<int>(name.size()));
    return name.data();
}

TEST_F(AtlTest, RegistersAClassUnderItsAddress) {
    ProbeWindow window;
    ASSERT_NE(window.CreateAnywhere(), nullptr);
    const std::wstring name = ClassName(window);
    EXPECT_EQ(name.substr(0, 4), L"ATL:");
    EXPECT_EQ(std::stoull(name.substr(4), nullptr, 16),
              reinterpret_cast<std::uintptr_t>(&ProbeWindow::GetWndClassInfo()));
}

TEST_F(AtlTest, GivesClassesTheStyleBackgroundAndCursorOfTheHouse) {
    ProbeWindow window;
    ASSERT_NE(window.CreateAnywhere(), nullptr);
    WNDCLASSEXW registered{};
    registered.cbSize = sizeof registered;
    ASSERT_NE(::GetClassInfoExW(::GetModuleHandleW(nullptr), ClassName(window).c_str(), &registered), 0);
    EXPECT_EQ(registered.style, 0x0BU);
    EXPECT_EQ(reinterpret_cast<std::uintptr_t>(registered.hbrBackground), 6U);
    EXPECT_EQ(registered.hCursor, ::LoadCursorW(nullptr, MAKEINTRESOURCEW(32512)));
    EXPECT_EQ(registered.hIcon, nullptr);
}

TEST_F(AtlTest, MakesTwoWindowsOfOneClass) {
    ProbeWindow one;
    ProbeWindow other;
    ASSERT_NE(one.CreateAnywhere(), nullptr);
    ASSERT_NE(other.CreateAnywhere(), nullptr);
    EXPECT_EQ(ClassName(one), ClassName(other));
    const std::size_t before = other.messages.size();
    ::SendMessageW(one, kProbe, 0, 0);
    EXPECT_EQ(one.messages.back(), kProbe);
    EXPECT_EQ(other.messages.size(), before);
}

TEST_F(AtlTest, KnowsItsWindowFromTheFirstMessageOn) {
    ProbeWindow window;
    HWND atCreation = nullptr;
    window.onMessage = [&](UINT message, WPARAM, LRESULT&) {
        if (message == WM_CREATE) {
            atCreation = window.m_hWnd;
        }
        return FALSE;
    };
    const HWND made = window.CreateAnywhere();
    EXPECT_NE(made, nullptr);
    EXPECT_EQ(atCreation, made);
    EXPECT_EQ(window.messages.front(), static_cast<UINT>(WM_NCCREATE));
}

TEST_F(AtlTest, GivesTheSenderWhatTheHandlerAnswers) {
    ProbeWindow window;
    window.onMessage = [](UINT message, WPARAM wParam, LRESULT& result) {
        result = static_cast<LRESULT>(wParam) + 1;
        return message == kProbe ? TRUE : FALSE;
    };
    ASSERT_NE(window.CreateAnywhere(), nullptr);
    EXPECT_EQ(::SendMessageW(window, kProbe, 41, 0), 42);
}

TEST_F(AtlTest, TakesTheTextAsUtf8) {
    ProbeWindow window;
    ASSERT_NE(window.Create(nullptr, {0, 0, 200, 100}, "Gr\xC3\xBC\xC3\x9F", WS_CAPTION), nullptr);
    std::array<wchar_t, 16> text{};
    ::GetWindowTextW(window, text.data(), static_cast<int>(text.size()));
    EXPECT_EQ(std::wstring(text.data()), L"Gr\u00FC\u00DF");
}

TEST_F(AtlTest, SaysGoodbyeOnceWhenTheWindowIsGone) {
    ProbeWindow window;
    const HWND made = window.CreateAnywhere();
    ::DestroyWindow(window);
    EXPECT_EQ(window.finals, 1);
    EXPECT_EQ(window.last, made);
    EXPECT_EQ(window.m_hWnd, nullptr);
    EXPECT_EQ(window.messages.back(), static_cast<UINT>(WM_NCDESTROY));
}

TEST_F(AtlTest, SaysGoodbyeOnlyWhenTheHandlerThatDestroyedTheWindowHasEnded) {
    ProbeWindow window;
    int finalsInTheHandler = -1;
    window.onMessage = [&](UINT message, WPARAM, LRESULT&) {
        if (message == kProbe) {
            ::DestroyWindow(window.m_hWnd);
            finalsInTheHandler = window.finals;
        }
        return FALSE;
    };
    const HWND made = window.CreateAnywhere();
    ::SendMessageW(made, kProbe, 0, 0);
    EXPECT_EQ(finalsInTheHandler, 0);
    EXPECT_EQ(window.finals, 1);
}

TEST_F(AtlTest, ThrowsWhatTheCreationOfAWindowThrew) {
    ProbeWindow window;
    window.onMessage = [](UINT message, WPARAM, LRESULT&) -> BOOL {
        if (message == WM_CREATE) {
            throw std::runtime_error("no room");
        }
        return FALSE;
    };
    try {
        window.CreateAnywhere();
        ADD_FAILURE() << "nothing was thrown";
    } catch (const std::runtime_error& error) {
        EXPECT_STREQ(error.what(), "no room");
    }
    EXPECT_EQ(window.m_hWnd, nullptr);
}

TEST_F(AtlTest, CentresAWindowOnTheWorkArea) {
    ProbeWindow window;
    ASSERT_NE(window.CreateAnywhere(), nullptr);
    window.CenterWindow();
    RECT area{};
    ::SystemParametersInfoW(SPI_GETWORKAREA, 0, &area, 0);
    RECT own{};
    ::GetWindowRect(window, &own);
    EXPECT_EQ(own.left - area.left, (area.right - area.left - 200) / 2);
    EXPECT_EQ(own.top - area.top, (area.bottom - area.top - 100) / 2);
    EXPECT_EQ(own.right - own.left, 200);
    EXPECT_EQ(own.bottom - own.top, 100);
}

TEST_F(AtlTest, SendsAMessageToWindowsInWindows) {
    ProbeWindow outer;
    ASSERT_NE(outer.CreateAnywhere(), nullptr);
    ProbeWindow child;
    ProbeWindow grandchild;
    ASSERT_NE(child.Create(outer, {0, 0, 50, 50}, "", WS_CHILD), nullptr);
    ASSERT_NE(grandchild.Create(child, {0, 0, 10, 10}, "", WS_CHILD), nullptr);
    outer.SendMessageToDescendants(kProbe, 0, 0);
    EXPECT_EQ(child.messages.back(), kProbe);
    EXPECT_EQ(grandchild.messages.back(), kProbe);
    EXPECT_EQ(std::count(outer.messages.begin(), outer.messages.end(), kProbe), 0);
    ::DestroyWindow(outer);
}

TEST(ComModule, KnowsTheLoopOfItsThread) {
    ATL::CComModule module;
    WTL::CMessageLoop loop;
    EXPECT_EQ(module.GetMessageLoop(), nullptr);
    module.AddMessageLoop(&loop);
    EXPECT_EQ(module.GetMessageLoop(), &loop);
    module.RemoveMessageLoop();
    EXPECT_EQ(module.GetMessageLoop(), nullptr);
}

TEST(ComModule, KnowsItsInstance) {
    ATL::CComModule module;
    module.Init(::GetModuleHandleW(nullptr));
    EXPECT_EQ(module.GetModuleInstance(), ::GetModuleHandleW(nullptr));
}

}  // namespace
