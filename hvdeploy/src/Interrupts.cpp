#include "hvdeploy/src/Interrupts.h"

#include <mutex>
#include <utility>

namespace HV {
namespace {

struct Listener {
    std::mutex mutex;  // held while the function runs: the destructor waits for it
    std::function<void()> function;
};

// Never destroyed: the platform's thread may still be on its way here when the process ends.
Listener& TheListener() {
    static auto& listener = *new Listener;
    return listener;
}

void Listen(std::function<void()> function) {
    const std::lock_guard<std::mutex> guard(TheListener().mutex);
    TheListener().function = std::move(function);
}

}  // namespace

Interrupts::Interrupts(std::function<void()> onInterrupt) {
    Listen(std::move(onInterrupt));
    SetConsoleCtrlHandler(&OnEvent, TRUE);
}

Interrupts::~Interrupts() {
    SetConsoleCtrlHandler(&OnEvent, FALSE);
    Listen(nullptr);
}

BOOL WINAPI Interrupts::OnEvent(DWORD event) {
    if (event != CTRL_C_EVENT && event != CTRL_BREAK_EVENT) {
        return FALSE;
    }
    const std::lock_guard<std::mutex> guard(TheListener().mutex);
    if (!TheListener().function) {
        return FALSE;
    }
    TheListener().function();
    return TRUE;
}

}  // namespace HV
