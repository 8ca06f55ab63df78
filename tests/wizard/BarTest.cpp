#include "installer/InstallerModel.h"
#include "installer/WinWizardController.h"
#include "installer/windows/InstallingPage.h"
#include "installer/windows/WindowSystem.h"
#include "installer/windows/WindowsToolkit.h"
#include "tests/support/Machine.h"
#include "tests/wizard/RunningWizard.h"

namespace {

/// The page of a running install by itself, on the screen, where a test can say how far it is.
class BarTest : public testing::Test {
protected:
    BarTest() {
        parent_ = CreateWindowExA(0, "STATIC", "", WS_POPUP | WS_VISIBLE, 100, 100, 600, 400, nullptr, nullptr, nullptr,
                                  nullptr);
        page.Create(parent_, {170, 37, 580, 345}, "", 0x50000000);
    }
    ~BarTest() override { DestroyWindow(parent_); }

    /// How many columns are filled, from the left; -1 while there is no bar of 390 by 12 in its place.
    [[nodiscard]] int Fill() const {
        const Picture picture = Picture::OfClient(page);
        int fill = 0;
        while (fill < 390 && picture.At(fill, 76) == look::Fill) {
            ++fill;
        }
        const bool isBar = picture.IsAll({0, 76, fill, 88}, look::Fill) &&
                           picture.IsAll({fill, 76, 390, 88}, look::Track) &&
                           picture.IsAll({0, 70, 410, 76}, look::Page) && picture.IsAll({0, 88, 410, 94}, look::Page) &&
                           picture.IsAll({390, 76, 410, 88}, look::Page);
        return isBar ? fill : -1;
    }

    /// Its window paints when this thread handles messages.
    static void HandleMessages() {
        MSG message;
        while (PeekMessageA(&message, nullptr, 0, 0, PM_REMOVE) != FALSE) {
            DispatchMessageA(&message);
        }
    }

    [[nodiscard]] testing::AssertionResult ComesToFill(int columns) const {
        int fill = -1;
        const bool came = Eventually([&] {
            HandleMessages();
            return (fill = Fill()) == columns;
        });
        return came ? testing::AssertionSuccess() : testing::AssertionFailure() << "it fills " << fill;
    }

    Machine machine;
    const HV::WindowSystem windows;
    HV::WindowsToolkit toolkit;
    HV::InstallerModel model{{}};
    HV::WinWizardController controller{toolkit, model};
    HV::InstallingPage page{controller, model, "Detecting host applications...", 0};

private:
    HWND parent_ = nullptr;
};

TEST_F(BarTest, FillsWholeColumnsAndNeverMoreThanItsTrack) {
    struct Case {
        int percent;
        int columns;
    };
    // In an order in which each one looks different from the one before.
    const Case cases[] = {{0, 0}, {1, 3}, {50, 195}, {33, 128}, {99, 386}, {100, 390}, {-1, 0}, {250, 390}, {0, 0}};
    int ran = 0;
    for (const Case& one : cases) {
        page.SetPercent(one.percent);
        EXPECT_TRUE(ComesToFill(one.columns)) << one.percent << " percent";
        ++ran;
    }
    EXPECT_EQ(ran, 9);
}

TEST_F(BarTest, ShowsTheStatusUnderneathAndWipesTheOneBefore) {
    for (const char* status : {"Installing a package with a rather long name...", "Done", ""}) {
        page.SetStatusText(status);
        const look::Mark words =
            look::Words(status, {1, 94, 370, 113}, look::Body, look::OneLine, look::Text, look::Page);
        EXPECT_TRUE(Eventually([&] {
            HandleMessages();
            return words.isIn(Picture::OfClient(page));
        })) << status;
    }
}

}  // namespace
