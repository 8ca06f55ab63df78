#include "installer/windows/WindowsToolkit.h"

#include <cstdio>
#include <cstdlib>
#include <stdexcept>

#include "installer/windows/EULAWindowController.h"
#include "installer/windows/FinalPage.h"
#include "installer/windows/InstallerWindow.h"
#include "installer/windows/InstallingPage.h"
#include "installer/windows/SelectionPage.h"
#include "installer/windows/WelcomePage.h"
#include "installer/windows/WizardMetrics.h"
#include "platform/utf8.h"

namespace HV {

namespace {

constexpr DWORD kPageStyle = 0x50000000;  // child, visible

// Lets the Tab key reach what is on a page; it changes nothing that is seen.
constexpr DWORD kPageExtendedStyle = WS_EX_CONTROLPARENT;

// The final page covers this many rows more than its picture.
constexpr LONG kRowsBelowPicture = 4;

void Require(bool made) {
    if (!made) {
        throw std::runtime_error("the system refuses a window of the wizard");
    }
}

template <class Page>
Page* PutInto(const InstallerWindow& window, std::unique_ptr<Page> page, const RECT& place) {
    Require(page->Create(window, place, "", kPageStyle, kPageExtendedStyle) != nullptr);
    // Tab goes through the windows from the top one down: the page first, then the buttons of the bottom strip.
    ::SetWindowPos(*page, HWND_TOP, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE | SWP_NOACTIVATE);
    return page.release();
}

HWND HandleOfWindow(const ATL::CWindow* window) {
    return window == nullptr ? nullptr : window->m_hWnd;
}

}  // namespace

InstallerWindow* WindowsToolkit::CreateInstallerWindow(WinWizardController& controller, const InstallerModel& model,
                                                       const std::string& caption) {
    auto window = std::make_unique<InstallerWindow>(controller, model);
    Require(window->CreateCentered(caption));
    window_ = window.release();
    return window_;
}

WelcomePage* WindowsToolkit::CreateWelcomePage(WinWizardController& controller, const InstallerModel& model,
                                               InstallerWindow& window) {
    welcomePage_ = PutInto(window, std::make_unique<WelcomePage>(controller, model), WizardMetrics::PageRect);
    return welcomePage_;
}

SelectionPage* WindowsToolkit::CreateSelectionPage(WinWizardController& controller, InstallerWindow& window,
                                                   const std::vector<ProductItem>& items) {
    auto page = std::make_unique<SelectionPage>(controller);
    for (const ProductItem& item : items) {
        page->AddItem(item);
    }
    selectionPage_ = PutInto(window, std::move(page), WizardMetrics::PageRect);
    return selectionPage_;
}

InstallingPage* WindowsToolkit::CreateInstallingPage(WinWizardController& controller, const InstallerModel& model,
                                                     InstallerWindow& window, const std::string& status, int percent) {
    installingPage_ =
        PutInto(window, std::make_unique<InstallingPage>(controller, model, status, percent), WizardMetrics::PageRect);
    return installingPage_;
}

FinalPage* WindowsToolkit::CreateFinalPage(WinWizardController& controller, InstallerWindow& window) {
    RECT place = WizardMetrics::FinalRect;
    place.bottom += kRowsBelowPicture;
    finalPage_ = PutInto(window, std::make_unique<FinalPage>(controller), place);
    return finalPage_;
}

EULAWindowController* WindowsToolkit::CreateEULAWindowController() {
    return new EULAWindowController;
}

void WindowsToolkit::ShowAgreement(EULAWindowController& viewers) {
    viewers.ShowAgreement();
}

int WindowsToolkit::CheckedCount(const SelectionPage& page) const {
    return page.CheckedCount();
}

std::vector<std::string> WindowsToolkit::UncheckedIdentifiers(const SelectionPage& page) const {
    return page.UncheckedIdentifiers();
}

int WindowsToolkit::Percent(const InstallingPage& page) const {
    return page.Percent();
}

std::string WindowsToolkit::StatusText(const InstallingPage& page) const {
    return page.StatusText();
}

void WindowsToolkit::SetPercent(InstallingPage& page, int percent) {
    page.SetPercent(percent);
}

void WindowsToolkit::SetStatusText(InstallingPage& page, const std::string& text) {
    page.SetStatusText(text);
}

void WindowsToolkit::SetContinueText(InstallerWindow& window, const std::string& text) {
    window.continueButton.SetText(text);
}

void WindowsToolkit::SetContinueHighlighted(InstallerWindow& window, bool highlighted) {
    window.continueButton.SetHighlighted(highlighted);
}

void WindowsToolkit::ShowFinalButtons(InstallerWindow& window) {
    window.ShowFinalButtons();
    KeepFocusUsable();
}

void WindowsToolkit::ShowWindow(WizardPart part, int command) {
    ::ShowWindow(HandleOf(part), command);
    KeepFocusUsable();
}

void WindowsToolkit::EnableWindow(WizardPart part, bool enabled) {
    ::EnableWindow(HandleOf(part), enabled ? TRUE : FALSE);
    KeepFocusUsable();
}

void WindowsToolkit::RedrawWindow(WizardPart part) {
    ::SendMessageW(HandleOf(part), WM_SETREDRAW, TRUE, 0);
}

HWND WindowsToolkit::HandleOf(WizardPart part) const {
    switch (part) {
        case WizardPart::MainWindow:
            return HandleOfWindow(window_);
        case WizardPart::WelcomePage:
            return HandleOfWindow(welcomePage_);
        case WizardPart::SelectionPage:
            return HandleOfWindow(selectionPage_);
        case WizardPart::InstallingPage:
            return HandleOfWindow(installingPage_);
        case WizardPart::FinalPage:
            return HandleOfWindow(finalPage_);
        case WizardPart::ContinueButton:
            return window_ == nullptr ? nullptr : window_->continueButton.handle;
        case WizardPart::BackButton:
            return window_ == nullptr ? nullptr : window_->backButton.handle;
        case WizardPart::AgreeButton:
            return welcomePage_ == nullptr ? nullptr : welcomePage_->agreeButton.handle;
        case WizardPart::DisagreeButton:
            return welcomePage_ == nullptr ? nullptr : welcomePage_->disagreeButton.handle;
    }
    return nullptr;
}

// A control that is hidden or disabled while it has the focus keeps the keyboard to itself, or the keyboard is lost.
void WindowsToolkit::KeepFocusUsable() const {
    if (window_ == nullptr || ::GetActiveWindow() != *window_) {
        return;
    }
    const HWND focus = ::GetFocus();
    if (focus == nullptr || ::IsWindowVisible(focus) == FALSE || ::IsWindowEnabled(focus) == FALSE) {
        ::SetFocus(*window_);
    }
}

void WindowsToolkit::MessageBeep(unsigned type) {
    ::MessageBeep(type);
}

int WindowsToolkit::MessageBoxA(InstallerWindow* owner, const std::string& text, const std::string& title,
                                unsigned type) {
    return ::MessageBoxW(HandleOfWindow(owner), platform::WideFromUtf8(text).c_str(),
                         platform::WideFromUtf8(title).c_str(), type);
}

void WindowsToolkit::SetTimer(InstallerWindow& window, unsigned timer, unsigned milliseconds) {
    ::SetTimer(window, timer, milliseconds, nullptr);
}

void WindowsToolkit::KillTimer(InstallerWindow& window, unsigned timer) {
    ::KillTimer(window, timer);
}

void WindowsToolkit::ShellExecuteA(InstallerWindow& owner, const std::string& url) {
    ::ShellExecuteA(owner, "open", url.c_str(), nullptr, nullptr, SW_SHOWNORMAL);
}

void WindowsToolkit::PostQuitMessage(int status) {
    ::PostQuitMessage(status);
}

void WindowsToolkit::ExitProcess(unsigned status) {
    EndProcess(status);
}

void EndProcess(unsigned status) {
    // An engine may be at work on its thread, which nothing waits for. An orderly end would tear down what that thread
    // uses while it runs, or wait for a lock that it holds until a script has ended. So the process ends here and now.
    // Nothing but these two streams holds anything back.
    std::fflush(stdout);
    std::fflush(stderr);
    ::TerminateProcess(::GetCurrentProcess(), status);
    std::abort();
}

}  // namespace HV
