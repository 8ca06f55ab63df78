#include "platform/windows/wtl.h"

#include <algorithm>
#include <optional>
#include <stdexcept>
#include <utility>

#include "platform/windows/atl.h"

namespace WTL {

namespace {

constexpr std::size_t kLongestPath = 32768;
constexpr LPARAM kHeldDown = 0x40000000;

LRESULT CodeOf(const MSG& message) {
    return ::SendMessageW(message.hwnd, WM_GETDLGCODE, message.wParam, 0);
}

bool IsKeyDown(const MSG& message, WPARAM key) {
    return message.message == WM_KEYDOWN && message.wParam == key;
}

// Return presses the button that has the focus, once however long it is held. Buttons that their owner draws do not ask
// for it by themselves.
bool PressesButton(const MSG& message) {
    if (!IsKeyDown(message, VK_RETURN) || (CodeOf(message) & DLGC_BUTTON) == 0) {
        return false;
    }
    if ((message.lParam & kHeldDown) == 0 && ::IsWindowEnabled(message.hwnd) != FALSE) {
        ::SendMessageW(message.hwnd, BM_CLICK, 0, 0);
    }
    return true;
}

bool IsReadOnlyText(const MSG& message) {
    return (::GetWindowLongW(message.hwnd, GWL_STYLE) & ES_READONLY) != 0 && (CodeOf(message) & DLGC_HASSETSEL) != 0;
}

// Tab moves the focus and does nothing else. The system's own Tab would select the whole of a text that it reaches, and
// show its end; and a text that nobody can write into asks for Tab although it has no use for it, so that the focus
// would stay there for good.
bool MovesFocus(const MSG& message) {
    if (!IsKeyDown(message, VK_TAB) ||
        ((CodeOf(message) & (DLGC_WANTTAB | DLGC_WANTALLKEYS)) != 0 && !IsReadOnlyText(message))) {
        return false;
    }
    const HWND root = ::GetAncestor(message.hwnd, GA_ROOT);
    const HWND from = message.hwnd == root ? nullptr : message.hwnd;
    const HWND next = ::GetNextDlgTabItem(root, from, ::GetKeyState(VK_SHIFT) < 0 ? TRUE : FALSE);
    if (next != nullptr) {
        ::SetFocus(next);
    }
    return true;
}

RECT PlaceOf(HWND window) {
    RECT place{};
    ::GetWindowRect(window, &place);
    return place;
}

// The buttons beside this one that are of its kind (the low word of a control's style) and can be reached, itself among
// them: column by column from the left, each from its top.
std::vector<HWND> GroupOf(HWND button) {
    std::vector<HWND> group;
    const WORD kind = LOWORD(::GetWindowLongW(button, GWL_STYLE));
    for (HWND other = ::GetTopWindow(::GetParent(button)); other != nullptr; other = ::GetWindow(other, GW_HWNDNEXT)) {
        if (LOWORD(::GetWindowLongW(other, GWL_STYLE)) == kind && ::IsWindowVisible(other) != FALSE &&
            ::IsWindowEnabled(other) != FALSE) {
            group.push_back(other);
        }
    }
    std::sort(group.begin(), group.end(), [](HWND one, HWND two) {
        return std::pair(PlaceOf(one).left, PlaceOf(one).top) < std::pair(PlaceOf(two).left, PlaceOf(two).top);
    });
    return group;
}

// Where an arrow leads from a button: down and up step through its group, right and left go to the neighbour in its
// row. Null at the end.
HWND NeighbourOf(HWND button, WPARAM arrow) {
    std::vector<HWND> group = GroupOf(button);
    if (arrow == VK_LEFT || arrow == VK_UP) {
        std::reverse(group.begin(), group.end());
    }
    auto next = std::find(group.begin(), group.end(), button);
    if (next == group.end()) {
        return nullptr;
    }
    const bool inRow = arrow == VK_LEFT || arrow == VK_RIGHT;
    next = std::find_if(next + 1, group.end(),
                        [&](HWND other) { return !inRow || PlaceOf(other).top == PlaceOf(button).top; });
    return next == group.end() ? nullptr : *next;
}

// An arrow moves the focus among the check boxes of a page, or the buttons of a row. It presses nothing, and elsewhere
// it does nothing, unless the control has a use for it.
bool StepsThroughGroup(const MSG& message) {
    if (message.message != WM_KEYDOWN || message.wParam < VK_LEFT || message.wParam > VK_DOWN ||
        (CodeOf(message) & DLGC_WANTARROWS) != 0) {
        return false;
    }
    const bool isButton = (CodeOf(message) & DLGC_BUTTON) != 0;
    if (const HWND next = isButton ? NeighbourOf(message.hwnd, message.wParam) : nullptr; next != nullptr) {
        ::SetFocus(next);
    }
    return true;
}

// What a key asks of the scroll bar of a text; nothing for most keys.
std::optional<WPARAM> ScrollOf(WPARAM key) {
    switch (key) {
        case VK_UP:
            return SB_LINEUP;
        case VK_DOWN:
            return SB_LINEDOWN;
        case VK_PRIOR:
            return SB_PAGEUP;
        case VK_NEXT:
            return SB_PAGEDOWN;
        case VK_HOME:
            return SB_TOP;
        case VK_END:
            return SB_BOTTOM;
        default:
            return std::nullopt;
    }
}

// A text that nobody can write into is scrolled by the keys that would move a caret in another, at once and not only
// when the caret has reached the last line in sight. With Shift or Ctrl the keys are the control's own.
bool ScrollsText(const MSG& message) {
    if (message.message != WM_KEYDOWN || !IsReadOnlyText(message) || ::GetKeyState(VK_SHIFT) < 0 ||
        ::GetKeyState(VK_CONTROL) < 0) {
        return false;
    }
    const std::optional<WPARAM> scroll = ScrollOf(message.wParam);
    if (scroll) {
        ::SendMessageW(message.hwnd, WM_VSCROLL, *scroll, 0);
    }
    return scroll.has_value();
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

// Tab moves the focus through a window and the arrows move it within a group of buttons; Space and Return press a
// button; the same keys scroll a text; Escape reaches the window as the command IDCANCEL. In every window of the
// thread.
bool CMessageLoop::PreTranslateMessage(MSG& message) {
    if (message.hwnd == nullptr) {
        return false;
    }
    return PressesButton(message) || MovesFocus(message) || ScrollsText(message) || StepsThroughGroup(message) ||
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
