#include <gtest/gtest.h>

#include "installer/windows/Painting.h"
#include "installer/windows/SelectionPage.h"
#include "installer/windows/WizardMetrics.h"
#include "tests/installer/windows/WindowTest.h"

namespace {

using HV::WizardMetrics;

constexpr int kWidth = 185;
constexpr int kHeight = 22;
constexpr RECT kPlace{0, 0, kWidth, kHeight};
constexpr int kPictureWidth = 17;
constexpr int kPictureHeight = 16;
constexpr int kPictureTop = 4;
constexpr int kLabelLeft = 24;

class CheckButtonTest : public WindowTest {
protected:
    CheckButtonTest() {
        button.displayName = "Tessaly Glow";
        button.background = WizardMetrics::Instance().PageBrush;
        button.handle = HV::MakeButtonControl(Parent(), L"Tessaly Glow", HV::kFirstCheckControl, kPlace, 0x5001010B);
    }

    void Draw(UINT state = 0) { HV::DrawCheckButton(button, DrawRequest(canvas, button.handle, kPlace, state)); }

    // Whether the picture of this number stands where the box is.
    [[nodiscard]] bool Shows(int number) const {
        Canvas picture(kPictureWidth, kPictureHeight);
        HV::DrawBitmap(picture.Device(), HV::LoadOwnBitmap(number), 0, 0);
        int equal = 0;
        for (int y = 0; y < kPictureHeight; ++y) {
            for (int x = 0; x < kPictureWidth; ++x) {
                equal += picture.At(x, y) == canvas.At(x, y + kPictureTop) ? 1 : 0;
            }
        }
        return equal == kPictureWidth * kPictureHeight;
    }

    Canvas canvas{kWidth, kHeight};
    HV::ProductCheckButton button;
};

TEST_F(CheckButtonTest, ShowsAnEmptyBoxWhenItIsUnchecked) {
    Draw();
    EXPECT_TRUE(Shows(130));
    EXPECT_FALSE(Shows(131));
}

TEST_F(CheckButtonTest, ShowsACheckedBoxByItsRecord) {
    button.checked = true;
    Draw();
    EXPECT_TRUE(Shows(131));
}

TEST_F(CheckButtonTest, HasAControlThatKeepsNoState) {
    ::SendMessageW(button.handle, BM_SETCHECK, BST_CHECKED, 0);
    EXPECT_EQ(::SendMessageW(button.handle, BM_GETCHECK, 0, 0), BST_UNCHECKED);
}

TEST_F(CheckButtonTest, ShowsACheckedBoxByAControlThatKeepsOne) {
    ::SetWindowLongW(button.handle, GWL_STYLE, WS_CHILD | BS_AUTOCHECKBOX);
    ::SendMessageW(button.handle, BM_SETCHECK, BST_CHECKED, 0);
    Draw();
    EXPECT_TRUE(Shows(131));
}

TEST_F(CheckButtonTest, FillsTheRestWithThePageColour) {
    button.displayName = "";
    Draw();
    EXPECT_TRUE(canvas.IsFilled({0, 0, kWidth, kPictureTop}, WizardMetrics::PageColor));
    EXPECT_TRUE(canvas.IsFilled({0, kPictureTop + kPictureHeight, kWidth, kHeight}, WizardMetrics::PageColor));
    EXPECT_TRUE(canvas.IsFilled({kPictureWidth, 0, kWidth, kHeight}, WizardMetrics::PageColor));
}

TEST_F(CheckButtonTest, WritesItsLabelFromColumn24On) {
    Draw();
    EXPECT_TRUE(canvas.IsFilled({kPictureWidth, 0, kLabelLeft, kHeight}, WizardMetrics::PageColor));
    EXPECT_FALSE(canvas.IsFilled({kLabelLeft, 0, kLabelLeft + 4, kHeight}, WizardMetrics::PageColor));
    EXPECT_GT(canvas.Count(WizardMetrics::TextColor), 20);
}

TEST_F(CheckButtonTest, WritesItsLabelInGreyWhenItIsDisabled) {
    ::EnableWindow(button.handle, FALSE);
    button.displayName = "MMMMMMM";
    Draw();
    EXPECT_GT(canvas.Count(WizardMetrics::DisabledTextColor), 20);
    EXPECT_EQ(canvas.Count(WizardMetrics::TextColor), 0);
}

TEST_F(CheckButtonTest, IsDisabledWhenTheStateSaysThatAndNothingElse) {
    button.displayName = "MMMMMMM";
    Draw(ODS_DISABLED);
    EXPECT_GT(canvas.Count(WizardMetrics::DisabledTextColor), 20);
    Draw(ODS_DISABLED | ODS_FOCUS);
    EXPECT_EQ(canvas.Count(WizardMetrics::DisabledTextColor), 0);
}

}  // namespace
