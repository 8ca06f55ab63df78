#pragma once

#include <functional>

#include "platform/win32.h"

namespace HV {

/// Turns interrupts from the keyboard into calls of one function, for as long as it lives. One object at a time.
///
/// The function runs on a thread of the platform's own. Once the destructor has come back no call is under way and none
/// will come, so what the function uses may go.
class Interrupts {
public:
    explicit Interrupts(std::function<void()> onInterrupt);
    ~Interrupts();
    Interrupts(const Interrupts&) = delete;
    Interrupts& operator=(const Interrupts&) = delete;

    /// What the platform calls, from any thread. TRUE when the event is an interrupt and there is a function for it.
    static BOOL WINAPI OnEvent(DWORD event);
};

}  // namespace HV
