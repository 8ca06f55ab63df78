#include "tests/installer/WizardWalk.h"

#include <boost/date_time/posix_time/posix_time_types.hpp>
#include <chrono>
#include <thread>

#include "hvframework/FileUtils.h"

WizardWalk::WizardWalk() {
    HV::InstallerModel::Forget();
}

WizardWalk::~WizardWalk() {
    EndTheRun();
    if (wizard.job != nullptr) {
        // The engine holds its stash as long as it lives, which is otherwise the process's life.
        wizard.job->cli.reset();
    }
    // An install makes a folder of its machine the current one.
    fs::current_path(folder_);
    HV::InstallerModel::Forget();
}

void WizardWalk::HasHostsOf(const std::string& sampleMachine) {
    std::string text;
    ASSERT_EQ(HVL::FileUtils::ReadFileToString("Z:" HV_SAMPLE_MACHINES "/" + sampleMachine + ".reg", text), 0);
    machine.Loads(text);
}

void WizardWalk::Begin() {
    wizard.Initialize(10);
}

void WizardWalk::BeginAndEnd() {
    try {
        wizard.Initialize(10);
        ADD_FAILURE() << "the wizard goes on";
    } catch (const WizardEnded& end) {
        EXPECT_EQ(end.status, 0U);
    }
}

void WizardWalk::BeginAndAgree() {
    Begin();
    toolkit.Press(HV::kAgreeCommand);
}

void WizardWalk::GoToSelection() {
    BeginAndAgree();
    toolkit.Press(HV::kContinueCommand);
    ASSERT_EQ(wizard.state, HV::WizardState::Selection);
}

void WizardWalk::WaitForJob() {
    if (wizard.job == nullptr || wizard.job->thread == nullptr || !wizard.job->thread->joinable()) {
        return;
    }
    EXPECT_TRUE(wizard.job->thread->timed_join(boost::posix_time::minutes(1))) << log.Text();
}

void WizardWalk::TickToTheEnd() {
    try {
        toolkit.Tick(HV::kProgressTimer);
        ADD_FAILURE() << "the wizard goes on";
    } catch (const WizardEnded& end) {
        EXPECT_EQ(end.status, 0U);
    }
}

void WizardWalk::EndTheRun() {
    output.gate.LetGo();
    WaitForJob();
}

std::string WizardWalk::Argument(const std::string& key) {
    EndTheRun();
    return wizard.job->cli->GetArg(key);
}

std::vector<int> WizardWalk::InstallAndPoll() {
    using namespace std::chrono_literals;
    Install();
    std::vector<int> percents;
    const auto deadline = std::chrono::steady_clock::now() + 60s;
    while (wizard.state == HV::WizardState::Installing && std::chrono::steady_clock::now() < deadline) {
        toolkit.Tick(HV::kProgressTimer);
        percents.push_back(toolkit.Installing().percent);
        std::this_thread::sleep_for(2ms);
    }
    EXPECT_EQ(wizard.state, HV::WizardState::Finished) << log.Text();
    return percents;
}
