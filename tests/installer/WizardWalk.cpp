#include "tests/installer/WizardWalk.h"

#include <chrono>
#include <future>
#include <thread>
#include <utility>

#include "hvframework/FileUtils.h"

WizardWalk::WizardWalk(HV::Release release) : model_(std::move(release)) {}

WizardWalk::~WizardWalk() {
    EndTheRun();
    if (wizard.job != nullptr) {
        // The engine holds its stash as long as it lives, which is otherwise the process's life.
        wizard.job->cli.reset();
    }
    // An install makes a folder of its machine the current one.
    fs::current_path(folder_);
}

void WizardWalk::HasHostsOf(const std::string& sampleMachine) {
    std::string text;
    ASSERT_EQ(HVL::FileUtils::ReadFileToString("Z:" HV_SAMPLE_MACHINES "/" + sampleMachine + ".reg", text), 0);
    machine.Loads(text);
}

HV::InstallerModel& WizardWalk::Model() {
    if (!model_.loaded) {
        model_.Load();
    }
    return model_;
}

void WizardWalk::Start(int showCommand) {
    (void)Model();
    wizard.Initialize(showCommand);
}

void WizardWalk::Begin() {
    Start(10);
}

void WizardWalk::BeginAndEnd() {
    try {
        Begin();
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
    const std::future<void> end = std::async(std::launch::async, [this] { wizard.job->thread->join(); });
    EXPECT_EQ(end.wait_for(std::chrono::minutes(1)), std::future_status::ready) << log.Text();
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
