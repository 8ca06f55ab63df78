#include "installer/windows/WizardEntry.h"

#include <exception>

#include "hvframework/Log.h"
#include "installer/StartUp.h"
#include "installer/WinWizardController.h"
#include "installer/windows/WindowsToolkit.h"
#include "platform/windows/atl.h"
#include "platform/windows/gdiplus.h"
#include "platform/windows/script_console.h"
#include "platform/windows/wtl.h"

namespace HV {

namespace {

constexpr DWORD kAllControls = 0x37FF;

// What the windows need of the process, from the first of them to the last.
class WindowSystem {
public:
    WindowSystem() {
        ::OleInitialize(nullptr);
        const INITCOMMONCONTROLSEX controls{sizeof controls, kAllControls};
        ::InitCommonControlsEx(&controls);
        // Brings the rich text control. Without it the agreement viewer stays empty, and everything else works.
        ::LoadLibraryW(L"MSFTEDIT.DLL");
        const Gdiplus::GdiplusStartupInput input(nullptr, FALSE, FALSE);
        Gdiplus::GdiplusStartup(&token_, &input, nullptr);
    }

    ~WindowSystem() {
        ::OleUninitialize();
        Gdiplus::GdiplusShutdown(token_);
    }

    WindowSystem(const WindowSystem&) = delete;
    WindowSystem& operator=(const WindowSystem&) = delete;

private:
    ULONG_PTR token_ = 0;
};

// The message loop of this thread, known to the module as long as it runs.
class RegisteredLoop {
public:
    explicit RegisteredLoop(ATL::CComModule& module) : module_(module) { module_.AddMessageLoop(&loop_); }
    ~RegisteredLoop() { module_.RemoveMessageLoop(); }

    RegisteredLoop(const RegisteredLoop&) = delete;
    RegisteredLoop& operator=(const RegisteredLoop&) = delete;

    int Run() { return loop_.Run(); }

private:
    ATL::CComModule& module_;
    WTL::CMessageLoop loop_;
};

int ShowWizard(HINSTANCE instance, int showCommand, platform::WindowlessConsole& console) {
    ATL::CComModule module;
    module.Init(instance);
    RegisteredLoop loop(module);
    WindowsToolkit toolkit;
    WinWizardController controller(toolkit);
    RequirePackagesDirectory(toolkit);
    controller.Initialize(showCommand);
    // Not before: the window does not wait for it, and no script runs until the user has asked for an install.
    console.Join();
    return loop.Run();
}

}  // namespace

int RunWizard(HINSTANCE instance, int showCommand) {
    platform::OpenMissingStandardStreams();
    platform::WindowlessConsole console;
    const WindowSystem windows;
    StartLogging();
    try {
        return ShowWizard(instance, showCommand, console);
    } catch (const std::exception& error) {
        HVL_LOG(Emerg, "The installer ends because of an error that nothing catches: " << error.what());
        throw;
    }
}

}  // namespace HV
