#pragma once

#include <cstdint>
#include <exception>
#include <map>
#include <string>

#include "platform/windows/window.h"

namespace WTL {
class CMessageLoop;
}

/// The small part of ATL that the wizard's windows stand on, written for a compiler that has none.
///
/// An object of CWindowImpl is bound to its window from the window's first message to its last, through a pointer that
/// the window carries, so no code is generated at run time. All of it belongs to the thread that makes the windows.
namespace ATL {

/// The part that windows may cover of the monitor that `place` is on or, if it is on none, nearest to.
[[nodiscard]] RECT WorkAreaAt(const RECT& place);

/// A window's handle with the operations that the wizard needs. Owns nothing; copies name the same window.
class CWindow {
public:
    explicit CWindow(HWND window = nullptr) : m_hWnd(window) {}

    // A handle goes wherever the platform wants one.
    operator HWND() const { return m_hWnd; }

    [[nodiscard]] RECT GetClientRect() const;

    /// Puts the window in the middle of the work area of the monitor that it is on, or of its parent.
    void CenterWindow() const;

    /// Sends a message to the windows in this one, and to the windows in those.
    void SendMessageToDescendants(UINT message, WPARAM wParam, LPARAM lParam) const;

    /// Has the whole client area painted again, with erasing.
    void Invalidate() const { ::InvalidateRect(m_hWnd, nullptr, TRUE); }

    HWND m_hWnd = nullptr;
};

/// A class of windows, registered when the first of them is made, under a name that is made from this object's address.
class CWndClassInfo {
public:
    /// `icon` is the number of a resource, 0 for none: the title bar's icon, and the one of Alt+Tab and the task bar.
    explicit CWndClassInfo(std::uint16_t icon = 0) : icon_(icon) {}

    /// Registers the class unless that has been done. Gives its name, or null when the system refuses.
    [[nodiscard]] const wchar_t* Register(WNDPROC firstProcedure);

private:
    std::uint16_t icon_;
    std::wstring name_;
};

/// What windows of all classes share.
class CWindowImplBase : public CWindow {
public:
    CWindowImplBase() = default;
    CWindowImplBase(const CWindowImplBase&) = delete;
    CWindowImplBase& operator=(const CWindowImplBase&) = delete;

    /// Handles a message, or returns FALSE so that the system does. An exception ends the message loop and leaves it
    /// there: see WTL::CMessageLoop::Run(). It cannot pass through the system's own frames in between.
    virtual BOOL ProcessWindowMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) = 0;

    virtual ~CWindowImplBase() = default;

    /// The procedure that serves the window from its first message on.
    virtual WNDPROC GetWindowProc() { return WindowProc; }

    /// The window is gone, and no operation of this object is running any more: it may delete itself.
    virtual void OnFinalMessage(HWND /*window*/) {}

protected:
    static LRESULT CALLBACK StartWindowProc(HWND window, UINT message, WPARAM wParam, LPARAM lParam);
    static LRESULT CALLBACK WindowProc(HWND window, UINT message, WPARAM wParam, LPARAM lParam);

    HWND CreateOfClass(const wchar_t* name, HWND parent, const RECT& place, const std::string& text, DWORD style,
                       DWORD extendedStyle);

private:
    LRESULT Serve(HWND window, UINT message, WPARAM wParam, LPARAM lParam);
    BOOL Guarded(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) noexcept;

    int depth_ = 0;  // messages under way, one inside the other
    bool destroyed_ = false;
};

/// The base of a class of windows T, which has `static CWndClassInfo& GetWndClassInfo()`.
template <class T>
class CWindowImpl : public CWindowImplBase {
public:
    /// Makes the window; `text` is UTF-8. Gives null when the system refuses it, and throws what its creation threw.
    HWND Create(HWND parent, const RECT& place, const std::string& text, DWORD style, DWORD extendedStyle = 0) {
        return CreateOfClass(T::GetWndClassInfo().Register(StartWindowProc), parent, place, text, style, extendedStyle);
    }
};

/// The module of the program: its instance, and the message loops of its threads.
class CComModule {
public:
    void Init(HINSTANCE instance) { m_hInst = instance; }
    [[nodiscard]] HINSTANCE GetModuleInstance() const { return m_hInst; }

    /// Registers the loop of the calling thread. It is not owned.
    void AddMessageLoop(WTL::CMessageLoop* loop) { loops_[::GetCurrentThreadId()] = loop; }
    void RemoveMessageLoop() { loops_.erase(::GetCurrentThreadId()); }

    /// The loop of the calling thread, or null.
    [[nodiscard]] WTL::CMessageLoop* GetMessageLoop() const;

private:
    HINSTANCE m_hInst = nullptr;
    std::map<DWORD, WTL::CMessageLoop*> loops_;
};

/// Throws what a window procedure of this thread has thrown and nobody has seen yet, if there is anything.
void RethrowUncaught();

}  // namespace ATL
