#pragma once

#include "platform/windows/win32.h"

/// What a program with windows lacks and the scripts that it starts need: standard streams and a console.
///
/// A program of the window kind is started without either. The runtime's _popen hands its own streams on to the
/// command processor and is documented to fail or to hang where there are none; and a command processor without a
/// console to inherit opens one of its own, whose window flashes up for each script.
namespace platform {

/// Opens the null device for each of the three standard streams that this program was started without. Streams that
/// lead somewhere stay as they are. Afterwards whatever writes to them, std::cout included, succeeds.
void OpenMissingStandardStreams();

/// A console without a window, for this program and all that it starts.
///
/// A console that is made for a running program always shows its window first. One that is made for a new program may
/// have none, and others can join it. So a command processor is started that waits for input; this program joins its
/// console; the command processor is let go, and the console stays as long as somebody uses it.
class WindowlessConsole {
public:
    /// Starts the command processor, which takes its time, unless this program has a console already.
    WindowlessConsole();

    /// Lets the command processor end, unless Join() has.
    ~WindowlessConsole();

    WindowlessConsole(const WindowlessConsole&) = delete;
    WindowlessConsole& operator=(const WindowlessConsole&) = delete;

    /// Joins the console, once the command processor has it, and lets that end. Where that fails the program gets an
    /// ordinary console, whose window is hidden at once. Returns whether the program has a console now.
    bool Join();

private:
    void StartOwner();
    [[nodiscard]] bool JoinOwner() const;
    void ReleaseOwner();

    HANDLE owner_ = nullptr;  // the command processor, whose console this is
    DWORD ownerId_ = 0;
    HANDLE input_ = nullptr;  // it waits for what is written here
};

}  // namespace platform
