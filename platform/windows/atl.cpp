#include "platform/windows/atl.h"

#include <array>
#include <cstdio>
#include <utility>

#include "platform/utf8.h"

namespace ATL {

namespace {

// The first error that left a window's message handler. What follows it is its consequence.
thread_local std::exception_ptr uncaught;

void EndLoopWith(std::exception_ptr error) noexcept {
    if (!uncaught) {
        uncaught = std::move(error);
    }
    ::PostQuitMessage(0);
}

}  // namespace

RECT WorkAreaAt(const RECT& place) {
    MONITORINFO monitor{};
    monitor.cbSize = sizeof monitor;
    ::GetMonitorInfoW(::MonitorFromRect(&place, MONITOR_DEFAULTTONEAREST), &monitor);
    return monitor.rcWork;
}

void RethrowUncaught() {
    if (uncaught) {
        std::rethrow_exception(std::exchange(uncaught, nullptr));
    }
}

RECT CWindow::GetClientRect() const {
    RECT client{};
    ::GetClientRect(m_hWnd, &client);
    return client;
}

void CWindow::CenterWindow() const {
    const bool child = (::GetWindowLongW(m_hWnd, GWL_STYLE) & WS_CHILD) != 0;
    RECT own{};
    ::GetWindowRect(m_hWnd, &own);
    const RECT area = child ? CWindow(::GetParent(m_hWnd)).GetClientRect() : WorkAreaAt(own);
    const long left = area.left + ((area.right - area.left) - (own.right - own.left)) / 2;
    const long top = area.top + ((area.bottom - area.top) - (own.bottom - own.top)) / 2;
    ::SetWindowPos(m_hWnd, nullptr, left, top, 0, 0, SWP_NOSIZE | SWP_NOZORDER | SWP_NOACTIVATE);
}

void CWindow::SendMessageToDescendants(UINT message, WPARAM wParam, LPARAM lParam) const {
    for (HWND child = ::GetTopWindow(m_hWnd); child != nullptr; child = ::GetWindow(child, GW_HWNDNEXT)) {
        ::SendMessageW(child, message, wParam, lParam);
        CWindow(child).SendMessageToDescendants(message, wParam, lParam);
    }
}

const wchar_t* CWndClassInfo::Register(WNDPROC firstProcedure) {
    if (!name_.empty()) {
        return name_.c_str();
    }
    std::array<wchar_t, 32> name{};
    std::swprintf(name.data(), name.size(), L"ATL:%p", static_cast<void*>(this));
    WNDCLASSEXW windowClass{};
    windowClass.cbSize = sizeof windowClass;
    windowClass.style = CS_HREDRAW | CS_VREDRAW | CS_DBLCLKS;
    windowClass.lpfnWndProc = firstProcedure;
    windowClass.hInstance = ::GetModuleHandleW(nullptr);
    windowClass.hCursor = ::LoadCursorW(nullptr, MAKEINTRESOURCEW(32512));
    // NOLINTNEXTLINE(performance-no-int-to-ptr): a colour of the system stands for a brush as its number plus one.
    windowClass.hbrBackground = reinterpret_cast<HBRUSH>(static_cast<std::uintptr_t>(COLOR_WINDOW + 1));
    windowClass.lpszClassName = name.data();
    if (icon_ != 0) {
        windowClass.hIcon = ::LoadIconW(windowClass.hInstance, MAKEINTRESOURCEW(icon_));
        windowClass.hIconSm = windowClass.hIcon;
    }
    if (::RegisterClassExW(&windowClass) == 0) {
        return nullptr;
    }
    name_ = name.data();
    return name_.c_str();
}

HWND CWindowImplBase::CreateOfClass(const wchar_t* name, HWND parent, const RECT& place, const std::string& text,
                                    DWORD style, DWORD extendedStyle) {
    if (name == nullptr) {
        return nullptr;
    }
    const HWND made = ::CreateWindowExW(extendedStyle, name, platform::WideFromUtf8(text).c_str(), style, place.left,
                                        place.top, place.right - place.left, place.bottom - place.top, parent, nullptr,
                                        ::GetModuleHandleW(nullptr), this);
    if (made == nullptr) {
        RethrowUncaught();
    }
    return made;
}

// Serves a window until the first message that says whose it is. Few come before that, and the system knows them all.
LRESULT CALLBACK CWindowImplBase::StartWindowProc(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
    if (message != WM_NCCREATE) {
        return ::DefWindowProcW(window, message, wParam, lParam);
    }
    auto* const self = static_cast<CWindowImplBase*>(reinterpret_cast<CREATESTRUCTW*>(lParam)->lpCreateParams);
    self->m_hWnd = window;
    self->destroyed_ = false;
    const WNDPROC procedure = self->GetWindowProc();
    ::SetWindowLongPtrW(window, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(self));
    ::SetWindowLongPtrW(window, GWLP_WNDPROC, reinterpret_cast<LONG_PTR>(procedure));
    return procedure(window, message, wParam, lParam);
}

LRESULT CALLBACK CWindowImplBase::WindowProc(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
    // NOLINTNEXTLINE(performance-no-int-to-ptr): the window carries the pointer as a number.
    auto* const self = reinterpret_cast<CWindowImplBase*>(::GetWindowLongPtrW(window, GWLP_USERDATA));
    return self->Serve(window, message, wParam, lParam);
}

LRESULT CWindowImplBase::Serve(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
    ++depth_;
    LRESULT result = 0;
    if (Guarded(window, message, wParam, lParam, result) == FALSE) {
        result = ::DefWindowProcW(window, message, wParam, lParam);
    }
    destroyed_ = destroyed_ || message == WM_NCDESTROY;
    --depth_;
    if (destroyed_ && depth_ == 0) {
        m_hWnd = nullptr;
        // The last words: the object may be gone when they have been spoken.
        OnFinalMessage(window);
    }
    return result;
}

BOOL CWindowImplBase::Guarded(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) noexcept {
    try {
        return ProcessWindowMessage(window, message, wParam, lParam, result);
    } catch (...) {
        EndLoopWith(std::current_exception());
        // A window whose creation threw does not come to be.
        result = message == WM_CREATE ? -1 : 0;
        return TRUE;
    }
}

WTL::CMessageLoop* CComModule::GetMessageLoop() const {
    const auto found = loops_.find(::GetCurrentThreadId());
    return found == loops_.end() ? nullptr : found->second;
}

}  // namespace ATL
