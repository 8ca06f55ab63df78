#include "installer/windows/SelectionPage.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "installer/windows/WizardMetrics.h"
#include "tests/installer/windows/WindowTest.h"

namespace {

using HV::SelectionPage;
using Names = std::vector<std::string>;

constexpr RECT kPage{170, 37, 580, 345};

class SelectionPageTest : public WindowTest {
protected:
    // Products named by their numbers, checked and enabled.
    void Make(int products) {
        for (int number = 0; number < products; ++number) {
            page.AddItem({"Product " + std::to_string(number), std::to_string(number), true, true});
        }
        ASSERT_NE(page.Create(Parent(), kPage, "", WS_CHILD | WS_VISIBLE), nullptr);
    }

    // The second of three products lacks its hosts.
    void MakeWithADisabledOne() {
        page.AddItem({"Glow", "glow", true, true});
        page.AddItem({"Keyer", "keyer", false, false});
        page.AddItem({"Viewer", "viewer", true, true});
        ASSERT_NE(page.Create(Parent(), kPage, "", WS_CHILD | WS_VISIBLE), nullptr);
    }

    [[nodiscard]] bool NeedsPainting(int identifier) const {
        return ::GetUpdateRect(::GetDlgItem(page, identifier), nullptr, FALSE) != FALSE;
    }

    // What stands on the screen follows the choice.
    void ExpectBoxesToShowTheChoice() const {
        std::size_t index = 0;
        for (const HV::ProductCheckButton& box : page.CheckButtons()) {
            EXPECT_EQ(box.checked, page.Items().at(index).checked) << index;
            ++index;
        }
        EXPECT_GT(index, 0U);
    }

    SelectionPage page{controller};
};

TEST_F(SelectionPageTest, HasTwoButtonsAndABoxForEachProduct) {
    EXPECT_EQ(HV::kDeselectAllControl, 1130);
    EXPECT_EQ(HV::kSelectAllControl, 1131);
    EXPECT_EQ(HV::kFirstCheckControl, 1144);
    EXPECT_EQ(HV::kLastCheckControl, 1164);
    MakeWithADisabledOne();
    EXPECT_EQ(ControlsOf(page), (std::vector<Control>{
                                    {HV::kDeselectAllControl, L"Button", L"Deselect All", {0, 30, 70, 55}, 0x5001000B},
                                    {HV::kSelectAllControl, L"Button", L"Select All", {80, 30, 150, 55}, 0x5001000B},
                                    {HV::kFirstCheckControl, L"Button", L"Glow", {10, 80, 195, 102}, 0x5001010B},
                                    {HV::kFirstCheckControl + 1, L"Button", L"Keyer", {10, 102, 195, 124}, 0x5801010B},
                                    {HV::kFirstCheckControl + 2, L"Button", L"Viewer", {10, 124, 195, 146}, 0x5001010B},
                                }));
}

TEST_F(SelectionPageTest, HasRoomForTwelveProducts) {
    Make(14);
    const std::vector<Control> controls = ControlsOf(page);
    ASSERT_EQ(controls.size(), 14U);  // two buttons, twelve boxes
    EXPECT_EQ(controls.back(),
              (Control{HV::kFirstCheckControl + 11, L"Button", L"Product 11", {196, 190, 381, 212}, 0x5001010B}));
    EXPECT_EQ(page.CheckButtons().size(), 12U);
}

TEST_F(SelectionPageTest, KeepsProductsWithoutABoxAsTheyCame) {
    Make(14);
    Press(page, HV::kDeselectAllControl);
    EXPECT_EQ(page.CheckedCount(), 2);
    EXPECT_EQ(page.UncheckedIdentifiers(), (Names{"0", "1", "2", "3", "4", "5", "6", "7", "8", "9", "10", "11"}));
}

TEST_F(SelectionPageTest, GivesEveryControlTheBodyFont) {
    MakeWithADisabledOne();
    int controls = 0;
    for (const Control& control : ControlsOf(page)) {
        EXPECT_EQ(FontOf(::GetDlgItem(page, control.identifier)), HV::WizardMetrics::Instance().BodyFont);
        ++controls;
    }
    EXPECT_EQ(controls, 5);
}

TEST_F(SelectionPageTest, DeselectsAllThatCanBeChosen) {
    MakeWithADisabledOne();
    Press(page, HV::kDeselectAllControl);
    EXPECT_EQ(page.CheckedCount(), 0);
    EXPECT_EQ(page.UncheckedIdentifiers(), (Names{"glow", "keyer", "viewer"}));
    ExpectBoxesToShowTheChoice();
}

TEST_F(SelectionPageTest, SelectsAllButWhatCannotBeChosen) {
    MakeWithADisabledOne();
    Press(page, HV::kDeselectAllControl);
    Press(page, HV::kSelectAllControl);
    EXPECT_EQ(page.CheckedCount(), 2);
    EXPECT_EQ(page.UncheckedIdentifiers(), Names{"keyer"});
    ExpectBoxesToShowTheChoice();
}

TEST_F(SelectionPageTest, LeavesADisabledProductThatCameCheckedAlone) {
    page.AddItem({"Glow", "glow", true, false});
    ASSERT_NE(page.Create(Parent(), kPage, "", WS_CHILD | WS_VISIBLE), nullptr);
    Press(page, HV::kDeselectAllControl);
    EXPECT_EQ(page.CheckedCount(), 1);
}

TEST_F(SelectionPageTest, TogglesAProduct) {
    MakeWithADisabledOne();
    Press(page, HV::kFirstCheckControl);
    EXPECT_EQ(page.UncheckedIdentifiers(), (Names{"glow", "keyer"}));
    ExpectBoxesToShowTheChoice();
    Press(page, HV::kFirstCheckControl);
    EXPECT_EQ(page.UncheckedIdentifiers(), Names{"keyer"});
}

TEST_F(SelectionPageTest, PaintsABoxThatWasToggled) {
    MakeWithADisabledOne();
    ::ValidateRect(::GetDlgItem(page, HV::kFirstCheckControl), nullptr);
    ASSERT_FALSE(NeedsPainting(HV::kFirstCheckControl));
    Press(page, HV::kFirstCheckControl);
    EXPECT_TRUE(NeedsPainting(HV::kFirstCheckControl));
}

TEST_F(SelectionPageTest, PaintsBoxesAtOnceWhenAllAreChanged) {
    MakeWithADisabledOne();
    ::InvalidateRect(::GetDlgItem(page, HV::kFirstCheckControl), nullptr, TRUE);
    Press(page, HV::kDeselectAllControl);
    EXPECT_FALSE(NeedsPainting(HV::kFirstCheckControl));
}

TEST_F(SelectionPageTest, TogglesABoxAtTheSecondQuickClickToo) {
    MakeWithADisabledOne();
    Press(page, HV::kFirstCheckControl);
    Press(page, HV::kFirstCheckControl, BN_DOUBLECLICKED);
    EXPECT_EQ(page.UncheckedIdentifiers(), Names{"keyer"});
}

TEST_F(SelectionPageTest, TakesTheSecondQuickClickOnAButtonForNoPress) {
    MakeWithADisabledOne();
    Press(page, HV::kDeselectAllControl, BN_DOUBLECLICKED);
    EXPECT_EQ(page.CheckedCount(), 2);
    Press(page, HV::kDeselectAllControl);
    Press(page, HV::kSelectAllControl, BN_DOUBLECLICKED);
    EXPECT_EQ(page.CheckedCount(), 0);
}

TEST_F(SelectionPageTest, DoesNothingWhenABoxOnlyGetsTheFocus) {
    MakeWithADisabledOne();
    Press(page, HV::kFirstCheckControl, BN_SETFOCUS);
    EXPECT_EQ(page.CheckedCount(), 2);
}

TEST_F(SelectionPageTest, IgnoresADisabledProduct) {
    MakeWithADisabledOne();
    Press(page, HV::kFirstCheckControl + 1);
    EXPECT_EQ(page.UncheckedIdentifiers(), Names{"keyer"});
}

TEST_F(SelectionPageTest, IgnoresBoxesThatDoNotExist) {
    Make(14);
    int pressed = 0;
    for (int identifier = HV::kFirstCheckControl + 12; identifier <= HV::kLastCheckControl + 1; ++identifier) {
        Press(page, identifier);
        EXPECT_EQ(page.CheckedCount(), 14) << identifier;
        ++pressed;
    }
    EXPECT_EQ(pressed, 10);
}

TEST_F(SelectionPageTest, CutsATooLongNameInTheControlAlone) {
    const std::string name(300, 'x');
    page.AddItem({name, "long", true, true});
    ASSERT_NE(page.Create(Parent(), kPage, "", WS_CHILD | WS_VISIBLE), nullptr);
    EXPECT_LE(ControlsOf(page).back().text.size(), 255U);
    EXPECT_EQ(page.CheckButtons().at(0).displayName, name);
}

TEST_F(SelectionPageTest, HasRoomForANameOf255UnitsInTheControl) {
    page.AddItem({std::string(255, 'x'), "long", true, true});
    ASSERT_NE(page.Create(Parent(), kPage, "", WS_CHILD | WS_VISIBLE), nullptr);
    EXPECT_EQ(ControlsOf(page).back().text, std::wstring(255, L'x'));
}

TEST_F(SelectionPageTest, GivesControlsTheirNamesFromUtf8) {
    page.AddItem({"Gl\xC3\xBChen", "glow", true, true});
    ASSERT_NE(page.Create(Parent(), kPage, "", WS_CHILD | WS_VISIBLE), nullptr);
    EXPECT_EQ(ControlsOf(page).back().text, L"Gl\u00FChen");
}

TEST_F(SelectionPageTest, LeavesItsBackgroundToTheWindowBehind) {
    Make(1);
    Canvas canvas(10, 10);
    EXPECT_NE(::SendMessageW(page, WM_ERASEBKGND, reinterpret_cast<WPARAM>(canvas.Device()), 0), 0);
    EXPECT_EQ(canvas.Count(0), 100);
}

TEST_F(SelectionPageTest, HasThePageColourAroundItsButtons) {
    auto* const brush = static_cast<Gdiplus::SolidBrush*>(page.BackgroundBrush());
    Gdiplus::Color color;
    brush->GetColor(&color);
    EXPECT_EQ(color.GetValue(), 0xFF1A1A1AU);
}

}  // namespace
