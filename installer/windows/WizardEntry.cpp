#include "installer/windows/WizardEntry.h"

#include <exception>
#include <thread>

#include "hvframework/Log.h"
#include "installer/InstallerModel.h"
#include "installer/StartUp.h"
#include "installer/WinWizardController.h"
#include "installer/windows/WindowSystem.h"
#include "installer/windows/WindowsToolkit.h"
#include "platform/command_processor.h"
#include "platform/redirection_guard.h"
#include "platform/windows/atl.h"
#include "platform/windows/script_console.h"
#include "platform/windows/wtl.h"

namespace HV {

namespace {

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

// On a thread of its own, which ends when it is done: the window does not wait for it, and no script runs before the
// user has asked for an install.
void PrepareConsoleForScripts() {
    std::thread([] { platform::WindowlessConsole().Join(); }).detach();
}

int ShowWizard(HINSTANCE instance, int showCommand) {
    ATL::CComModule module;
    module.Init(instance);
    RegisteredLoop loop(module);
    WindowsToolkit toolkit;
    RequirePackagesDirectory(toolkit, PackagesDirectoryPath());
    WinWizardController controller(toolkit, InstallerModel::Instance());
    controller.Initialize(showCommand);
    return loop.Run();
}

}  // namespace

int RunWizard(HINSTANCE instance, int showCommand) {
    (void)platform::RefusePlantedJunctions();
    platform::UseSystemCommandProcessor();
    platform::OpenMissingStandardStreams();
    PrepareConsoleForScripts();
    const WindowSystem windows;
    try {
        StartLogging();
        return ShowWizard(instance, showCommand);
    } catch (const std::exception& error) {
        HVL_LOG(Emerg, "The installer ends because of an error that nothing catches: " << error.what());
        throw;
    }
}

}  // namespace HV
