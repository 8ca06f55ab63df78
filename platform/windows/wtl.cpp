#include "platform/windows/wtl.h"

#include <algorithm>
#include <stdexcept>

#include "platform/windows/atl.h"

namespace WTL {

namespace {

constexpr std::size_t kLongestPath = 32768;
constexpr LPARAM kHeldDown = 0x40000000;

// Return presses the button that has the focus, once however long it is held. Buttons that their owner draws do not ask
// for it by themselves.
bool PressesButton(const MSG& message) {
    if (message.message != WM_KEYDOWN || message.wParam != VK_RETURN ||
        (::SendMessageW(message.hwnd, WM_GETDLGCODE, VK_RETURN, 0) & DLGC_BUTTON) == 0) {
        return false;
    }
    if ((message.lParam & kHeldDown) == 0 && ::IsWindowEnabled(message.hwnd) != FALSE) {
        ::SendMessageW(message.hwnd, BM_CLICK, 0, 0);
    }
    return true;
}

// A text that nobody can write into has no use for Tab and asks for it all the same: the focus would stay there for
// good.
bool LeavesText(const MSG& message) {
    if (message.message != WM_KEYDOWN || message.wParam != VK_TAB ||
        (::GetWindowLongW(message.hwnd, GWL_STYLE) & ES_READONLY) == 0 ||
        (::SendMessageW(message.hwnd, WM_GETDLGCODE, VK_TAB, 0) & (DLGC_WANTTAB | DLGC_WANTALLKEYS)) == 0) {
        return false;
    }
    const BOOL backwards = ::GetKeyState(VK_SHIFT) < 0 ? TRUE : FALSE;
    ::SetFocus(::GetNextDlgTabItem(::GetAncestor(message.hwnd, GA_ROOT), message.hwnd, backwards));
    return true;
}

// Required by the flag that asks for a hook. It has nothing to add to what the dialogue does.
UINT_PTR CALLBACK IdleHook(HWND, UINT, WPARAM, LPARAM) {
    return 0;
}

}  // namespace

int CMessageLoop::Run() {
    MSG message{};
    BOOL more = TRUE;
    while ((more = ::GetMessageW(&message, nullptr, 0, 0)) > 0) {
        if (!PreTranslateMessage(message)) {
            ::TranslateMessage(&message);
            ::DispatchMessageW(&message);
        }
    }
    ATL::RethrowUncaught();
    if (more < 0) {
        throw std::runtime_error("the message queue cannot be read");
    }
    return static_cast<int>(message.wParam);
}

// Tab and the arrows move the focus, Space and Return press a button, and Escape reaches the window as the command
// IDCANCEL, in every window of the thread.
bool CMessageLoop::PreTranslateMessage(MSG& message) {
    if (message.hwnd == nullptr) {
        return false;
    }
    return PressesButton(message) || LeavesText(message) ||
           ::IsDialogMessageW(::GetAncestor(message.hwnd, GA_ROOT), &message) != FALSE;
}

CFileDialog::CFileDialog(const wchar_t* defaultExtension, const wchar_t* fileName, DWORD flags, HWND owner)
    : path_(kLongestPath) {
    const std::wstring name = fileName;
    std::copy_n(name.begin(), std::min(name.size(), path_.size() - 1), path_.begin());
    m_ofn.lStructSize = sizeof m_ofn;
    m_ofn.hwndOwner = owner;
    m_ofn.lpstrFile = path_.data();
    m_ofn.nMaxFile = static_cast<DWORD>(path_.size());
    m_ofn.lpstrDefExt = defaultExtension;
    m_ofn.Flags = flags;
    m_ofn.lpfnHook = (flags & OFN_ENABLEHOOK) != 0 ? IdleHook : nullptr;
}

INT_PTR CFileDialog::DoModal() {
    return ::GetSaveFileNameW(&m_ofn) != FALSE ? IDOK : IDCANCEL;
}

}  // namespace WTL
