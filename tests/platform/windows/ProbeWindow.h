#pragma once

#include <functional>
#include <vector>

#include "platform/windows/atl.h"

/// A window of which a test says what it does.
class ProbeWindow : public ATL::CWindowImpl<ProbeWindow> {
public:
    BOOL ProcessWindowMessage(HWND, UINT message, WPARAM wParam, LPARAM, LRESULT& result) override {
        messages.push_back(message);
        return onMessage ? onMessage(message, wParam, result) : FALSE;
    }

    ~ProbeWindow() override {
        if (m_hWnd != nullptr) {
            ::DestroyWindow(m_hWnd);
        }
    }

    void OnFinalMessage(HWND window) override {
        last = window;
        ++finals;
    }

    static ATL::CWndClassInfo& GetWndClassInfo() {
        static ATL::CWndClassInfo info;
        return info;
    }

    HWND CreateAnywhere() { return Create(nullptr, {0, 0, 200, 100}, "Probe", WS_CAPTION); }

    std::function<BOOL(UINT message, WPARAM wParam, LRESULT& result)> onMessage;
    std::vector<UINT> messages;
    HWND last = nullptr;
    int finals = 0;
};

constexpr UINT kProbe = WM_APP + 1;

/// Takes everything out of the thread's queue, so that the next test finds it empty.
inline void EmptyQueue() {
    MSG message{};
    while (::PeekMessageW(&message, nullptr, 0, 0, PM_REMOVE) != FALSE) {
        ::DispatchMessageW(&message);
    }
}
