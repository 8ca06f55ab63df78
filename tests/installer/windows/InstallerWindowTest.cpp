#include "installer/windows/InstallerWindow.h"

#include <gtest/gtest.h>

#include <array>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "hvdeploy/src/DeployJob.h"
#include "installer/windows/WizardMetrics.h"
#include "tests/installer/windows/WindowTest.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"

namespace {

class InstallerWindowTest : public WindowTest {
protected:
    HV::InstallerWindow& Make() {
        window = toolkit.CreateInstallerWindow(controller, model, "Tessaly Suite Installer");
        return *window;
    }

    [[nodiscard]] RECT Frame() const {
        RECT frame{};
        ::GetWindowRect(*window, &frame);
        return frame;
    }

    Machine machine;
    HV::InstallerWindow* window = nullptr;  // lives until the process ends
};

TEST_F(InstallerWindowTest, HasItsSizeStyleAndCaption) {
    const HV::InstallerWindow& made = Make();
    EXPECT_EQ(Frame().right - Frame().left, 600);
    EXPECT_EQ(Frame().bottom - Frame().top, 430);
    // The system adds that siblings are spared, to every window with a caption.
    EXPECT_EQ(static_cast<DWORD>(::GetWindowLongW(made, GWL_STYLE)) & ~WS_CLIPSIBLINGS, 0x00C80000U);
    EXPECT_EQ(::GetWindow(made, GW_OWNER), nullptr);
    std::array<wchar_t, 64> caption{};
    ::GetWindowTextW(made, caption.data(), static_cast<int>(caption.size()));
    EXPECT_EQ(std::wstring(caption.data()), L"Tessaly Suite Installer");
}

TEST_F(InstallerWindowTest, IsHiddenAndCentredAtFirst) {
    EXPECT_EQ(::IsWindowVisible(Make()), FALSE);
    RECT area{};
    ::SystemParametersInfoW(SPI_GETWORKAREA, 0, &area, 0);
    EXPECT_EQ(Frame().left - area.left, (area.right - area.left - 600) / 2);
    EXPECT_EQ(Frame().top - area.top, (area.bottom - area.top - 430) / 2);
}

TEST_F(InstallerWindowTest, HasASmallIconAndABigOne) {
    EXPECT_NE(::GetClassLongPtrW(Make(), GCLP_HICONSM), 0U);
    EXPECT_NE(::GetClassLongPtrW(*window, GCLP_HICON), 0U);
}

TEST_F(InstallerWindowTest, HasThreeButtonsAlongTheBottom) {
    EXPECT_EQ(ControlsOf(Make()), (std::vector<Control>{
                                      {HV::kContinueCommand, L"Button", L"Continue", {495, 358, 575, 383}, 0x5801000B},
                                      {HV::kBackCommand, L"Button", L"Back", {405, 358, 485, 383}, 0x5801000B},
                                      {HV::kCancelCommand, L"Button", L"Cancel", {195, 358, 275, 383}, 0x5001000B},
                                  }));
}

TEST_F(InstallerWindowTest, PutsTheFinalButtonsInTheirPlace) {
    Make().ShowFinalButtons();
    EXPECT_EQ(ControlsOf(*window),
              (std::vector<Control>{
                  {HV::kContinueCommand, L"Button", L"Continue", {495, 358, 575, 383}, 0x4801000B},
                  {HV::kBackCommand, L"Button", L"Back", {405, 358, 485, 383}, 0x4801000B},
                  {HV::kCancelCommand, L"Button", L"Cancel", {195, 358, 275, 383}, 0x4001000B},
                  {HV::kWhatsNewCommand, L"Button", L"What's New...", {145, 358, 275, 383}, 0x5001000B},
                  {HV::kResourcesCommand, L"Button", L"Resources...", {280, 358, 410, 383}, 0x5001000B},
                  {HV::kCloseCommand, L"Button", L"Close", {645, 358, 775, 383}, 0x5001000B},
              }));
}

TEST_F(InstallerWindowTest, GivesEveryButtonTheBodyFont) {
    Make().ShowFinalButtons();
    int buttons = 0;
    for (const Control& control : ControlsOf(*window)) {
        EXPECT_EQ(FontOf(::GetDlgItem(*window, control.identifier)), HV::WizardMetrics::Instance().BodyFont);
        ++buttons;
    }
    EXPECT_EQ(buttons, 6);
}

TEST_F(InstallerWindowTest, KnowsItsButtonsByTheirIdentifiers) {
    HV::InstallerWindow& made = Make();
    EXPECT_EQ(made.ButtonForId(HV::kContinueCommand), &made.continueButton);
    EXPECT_EQ(made.ButtonForId(HV::kBackCommand), &made.backButton);
    EXPECT_EQ(made.ButtonForId(HV::kCancelCommand), &made.cancelButton);
    EXPECT_EQ(made.ButtonForId(HV::kWhatsNewCommand), &made.whatsNewButton);
    EXPECT_EQ(made.ButtonForId(HV::kResourcesCommand), &made.resourcesButton);
    EXPECT_EQ(made.ButtonForId(HV::kCloseCommand), &made.closeButton);
    EXPECT_EQ(made.ButtonForId(HV::kReadLicenseCommand), nullptr);
    EXPECT_EQ(made.ButtonForId(0), nullptr);
}

TEST_F(InstallerWindowTest, DrawsItsButtonsOnTheColourOfTheStrip) {
    HV::InstallerWindow& made = Make();
    made.ShowFinalButtons();
    const std::set<HV::CustomButtonOwner*> owners{made.continueButton.owner, made.backButton.owner,
                                                  made.cancelButton.owner,   made.closeButton.owner,
                                                  made.whatsNewButton.owner, made.resourcesButton.owner};
    ASSERT_EQ(owners.size(), 1U);
    Gdiplus::Color color;
    static_cast<Gdiplus::SolidBrush*>((*owners.begin())->BackgroundBrush())->GetColor(&color);
    EXPECT_EQ(color.GetValue(), 0xFF222222U);
}

TEST_F(InstallerWindowTest, FillsThePageAndTheStrip) {
    Make();
    RECT client{};
    ::GetClientRect(*window, &client);
    Canvas canvas(static_cast<int>(client.right), static_cast<int>(client.bottom));
    EXPECT_NE(::SendMessageW(*window, WM_ERASEBKGND, reinterpret_cast<WPARAM>(canvas.Device()), 0), 0);
    EXPECT_TRUE(canvas.IsFilled({0, 0, client.right, 350}, 0x1A1A1A));
    EXPECT_TRUE(canvas.IsFilled({0, 350, client.right, client.bottom}, 0x222222));
}

TEST_F(InstallerWindowTest, HandsItsButtonsToTheController) {
    Make();
    Press(*window, HV::kCancelCommand);
    Press(*window, HV::kCloseCommand);
    EXPECT_EQ(toolkit.quits, (std::vector<int>{0, 0}));
}

TEST_F(InstallerWindowTest, HandsOverNothingElse) {
    Make();
    Press(*window, HV::kDisagreeCommand);
    Press(*window, IDCANCEL);
    Press(*window, IDOK);
    Press(*window, HV::kCancelCommand, BN_SETFOCUS);
    Press(*window, HV::kCancelCommand, BN_DOUBLECLICKED);
    EXPECT_EQ(toolkit.quits, std::vector<int>{});
}

TEST_F(InstallerWindowTest, EndsTheLoopWhenItIsClosed) {
    const HWND made = Make();
    ::SendMessageW(made, WM_CLOSE, 0, 0);
    EXPECT_EQ(::IsWindow(made), FALSE);
    MSG message{};
    ASSERT_NE(::PeekMessageW(&message, nullptr, WM_QUIT, WM_QUIT, PM_REMOVE), FALSE);
    EXPECT_EQ(message.wParam, 0U);
}

TEST_F(InstallerWindowTest, RaisesNoCancelWhenItIsClosedDuringAnInstall) {
    HV::DeployJob job("");
    job.cli = std::make_unique<HV::DeployCLI>(&job);
    controller.job = &job;
    controller.state = HV::WizardState::Installing;
    const LogRecorder log;
    const std::string cancelLine = "CRIT hvdeploy-detail: Cancel invoked";
    Make();
    ::SendMessageW(*window, WM_SYSCOMMAND, SC_CLOSE, 0);
    EXPECT_EQ(::IsWindow(*window), FALSE);
    EXPECT_FALSE(log.Has(cancelLine));
    // The button would have raised it.
    controller.Perform(HV::kCancelCommand);
    EXPECT_TRUE(log.Has(cancelLine));
    controller.job = nullptr;
}

TEST_F(InstallerWindowTest, GrowsTo800InFourStepsOfTheTimer) {
    Make();
    ::SetTimer(*window, HV::kGrowTimer, 60000, nullptr);
    const RECT before = Frame();
    std::vector<long> widths;
    for (int step = 0; step < 4; ++step) {
        ::SendMessageW(*window, WM_TIMER, HV::kGrowTimer, 0);
        widths.push_back(Frame().right - Frame().left);
        EXPECT_EQ(before.left - Frame().left, Frame().right - before.right) << "in step " << step;
    }
    EXPECT_EQ(widths, (std::vector<long>{650, 700, 750, 800}));
    EXPECT_EQ(Frame().top, before.top);
    EXPECT_EQ(Frame().bottom, before.bottom);
    // The timer has ended with the last step.
    EXPECT_EQ(::KillTimer(*window, HV::kGrowTimer), FALSE);
}

TEST_F(InstallerWindowTest, KeepsTheTimerUntilTheLastStep) {
    Make();
    ::SetTimer(*window, HV::kGrowTimer, 60000, nullptr);
    for (int step = 0; step < 3; ++step) {
        ::SendMessageW(*window, WM_TIMER, HV::kGrowTimer, 0);
    }
    EXPECT_NE(::KillTimer(*window, HV::kGrowTimer), FALSE);
}

TEST_F(InstallerWindowTest, HandsTheProgressTimerToTheController) {
    Make();
    ::SetTimer(*window, HV::kProgressTimer, 60000, nullptr);
    controller.window = window;
    // Without an install the controller ends the timer.
    ::SendMessageW(*window, WM_TIMER, HV::kProgressTimer, 0);
    EXPECT_EQ(::KillTimer(*window, HV::kProgressTimer), FALSE);
}

}  // namespace
