#include "platform/hosted/console.h"

#include <fcntl.h>
#include <signal.h>
#include <unistd.h>

#include <atomic>
#include <thread>

namespace {

std::atomic<PHANDLER_ROUTINE> currentHandler{nullptr};
int wakeUp[2] = {-1, -1};

// In a signal handler nothing but a write is allowed; the thread at the other end of the pipe does the rest.
void OnSignal(int signal) {
    const int saved = errno;
    const char event = signal == SIGINT ? static_cast<char>(CTRL_C_EVENT) : static_cast<char>(CTRL_BREAK_EVENT);
    [[maybe_unused]] const auto written = write(wakeUp[1], &event, 1);
    errno = saved;
}

void ServeEvents() {
    char event = 0;
    while (read(wakeUp[0], &event, 1) == 1) {
        if (const PHANDLER_ROUTINE handler = currentHandler.load(); handler != nullptr) {
            handler(static_cast<DWORD>(event));
        }
    }
}

// The thread waits for the life of the process.
bool StartServing() {
    static const bool started = [] {
        if (pipe2(wakeUp, O_CLOEXEC) != 0) {
            return false;
        }
        std::thread(ServeEvents).detach();
        return true;
    }();
    return started;
}

void Handle(int signal, void (*handler)(int)) {
    struct sigaction action = {};
    action.sa_handler = handler;
    action.sa_flags = SA_RESTART;
    sigaction(signal, &action, nullptr);
}

}  // namespace

BOOL SetConsoleCtrlHandler(PHANDLER_ROUTINE handler, BOOL add) {
    if (add != FALSE && !StartServing()) {
        return FALSE;
    }
    currentHandler = add != FALSE ? handler : nullptr;
    for (const int signal : {SIGINT, SIGTERM}) {
        Handle(signal, add != FALSE ? &OnSignal : SIG_DFL);
    }
    return TRUE;
}
