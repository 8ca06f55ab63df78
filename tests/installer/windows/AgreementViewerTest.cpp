#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <iterator>
#include <string>
#include <utility>
#include <vector>

#include "installer/windows/EULAWindow.h"
#include "installer/windows/EULAWindowController.h"
#include "tests/installer/windows/WindowTest.h"
#include "tests/support/Machine.h"

namespace {

BOOL CALLBACK KeepViewer(HWND window, LPARAM found) {
    if (::GetDlgItem(window, HV::kCloseViewerControl) != nullptr) {
        reinterpret_cast<std::vector<HWND>*>(found)->push_back(window);
    }
    return TRUE;
}

class AgreementViewerTest : public WindowTest {
protected:
    static std::vector<HWND> Viewers() {
        std::vector<HWND> found;
        ::EnumThreadWindows(::GetCurrentThreadId(), KeepViewer, reinterpret_cast<LPARAM>(&found));
        return found;
    }

    // The one viewer that is open.
    static HWND Viewer() {
        const std::vector<HWND> viewers = Viewers();
        EXPECT_EQ(viewers.size(), 1U);
        return viewers.empty() ? nullptr : viewers.front();
    }

    static HWND RichText(HWND viewer) { return ::FindWindowExW(viewer, nullptr, L"RICHEDIT50W", nullptr); }

    static bool LoopHasEnded() {
        MSG message{};
        return ::PeekMessageW(&message, nullptr, WM_QUIT, WM_QUIT, PM_REMOVE) != FALSE;
    }

    HV::EULAWindowController viewers;
};

TEST_F(AgreementViewerTest, HasItsControls) {
    EXPECT_EQ(HV::kCloseViewerControl, 161);
    EXPECT_EQ(HV::kSaveLicenseControl, 1184);
    viewers.ShowAgreement();
    std::vector<Control> controls = ControlsOf(Viewer());
    ASSERT_EQ(controls.size(), 3U);
    EXPECT_EQ(controls[0], (Control{HV::kCloseViewerControl, L"Button", L"Close", {350, 565, 430, 590}, 0x5001000B}));
    EXPECT_EQ(controls[1],
              (Control{HV::kSaveLicenseControl, L"Button", L"Save License", {440, 565, 520, 590}, 0x5001000B}));
    EXPECT_EQ(controls[2].identifier, 0);
    EXPECT_EQ(controls[2].place, (RECT{30, 50, 510, 545}));
    EXPECT_EQ(controls[2].style, 0x50A10844U);
}

TEST_F(AgreementViewerTest, IsAWindowOfItsOwn) {
    viewers.ShowAgreement();
    const HWND viewer = Viewer();
    RECT frame{};
    ::GetWindowRect(viewer, &frame);
    EXPECT_EQ(frame.right - frame.left, 560);
    EXPECT_EQ(frame.bottom - frame.top, 640);
    EXPECT_EQ(static_cast<DWORD>(::GetWindowLongW(viewer, GWL_STYLE)) & ~WS_CLIPSIBLINGS, 0x10C80000U);
    EXPECT_EQ(::GetWindow(viewer, GW_OWNER), nullptr);
    EXPECT_NE(::GetClassLongPtrW(viewer, GCLP_HICONSM), 0U);
    EXPECT_NE(::GetClassLongPtrW(viewer, GCLP_HICON), 0U);
    std::wstring caption(64, L'\0');
    caption.resize(static_cast<std::size_t>(::GetWindowTextW(viewer, caption.data(), 64)));
    EXPECT_EQ(caption, L"Halvorn Software License");
}

TEST_F(AgreementViewerTest, ShowsTheAgreementAsRichText) {
    viewers.ShowAgreement();
    std::wstring shown(4096, L'\0');
    shown.resize(static_cast<std::size_t>(
        ::SendMessageW(RichText(Viewer()), WM_GETTEXT, shown.size(), reinterpret_cast<LPARAM>(shown.data()))));
    EXPECT_EQ(shown.substr(0, 24), L"Halvorn Software License");
    EXPECT_EQ(shown.find(L"\\rtf"), std::wstring::npos);
}

/// What the viewer does with its text control while it comes up, as hooks of the system see it.
class TextControlWitness {
public:
    TextControlWitness() {
        current = this;
        creation_ = ::SetWindowsHookExW(WH_CBT, OnCreation, nullptr, ::GetCurrentThreadId());
        message_ = ::SetWindowsHookExW(WH_CALLWNDPROC, OnMessage, nullptr, ::GetCurrentThreadId());
    }
    ~TextControlWitness() {
        ::UnhookWindowsHookEx(message_);
        ::UnhookWindowsHookEx(creation_);
        current = nullptr;
    }
    TextControlWitness(const TextControlWitness&) = delete;
    TextControlWitness& operator=(const TextControlWitness&) = delete;

    std::vector<std::wstring> firstTexts;          // of every rich text control that was made
    std::vector<std::pair<DWORD, UINT>> settings;  // flags and code page of each text that was set

private:
    static LRESULT CALLBACK OnCreation(int code, WPARAM window, LPARAM parameter) {
        if (code == HCBT_CREATEWND) {
            const CREATESTRUCTW& made = *reinterpret_cast<CBT_CREATEWNDW*>(parameter)->lpcs;
            std::wstring kind(64, L'\0');
            kind.resize(static_cast<std::size_t>(
                ::GetClassNameW(reinterpret_cast<HWND>(window), kind.data(), static_cast<int>(kind.size()))));
            if (::lstrcmpiW(kind.c_str(), L"RICHEDIT50W") == 0) {
                current->firstTexts.emplace_back(made.lpszName == nullptr ? L"" : made.lpszName);
            }
        }
        return ::CallNextHookEx(nullptr, code, window, parameter);
    }

    static LRESULT CALLBACK OnMessage(int code, WPARAM same, LPARAM parameter) {
        const CWPSTRUCT& sent = *reinterpret_cast<CWPSTRUCT*>(parameter);
        if (code == HC_ACTION && sent.message == EM_SETTEXTEX) {
            const SETTEXTEX& as = *reinterpret_cast<SETTEXTEX*>(sent.wParam);
            current->settings.emplace_back(as.flags, as.codepage);
        }
        return ::CallNextHookEx(nullptr, code, same, parameter);
    }

    static inline TextControlWitness* current = nullptr;
    HHOOK creation_ = nullptr;
    HHOOK message_ = nullptr;
};

TEST_F(AgreementViewerTest, CallsItsTextLicenseUntilItHasTheAgreement) {
    const TextControlWitness witness;
    viewers.ShowAgreement();
    EXPECT_EQ(witness.firstTexts, std::vector<std::wstring>{L"License"});
}

TEST_F(AgreementViewerTest, HandsTheAgreementOverOnceWithoutFlagsOrCodePage) {
    const TextControlWitness witness;
    viewers.ShowAgreement();
    EXPECT_EQ(witness.settings, (std::vector<std::pair<DWORD, UINT>>{{0, 0}}));
}

TEST_F(AgreementViewerTest, LetsNobodyWriteIntoTheAgreement) {
    viewers.ShowAgreement();
    EXPECT_NE(::GetWindowLongW(RichText(Viewer()), GWL_STYLE) & ES_READONLY, 0);
}

TEST_F(AgreementViewerTest, SetsTheTextInFromThreeEdges) {
    viewers.ShowAgreement();
    const HWND text = RichText(Viewer());
    RECT inset{};
    ::SendMessageW(text, EM_GETRECT, 0, reinterpret_cast<LPARAM>(&inset));
    // The same control with the same text, without the viewer's hand on it.
    const HWND plain = ::CreateWindowExW(0, L"RICHEDIT50W", L"License", 0x50A10844, 30, 50, 480, 495, Parent(), nullptr,
                                         nullptr, nullptr);
    ::SendMessageA(plain, WM_SETTEXT, 0, reinterpret_cast<LPARAM>(HV::LoadAgreementText().c_str()));
    RECT before{};
    ::SendMessageW(plain, EM_GETRECT, 0, reinterpret_cast<LPARAM>(&before));
    EXPECT_EQ(inset.left - before.left, 10);
    EXPECT_EQ(inset.top - before.top, 10);
    EXPECT_EQ(before.right - inset.right, 10);
    EXPECT_EQ(inset.bottom, before.bottom);
}

TEST_F(AgreementViewerTest, HasALightBackground) {
    viewers.ShowAgreement();
    RECT client{};
    ::GetClientRect(Viewer(), &client);
    Canvas canvas(static_cast<int>(client.right), static_cast<int>(client.bottom));
    EXPECT_NE(::SendMessageW(Viewer(), WM_ERASEBKGND, reinterpret_cast<WPARAM>(canvas.Device()), 0), 0);
    EXPECT_TRUE(canvas.IsFilled({0, 0, client.right, client.bottom}, 0xDEDEDE));
}

TEST_F(AgreementViewerTest, HasBlackCornersAroundItsButtonsAndABlueSaveButton) {
    viewers.ShowAgreement();
    Canvas canvas(80, 25);
    DRAWITEMSTRUCT save = DrawRequest(canvas, ::GetDlgItem(Viewer(), HV::kSaveLicenseControl), {0, 0, 80, 25});
    ::SendMessageW(Viewer(), WM_DRAWITEM, HV::kSaveLicenseControl, reinterpret_cast<LPARAM>(&save));
    EXPECT_EQ(canvas.At(0, 0), 0U);
    EXPECT_EQ(canvas.At(40, 2), 0x009FE1U);
    DRAWITEMSTRUCT close = DrawRequest(canvas, ::GetDlgItem(Viewer(), HV::kCloseViewerControl), {0, 0, 80, 25});
    ::SendMessageW(Viewer(), WM_DRAWITEM, HV::kCloseViewerControl, reinterpret_cast<LPARAM>(&close));
    EXPECT_EQ(canvas.At(0, 0), 0U);
    EXPECT_EQ(canvas.At(40, 2), 0x434343U);
}

TEST_F(AgreementViewerTest, OpensAsOftenAsItIsAskedFor) {
    viewers.ShowAgreement();
    viewers.ShowAgreement();
    EXPECT_EQ(Viewers().size(), 2U);
}

TEST_F(AgreementViewerTest, ClosesAloneAndLeavesTheRestOpen) {
    viewers.ShowAgreement();
    const HWND first = Viewer();
    viewers.ShowAgreement();
    Press(first, HV::kCloseViewerControl);
    EXPECT_EQ(::IsWindow(first), FALSE);
    EXPECT_EQ(Viewers().size(), 1U);
    EXPECT_FALSE(LoopHasEnded());
}

TEST_F(AgreementViewerTest, ClosesByItsBoxAndByEscape) {
    viewers.ShowAgreement();
    ::SendMessageW(Viewer(), WM_CLOSE, 0, 0);
    EXPECT_EQ(Viewers().size(), 0U);
    viewers.ShowAgreement();
    Press(Viewer(), IDCANCEL);
    EXPECT_EQ(Viewers().size(), 0U);
    EXPECT_FALSE(LoopHasEnded());
}

TEST_F(AgreementViewerTest, StaysOpenForWhateverIsNoPress) {
    viewers.ShowAgreement();
    Press(Viewer(), 0, EN_CHANGE);
    Press(Viewer(), HV::kCloseViewerControl, EN_SETFOCUS);
    Press(Viewer(), HV::kCloseViewerControl, BN_DOUBLECLICKED);
    EXPECT_EQ(Viewers().size(), 1U);
}

std::string BytesOf(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

TEST(Agreement, IsTheFileThatTheProgramWasBuiltWith) {
    const std::string text = HV::LoadAgreementText();
    EXPECT_EQ(text, BytesOf(HV_RESOURCES "/agreement.rtf"));
    EXPECT_EQ(text.substr(0, 5), "{\\rtf");
}

TEST(Agreement, IsSavedAsTheProgramCarriesIt) {
    const Machine machine;
    HV::WriteAgreement(R"(C:\Saved.rtf)", HV::LoadAgreementText());
    EXPECT_EQ(machine.Content(R"(C:\Saved.rtf)"), BytesOf(HV_RESOURCES "/agreement.rtf"));
}

TEST(Agreement, IsWrittenInTextMode) {
    const Machine machine;
    HV::WriteAgreement(R"(C:\Saved.rtf)", "one\ntwo\r");
    EXPECT_EQ(machine.Content(R"(C:\Saved.rtf)"), "one\r\ntwo\r");
}

TEST(Agreement, ReplacesAFile) {
    Machine machine;
    machine.Has(R"(C:\Saved.rtf)", "something longer than the new text");
    HV::WriteAgreement(R"(C:\Saved.rtf)", "new");
    EXPECT_EQ(machine.Content(R"(C:\Saved.rtf)"), "new");
}

TEST(Agreement, IsSavedUnderAnyName) {
    const Machine machine;
    HV::WriteAgreement("C:\\Vertr\xC3\xA4ge \xE2\x82\xAC.rtf", "text");
    EXPECT_EQ(machine.Content("C:\\Vertr\xC3\xA4ge \xE2\x82\xAC.rtf"), "text");
}

TEST(Agreement, SaysNothingWhenTheFileCannotBeWritten) {
    const Machine machine;
    HV::WriteAgreement(R"(C:\no such folder\Saved.rtf)", "text");
    EXPECT_FALSE(machine.Exists(R"(C:\no such folder)"));
}

}  // namespace
