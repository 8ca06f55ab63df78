#include "tests/wizard/WizardTest.h"

namespace {

const std::string kTitle = "Tessaly Suite 4.2.0 Installer";

/// What the main window shows around every page but the last.
std::vector<look::Mark> Frame(HWND window) {
    RECT client{};
    GetClientRect(window, &client);
    return {look::Image(HV_RESOURCES "/banner.bmp", 0, 0),
            look::Words(kTitle, {170, 0, client.right, 28}, look::Title, look::AtTheBottom, look::Text, look::Page),
            look::Filled({160, 0, 170, 350}, look::Page),
            look::Filled({580, 28, client.right, 350}, look::Page),
            look::Filled({160, 345, client.right, 350}, look::Page),
            look::Filled({0, 350, client.right, 358}, look::Strip),
            look::Filled({0, 350, 195, client.bottom}, look::Strip),
            look::Filled({275, 350, 405, client.bottom}, look::Strip),
            look::Filled({575, 350, client.right, client.bottom}, look::Strip),
            look::Filled({0, 383, client.right, client.bottom}, look::Strip)};
}

std::vector<look::Mark> WelcomeTexts() {
    using namespace look;
    return {
        Words("This will install Tessaly Suite 4.2.0 on your computer.\r\nIt is recommended you close all other "
              "applications before continuing.",
              {0, 20, 410, 65}, Body, Wrapped, Text, look::Page),
        Words("System Requirements", {0, 85, 410, 100}, Strong, Wrapped, Text, look::Page),
        Words("Windows 10\r\nAfter Effects/Premiere Pro CC 2018+", {0, 100, 410, 150}, Body, Wrapped, Text, look::Page),
        Words("To continue with the install you must agree \rto the terms of the software license agreement.",
              {0, 170, 410, 200}, Strong, Wrapped, Text, look::Page),
        Words("Click Agree to continue or Disagree to cancel \rand quit the installation.", {0, 215, 410, 245}, Body,
              Wrapped, Text, look::Page)};
}

using WelcomeTest = WizardTest;

TEST_F(WelcomeTest, StandsInTheMiddleOfTheScreenAndCannotBeResized) {
    HasEveryHost();
    RunningWizard wizard(folder);
    const HWND window = wizard.Window();

    RECT work{};
    SystemParametersInfoA(SPI_GETWORKAREA, 0, &work, 0);
    const RECT part = OnScreen(window);
    EXPECT_EQ(part.right - part.left, 600);
    EXPECT_EQ(part.bottom - part.top, 430);
    EXPECT_EQ(part.left, (work.left + work.right - 600) / 2);
    EXPECT_EQ(part.top, (work.top + work.bottom - 430) / 2);
    // The system itself adds the visible and the clipping style to a window with a caption.
    EXPECT_EQ(GetWindowLongA(window, GWL_STYLE) & ~(WS_VISIBLE | WS_CLIPSIBLINGS), 0x00C80000);
    EXPECT_EQ(GetWindow(window, GW_OWNER), nullptr);
    EXPECT_EQ(TextOf(window), "Tessaly Suite Installer");
    EXPECT_EQ(ClassOf(window).rfind("ATL:", 0), 0U) << ClassOf(window);
    EXPECT_EQ(GetClassLongA(window, GCL_STYLE), 0x0BU);
}

TEST_F(WelcomeTest, ShowsItsTextsAndButtonsInTheirPlaces) {
    HasEveryHost();
    RunningWizard wizard(folder);
    const HWND window = wizard.Window();
    const HWND page = wizard.PageWith(id::Agree);

    EXPECT_EQ(InParent(page), (RECT{170, 37, 580, 345}));
    EXPECT_EQ(GetWindowLongA(page, GWL_STYLE) & ~WS_CLIPSIBLINGS, 0x50000000);
    ExpectControls(window, {{id::Continue, {495, 358, 575, 383}, 0x5801000B, true, false},
                            {id::Back, {405, 358, 485, 383}, 0x5801000B, true, false},
                            {id::Cancel, {195, 358, 275, 383}, 0x5001000B, true, true}});
    ExpectControls(page, {{id::ReadLicense, {0, 271, 100, 296}, 0x5001000B, true, true},
                          {id::Disagree, {240, 271, 310, 296}, 0x5001000B, true, true},
                          {id::Agree, {320, 271, 390, 296}, 0x5001000B, true, true}});

    EXPECT_TRUE(wizard.Shows(window, Frame(window)));
    EXPECT_TRUE(wizard.Shows(window, {look::Button("Continue", {495, 358, 575, 383}, look::DisabledFace, look::Strip),
                                      look::Button("Back", {405, 358, 485, 383}, look::DisabledFace, look::Strip),
                                      look::Button("Cancel", {195, 358, 275, 383}, look::Face, look::Strip)}));
    EXPECT_TRUE(wizard.Shows(page, WelcomeTexts()));
    EXPECT_TRUE(wizard.Shows(page, {look::Button("Read License...", {0, 271, 100, 296}, look::Face, look::Page),
                                    look::Button("Disagree", {240, 271, 310, 296}, look::Face, look::Page),
                                    look::Button("Agree", {320, 271, 390, 296}, look::Face, look::Page)}));
    KeepPicture("welcome", window);
}

TEST_F(WelcomeTest, LightsContinueOnlyOnceTheUserAgrees) {
    HasEveryHost();
    RunningWizard wizard(folder);
    const HWND window = wizard.Window();
    const HWND page = wizard.PageWith(id::Agree);

    wizard.Press(page, id::ReadLicense);
    EXPECT_TRUE(Eventually([&] { return wizard.Viewers().size() == 1; }));
    EXPECT_FALSE(IsWindowEnabled(GetDlgItem(window, id::Continue)));
    RunningWizard::CloseFromTitleBar(wizard.Viewers().front());
    EXPECT_TRUE(Eventually([&] { return wizard.Viewers().empty(); }));

    wizard.Press(page, id::Agree);
    EXPECT_TRUE(IsWindowEnabled(GetDlgItem(window, id::Continue)));
    EXPECT_FALSE(IsWindowEnabled(GetDlgItem(page, id::Agree)));
    EXPECT_FALSE(IsWindowEnabled(GetDlgItem(page, id::Disagree)));
    EXPECT_TRUE(IsWindowEnabled(GetDlgItem(page, id::ReadLicense)));
    EXPECT_TRUE(wizard.Shows(window, {look::Button("Continue", {495, 358, 575, 383}, look::Highlight, look::Strip)}));
    EXPECT_TRUE(wizard.Shows(page, {look::Button("Disagree", {240, 271, 310, 296}, look::DisabledFace, look::Page),
                                    look::Button("Agree", {320, 271, 390, 296}, look::DisabledFace, look::Page)}));
    KeepPicture("agreed", window);
}

TEST_F(WelcomeTest, PaintsItselfAgainWhereAnotherWindowHasLain) {
    HasEveryHost();
    RunningWizard wizard(folder);
    const HWND window = wizard.Window();
    EXPECT_TRUE(wizard.Shows(window, Frame(window)));
    const RECT part = OnScreen(window);
    const HWND over = CreateWindowExA(WS_EX_TOPMOST, "STATIC", "", WS_POPUP | WS_VISIBLE, part.left, part.top, 500, 420,
                                      nullptr, nullptr, nullptr, nullptr);
    UpdateWindow(over);
    EXPECT_TRUE(Eventually([&] { return Picture::OfClient(window).At(165, 100) != look::Page; }));
    DestroyWindow(over);
    EXPECT_TRUE(wizard.Shows(window, Frame(window)));
    EXPECT_TRUE(wizard.Shows(wizard.Page(), WelcomeTexts()));
}

TEST_F(WelcomeTest, GrowsByFiftyAStepAndStopsAtItsWidth) {
    HasEveryHost();
    RunningWizard wizard(folder);
    const HWND window = wizard.Window();
    const RECT start = OnScreen(window);
    int steps = 0;
    for (const int width : {650, 700, 750, 800, 800}) {
        SendMessageA(window, WM_TIMER, id::GrowTimer, 0);
        const RECT now = OnScreen(window);
        const LONG onEachSide = (width - 600) / 2;
        EXPECT_EQ(now, (RECT{start.left - onEachSide, start.top, start.right + onEachSide, start.bottom})) << width;
        ++steps;
    }
    EXPECT_EQ(steps, 5);
}

}  // namespace
