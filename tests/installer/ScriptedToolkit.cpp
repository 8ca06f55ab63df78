#include "tests/installer/ScriptedToolkit.h"

#include <gtest/gtest.h>

#include <algorithm>

#include "installer/WinWizardController.h"

namespace {

using HV::WizardPart;

constexpr std::size_t kCheckBoxes = 12;

const char* NameOf(WizardPart part) {
    switch (part) {
        case WizardPart::MainWindow:
            return "MainWindow";
        case WizardPart::WelcomePage:
            return "WelcomePage";
        case WizardPart::SelectionPage:
            return "SelectionPage";
        case WizardPart::InstallingPage:
            return "InstallingPage";
        case WizardPart::FinalPage:
            return "FinalPage";
        case WizardPart::ContinueButton:
            return "ContinueButton";
        case WizardPart::BackButton:
            return "BackButton";
        case WizardPart::AgreeButton:
            return "AgreeButton";
        case WizardPart::DisagreeButton:
            return "DisagreeButton";
    }
    return "nothing";
}

std::string NameOfCommand(int command) {
    switch (command) {
        case HV::kContinueCommand:
            return "Continue";
        case HV::kBackCommand:
            return "Back";
        case HV::kCancelCommand:
            return "Cancel";
        case HV::kReadLicenseCommand:
            return "Read License";
        case HV::kAgreeCommand:
            return "Agree";
        case HV::kDisagreeCommand:
            return "Disagree";
        case HV::kWhatsNewCommand:
            return "What's New";
        case HV::kResourcesCommand:
            return "Resources";
        case HV::kCloseCommand:
            return "Close";
        default:
            return std::to_string(command);
    }
}

std::string NameOfTimer(unsigned timer) {
    return timer == HV::kProgressTimer ? "Progress" : timer == HV::kGrowTimer ? "Grow" : std::to_string(timer);
}

std::string Quoted(const std::string& text) {
    return "\"" + text + "\"";
}

}  // namespace

std::ostream& operator<<(std::ostream& stream, const ShownBox& box) {
    stream << "[" << box.title << "] " << Quoted(box.text) << " type " << box.type;
    stream << (box.beep ? " beep " + std::to_string(*box.beep) : " no beep");
    return stream << (box.ownedByWindow ? ", owned" : ", without an owner");
}

ScriptedToolkit::ScriptedToolkit() = default;

ScriptedToolkit::~ScriptedToolkit() {
    EXPECT_TRUE(answers_.empty()) << answers_.size() << " answers to boxes that never came";
}

void ScriptedToolkit::AnswerNext(int button, std::function<void()> meanwhile) {
    answers_.push_back({button, std::move(meanwhile)});
}

bool ScriptedToolkit::CanPress(int command) const {
    if (!IsVisible(WizardPart::MainWindow)) {
        return false;
    }
    const bool hasFinalButtons = window_->hasFinalButtons;
    const auto isUsable = [this](WizardPart button) { return IsVisible(WizardPart::WelcomePage) && IsEnabled(button); };
    switch (command) {
        case HV::kContinueCommand:
            return !hasFinalButtons && IsEnabled(WizardPart::ContinueButton);
        case HV::kBackCommand:
            return !hasFinalButtons && IsEnabled(WizardPart::BackButton);
        case HV::kCancelCommand:
            return !hasFinalButtons;
        case HV::kReadLicenseCommand:
            return IsVisible(WizardPart::WelcomePage);
        case HV::kAgreeCommand:
            return isUsable(WizardPart::AgreeButton);
        case HV::kDisagreeCommand:
            return isUsable(WizardPart::DisagreeButton);
        default:
            return hasFinalButtons;
    }
}

void ScriptedToolkit::Press(int command) {
    if (!CanPress(command)) {
        ADD_FAILURE() << NameOfCommand(command) << " cannot be pressed now";
        return;
    }
    Note("Press " + NameOfCommand(command));
    controller_->Perform(command);
}

void ScriptedToolkit::Toggle(const std::string& identifier) {
    auto& items = selectionPage_->items;
    const auto item = std::ranges::find(items, identifier, &HV::ProductItem::identifier);
    const auto row = static_cast<std::size_t>(item - items.begin());
    if (!IsVisible(WizardPart::SelectionPage) || row >= std::min(kCheckBoxes, items.size()) || !item->enabled) {
        ADD_FAILURE() << identifier << " cannot be clicked now";
        return;
    }
    item->checked = !item->checked;
}

void ScriptedToolkit::CheckAll(bool checked) {
    if (!IsVisible(WizardPart::SelectionPage)) {
        ADD_FAILURE() << "the selection page is not to be seen";
        return;
    }
    auto& items = selectionPage_->items;
    for (std::size_t row = 0; row < std::min(kCheckBoxes, items.size()); ++row) {
        items[row].checked = items[row].enabled ? checked : items[row].checked;
    }
}

void ScriptedToolkit::DeselectAll() {
    CheckAll(false);
}

void ScriptedToolkit::SelectAll() {
    CheckAll(true);
}

void ScriptedToolkit::Tick(unsigned timer) {
    if (!timers.contains(timer)) {
        ADD_FAILURE() << "the timer " << NameOfTimer(timer) << " does not run";
        return;
    }
    if (timer == HV::kProgressTimer) {
        controller_->OnProgressTimer();
    }
}

const ScriptedToolkit::Part& ScriptedToolkit::At(WizardPart part) const {
    static const Part none;
    const auto found = parts_.find(part);
    return found == parts_.end() ? none : found->second;
}

bool ScriptedToolkit::IsVisible(WizardPart part) const {
    return At(part).made && At(part).visible;
}

bool ScriptedToolkit::IsEnabled(WizardPart part) const {
    return At(part).made && At(part).enabled;
}

std::vector<WizardPart> ScriptedToolkit::VisiblePages() const {
    std::vector<WizardPart> pages;
    for (const WizardPart page :
         {WizardPart::WelcomePage, WizardPart::SelectionPage, WizardPart::InstallingPage, WizardPart::FinalPage}) {
        if (IsVisible(page)) {
            pages.push_back(page);
        }
    }
    return pages;
}

std::vector<std::string> ScriptedToolkit::BoxTitles() const {
    std::vector<std::string> titles;
    for (const ShownBox& box : boxes) {
        titles.push_back(box.title);
    }
    return titles;
}

std::vector<std::string> ScriptedToolkit::CallsFrom(const std::string& first) const {
    return {std::ranges::find(calls, first), calls.end()};
}

void ScriptedToolkit::Note(const std::string& call) {
    // A beep belongs to the box that comes right after it.
    beep_.reset();
    calls.push_back(call);
}

void ScriptedToolkit::Make(WizardPart part, bool enabled) {
    EXPECT_FALSE(At(part).made) << NameOf(part) << " is made twice";
    parts_[part] = {true, true, enabled};
}

void ScriptedToolkit::ExpectWindow(const HV::InstallerWindow& window) const {
    EXPECT_EQ(&window, window_.get());
}

HV::InstallerWindow* ScriptedToolkit::CreateInstallerWindow(HV::WinWizardController& controller,
                                                            const HV::InstallerModel& /*model*/,
                                                            const std::string& caption) {
    Note("CreateInstallerWindow " + Quoted(caption));
    controller_ = &controller;
    Make(WizardPart::MainWindow);
    parts_[WizardPart::MainWindow].visible = false;
    Make(WizardPart::ContinueButton, false);
    Make(WizardPart::BackButton, false);
    window_ = std::make_unique<HV::InstallerWindow>();
    window_->caption = caption;
    return window_.get();
}

HV::WelcomePage* ScriptedToolkit::CreateWelcomePage(HV::WinWizardController& controller,
                                                    const HV::InstallerModel& /*model*/, HV::InstallerWindow& window) {
    Note("CreateWelcomePage");
    EXPECT_EQ(&controller, controller_);
    ExpectWindow(window);
    Make(WizardPart::WelcomePage);
    Make(WizardPart::AgreeButton);
    Make(WizardPart::DisagreeButton);
    welcomePage_ = std::make_unique<HV::WelcomePage>();
    return welcomePage_.get();
}

HV::SelectionPage* ScriptedToolkit::CreateSelectionPage(HV::WinWizardController& controller,
                                                        HV::InstallerWindow& window,
                                                        const std::vector<HV::ProductItem>& items) {
    Note("CreateSelectionPage");
    EXPECT_EQ(&controller, controller_);
    ExpectWindow(window);
    Make(WizardPart::SelectionPage);
    selectionPage_ = std::make_unique<HV::SelectionPage>();
    selectionPage_->items = items;
    return selectionPage_.get();
}

HV::InstallingPage* ScriptedToolkit::CreateInstallingPage(HV::WinWizardController& controller,
                                                          const HV::InstallerModel& /*model*/,
                                                          HV::InstallerWindow& window, const std::string& status,
                                                          int percent) {
    Note("CreateInstallingPage " + Quoted(status) + " " + std::to_string(percent));
    EXPECT_EQ(&controller, controller_);
    ExpectWindow(window);
    Make(WizardPart::InstallingPage);
    installingPage_ = std::make_unique<HV::InstallingPage>();
    installingPage_->status = status;
    installingPage_->percent = percent;
    return installingPage_.get();
}

HV::FinalPage* ScriptedToolkit::CreateFinalPage(HV::WinWizardController& controller, HV::InstallerWindow& window) {
    Note("CreateFinalPage");
    EXPECT_EQ(&controller, controller_);
    ExpectWindow(window);
    Make(WizardPart::FinalPage);
    finalPage_ = std::make_unique<HV::FinalPage>();
    return finalPage_.get();
}

HV::EULAWindowController* ScriptedToolkit::CreateEULAWindowController() {
    Note("CreateEULAWindowController");
    EXPECT_EQ(viewers_, nullptr) << "there is one for all viewers";
    viewers_ = std::make_unique<HV::EULAWindowController>();
    return viewers_.get();
}

void ScriptedToolkit::ShowAgreement(HV::EULAWindowController& viewers) {
    Note("ShowAgreement");
    EXPECT_EQ(&viewers, viewers_.get());
    ++viewers.opened;
}

int ScriptedToolkit::CheckedCount(const HV::SelectionPage& page) const {
    return HV::CheckedCount(page.items);
}

std::vector<std::string> ScriptedToolkit::UncheckedIdentifiers(const HV::SelectionPage& page) const {
    return HV::UncheckedIdentifiers(page.items);
}

int ScriptedToolkit::Percent(const HV::InstallingPage& page) const {
    return page.percent;
}

std::string ScriptedToolkit::StatusText(const HV::InstallingPage& page) const {
    return page.status;
}

void ScriptedToolkit::SetPercent(HV::InstallingPage& page, int percent) {
    Note("SetPercent " + std::to_string(percent));
    page.percent = percent;
}

void ScriptedToolkit::SetStatusText(HV::InstallingPage& page, const std::string& text) {
    Note("SetStatusText " + Quoted(text));
    page.status = text;
}

void ScriptedToolkit::SetContinueText(HV::InstallerWindow& window, const std::string& text) {
    Note("SetContinueText " + Quoted(text));
    ExpectWindow(window);
    window.continueText = text;
}

void ScriptedToolkit::SetContinueHighlighted(HV::InstallerWindow& window, bool highlighted) {
    Note(std::string("SetContinueHighlighted ") + (highlighted ? "true" : "false"));
    ExpectWindow(window);
    window.continueHighlighted = highlighted;
}

void ScriptedToolkit::ShowFinalButtons(HV::InstallerWindow& window) {
    Note("ShowFinalButtons");
    ExpectWindow(window);
    window.hasFinalButtons = true;
}

void ScriptedToolkit::ShowWindow(WizardPart part, int command) {
    Note(std::string("ShowWindow ") + NameOf(part) + " " + std::to_string(command));
    parts_[part].visible = command != 0;
}

void ScriptedToolkit::EnableWindow(WizardPart part, bool enabled) {
    Note(std::string("EnableWindow ") + NameOf(part) + (enabled ? " true" : " false"));
    parts_[part].enabled = enabled;
}

void ScriptedToolkit::RedrawWindow(WizardPart part) {
    Note(std::string("RedrawWindow ") + NameOf(part));
}

void ScriptedToolkit::MessageBeep(unsigned type) {
    Note("MessageBeep " + std::to_string(type));
    beep_ = type;
}

int ScriptedToolkit::MessageBoxA(HV::InstallerWindow* owner, const std::string& text, const std::string& title,
                                 unsigned type) {
    boxes.push_back({title, text, beep_, type, owner != nullptr});
    Note("MessageBoxA " + Quoted(title));
    if (owner != nullptr) {
        ExpectWindow(*owner);
    }
    if (answers_.empty()) {
        ADD_FAILURE() << "nobody expects this box: " << boxes.back();
        return 0;
    }
    const Answer answer = answers_.front();
    answers_.pop_front();
    if (answer.meanwhile) {
        answer.meanwhile();
    }
    return answer.button;
}

void ScriptedToolkit::SetTimer(HV::InstallerWindow& window, unsigned timer, unsigned milliseconds) {
    Note("SetTimer " + NameOfTimer(timer) + " " + std::to_string(milliseconds));
    ExpectWindow(window);
    timers[timer] = milliseconds;
}

void ScriptedToolkit::KillTimer(HV::InstallerWindow& window, unsigned timer) {
    Note("KillTimer " + NameOfTimer(timer));
    ExpectWindow(window);
    timers.erase(timer);
}

void ScriptedToolkit::ShellExecuteA(HV::InstallerWindow& owner, const std::string& url) {
    Note("ShellExecuteA " + Quoted(url));
    ExpectWindow(owner);
    urls.push_back(url);
}

void ScriptedToolkit::PostQuitMessage(int status) {
    Note("PostQuitMessage " + std::to_string(status));
    quits.push_back(status);
}

void ScriptedToolkit::ExitProcess(unsigned status) {
    Note("ExitProcess " + std::to_string(status));
    exits.push_back(status);
    throw WizardEnded{status};
}
