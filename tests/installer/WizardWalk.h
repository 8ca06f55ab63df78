#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "hvdeploy/src/DeployJob.h"
#include "installer/InstallerModel.h"
#include "installer/WinWizardController.h"
#include "platform/filesystem.h"
#include "tests/installer/HeldStreams.h"
#include "tests/installer/ScriptedToolkit.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"

inline constexpr int kOk = 1;
inline constexpr int kCancel = 2;
inline constexpr int kRetry = 4;

inline constexpr const char* kFailureText = "An error occurred during installation.";

inline const ShownBox kInvalidPackages{"Error: invalid installer packages.",
                                       "This installer contains invalid packages and cannot be run.", 16, 16, false};
inline const ShownBox kNoHosts{
    "Error: no hosts found.",
    "This installer's products require host applications which are not installed on this computer.", 16, 16, false};
inline const ShownBox kMissingHosts{"Warning: missing hosts.",
                                    "Some products require host applications which are not installed on this computer. "
                                    "Selection of these products for install will be disabled.",
                                    48, 48, false};
inline const ShownBox kNothingSelected{"No Products Selected", "Please select at least one plugin to install.",
                                       std::nullopt, 0, true};
inline const ShownBox kManagerRuns{
    "Halvorn Application Manager is running.",
    "Please quit Halvorn Application Manager and retry, or cancel to exit the installer.", 48, 0x2035, false};
inline const ShownBox kInstallationFailed{
    "Installation Failed",
    "An error prevented the install from completing. The installation log has been written to the Halvorn logs "
    "directory in ProgramData.",
    16, 16, true};

inline ShownBox HostsRun(const std::string& text) {
    return {"Host applications running.", text, 48, 0x2035, false};
}

/// A machine with a wizard that is about to start, and its user. Logging stands, as it does when a wizard starts.
///
/// The run of an install is over when the test is.
class WizardWalk : public testing::Test {
protected:
    explicit WizardWalk(HV::Release release);
    ~WizardWalk() override;

    void HasHostsOf(const std::string& sampleMachine);

    // The user's way

    /// Starts the wizard, ready for the first press. It is shown as a program that is started with this command.
    void Start(int showCommand);
    void Begin();
    /// Starts the wizard and expects the process to end with status 0 there.
    void BeginAndEnd();
    void BeginAndAgree();
    /// On to the selection page.
    void GoToSelection();
    /// From the selection page into the install.
    void Install() { toolkit.Press(HV::kContinueCommand); }

    // The install

    /// Waits until the job's thread has ended. Fails the test when that takes a minute.
    void WaitForJob();
    /// Lets a held run go on and waits for its end.
    void EndTheRun();
    /// One tick, which is to end the process with status 0.
    void TickToTheEnd();
    /// Presses Install, polls until the final page is there, and gives every state of the bar on the way.
    std::vector<int> InstallAndPoll();

    /// The wizard's model, loaded as the start of the wizard does it.
    [[nodiscard]] HV::InstallerModel& Model();
    [[nodiscard]] std::string Line() const { return wizard.job->commandLine; }
    /// The value of an argument of the line as the engine has read it. The run is over then.
    [[nodiscard]] std::string Argument(const std::string& key);

    Machine machine;
    LogRecorder log;
    HeldOutput output;
    ScriptedToolkit toolkit;

private:
    HV::InstallerModel model_;

protected:
    HV::WinWizardController wizard{toolkit, model_};

private:
    fs::path folder_ = fs::current_path();
};
