#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <cstdlib>
#include <memory>
#include <optional>

#include "installer/windows/CustomButton.h"
#include "installer/windows/SelectionPage.h"
#include "installer/windows/WizardMetrics.h"
#include "tests/installer/windows/WindowTest.h"

namespace {

using HV::CustomButton;
using HV::WizardMetrics;

constexpr int kWidth = 80;
constexpr int kHeight = 25;
constexpr RECT kPlace{0, 0, kWidth, kHeight};
constexpr unsigned kBackground = 0xABCDEF;
constexpr UINT kDisabledState = ODS_DISABLED;

/// An owner without a brush.
class OwnerWithoutBrush : public HV::CustomButtonOwner {
public:
    Gdiplus::Brush* BackgroundBrush() override { return nullptr; }
};

class ButtonTest : public WindowTest {
protected:
    ButtonTest() {
        const Gdiplus::SolidBrush background(Gdiplus::Color(HV::OpaqueOf(kBackground)));
        owner = std::make_unique<HV::WindowCustomButtonOwner>(background);
        button.owner = owner.get();
        HV::MakeButton(button, Parent(), "", 5, kPlace);
    }

    void Draw(UINT state = 0) { HV::DrawButton(button, DrawRequest(canvas, button.handle, kPlace, state)); }
    [[nodiscard]] unsigned Face() const { return canvas.At(kWidth / 2, 2); }

    Canvas canvas{kWidth, kHeight};
    std::unique_ptr<HV::WindowCustomButtonOwner> owner;
    CustomButton button;
};

TEST_F(ButtonTest, HasAGreyFaceWhenItIsEnabled) {
    Draw();
    EXPECT_EQ(Face(), WizardMetrics::FaceColor);
}

TEST_F(ButtonTest, HasABlueFaceWhenItIsHighlighted) {
    button.highlighted = true;
    Draw();
    EXPECT_EQ(Face(), WizardMetrics::HighlightColor);
}

TEST_F(ButtonTest, HasADarkFaceWhenItIsDisabledHighlightedOrNot) {
    ::EnableWindow(button.handle, FALSE);
    Draw();
    EXPECT_EQ(Face(), WizardMetrics::DisabledFaceColor);
    button.highlighted = true;
    Draw();
    EXPECT_EQ(Face(), WizardMetrics::DisabledFaceColor);
}

TEST_F(ButtonTest, IsDisabledWhenTheStateSaysThatAndNothingElse) {
    Draw(kDisabledState);
    EXPECT_EQ(Face(), WizardMetrics::DisabledFaceColor);
    Draw(kDisabledState | ODS_SELECTED);
    EXPECT_EQ(Face(), WizardMetrics::FaceColor);
}

TEST_F(ButtonTest, LooksTheSamePressedAndFocused) {
    int states = 0;
    for (const UINT state : {ODS_SELECTED, ODS_FOCUS, ODS_HOTLIGHT, ODS_SELECTED | ODS_FOCUS}) {
        Draw(state);
        EXPECT_EQ(Face(), WizardMetrics::FaceColor) << state;
        ++states;
    }
    EXPECT_EQ(states, 4);
}

TEST_F(ButtonTest, LeavesAStripOfTheBackgroundOnTheRightAndBelow) {
    Draw();
    EXPECT_TRUE(canvas.IsFilled({kWidth - 1, 0, kWidth, kHeight}, kBackground));
    EXPECT_TRUE(canvas.IsFilled({0, kHeight - 1, kWidth, kHeight}, kBackground));
    EXPECT_EQ(canvas.At(kWidth - 2, kHeight / 2), WizardMetrics::FaceColor);
    EXPECT_EQ(canvas.At(kWidth / 2, kHeight - 2), WizardMetrics::FaceColor);
    EXPECT_EQ(canvas.At(0, kHeight / 2), WizardMetrics::FaceColor);
    EXPECT_EQ(canvas.At(kWidth / 2, 0), WizardMetrics::FaceColor);
}

TEST_F(ButtonTest, ShowsTheOwnersBackgroundInItsCorners) {
    Draw();
    EXPECT_EQ(canvas.At(0, 0), kBackground);
    EXPECT_EQ(canvas.At(kWidth - 2, 0), kBackground);
    EXPECT_EQ(canvas.At(0, kHeight - 2), kBackground);
    EXPECT_EQ(canvas.At(kWidth - 2, kHeight - 2), kBackground);
}

TEST_F(ButtonTest, HasBlackCornersWithoutAnOwner) {
    button.owner = nullptr;
    Draw();
    EXPECT_EQ(canvas.At(0, 0), 0U);
    EXPECT_TRUE(canvas.IsFilled({0, kHeight - 1, kWidth, kHeight}, 0U));
    EXPECT_EQ(Face(), WizardMetrics::FaceColor);
}

TEST_F(ButtonTest, HasBlackCornersWhenTheOwnerHasNoBrush) {
    OwnerWithoutBrush without;
    button.owner = &without;
    Draw();
    EXPECT_EQ(canvas.At(0, 0), 0U);
    EXPECT_TRUE(canvas.IsFilled({kWidth - 1, 0, kWidth, kHeight}, 0U));
}

TEST_F(ButtonTest, HasAnOutlineThatDoesNotShow) {
    Draw();
    const int face = canvas.Count(WizardMetrics::FaceColor);
    const int background = canvas.Count(kBackground);
    EXPECT_EQ(face + background, kWidth * kHeight);
}

TEST_F(ButtonTest, HasAnOutlineInTheColourThatIsAskedFor) {
    // The same drawing with a pen that can be seen: the colour above is what hides it.
    Gdiplus::Graphics graphics(canvas.Device());
    const Gdiplus::SolidBrush brush(Gdiplus::Color(HV::OpaqueOf(WizardMetrics::FaceColor)));
    HV::FillRoundedRect(graphics, brush, {0, 0, kWidth, kHeight}, 0xFFFF0000);
    EXPECT_GT(canvas.Count(0xFF0000), 150);
    // One pixel wide: the face begins right after it.
    EXPECT_EQ(canvas.At(kWidth / 2, 0), 0xFF0000U);
    EXPECT_EQ(canvas.At(kWidth / 2, 1), WizardMetrics::FaceColor);
}

TEST_F(ButtonTest, WritesItsTextInTheTextColour) {
    button.text = "Continue";
    Draw();
    EXPECT_GT(canvas.Count(WizardMetrics::TextColor), 20);
    EXPECT_EQ(canvas.Count(WizardMetrics::DisabledTextColor), 0);
}

TEST_F(ButtonTest, WritesItsTextInGreyWhenItIsDisabled) {
    button.text = "Continue";
    ::EnableWindow(button.handle, FALSE);
    Draw();
    EXPECT_GT(canvas.Count(WizardMetrics::DisabledTextColor), 20);
    EXPECT_EQ(canvas.Count(WizardMetrics::TextColor), 0);
}

TEST_F(ButtonTest, CutsItsTextThreePixelsInsideItsEdges) {
    button.text = "MMMMMMMMMMMMMMMMMMMMMMMM";
    Draw();
    EXPECT_TRUE(canvas.IsFilled({0, 3, 3, kHeight - 3}, WizardMetrics::FaceColor));
    EXPECT_TRUE(canvas.IsFilled({kWidth - 3, 3, kWidth - 1, kHeight - 3}, WizardMetrics::FaceColor));
    EXPECT_FALSE(canvas.IsFilled({3, 3, kWidth - 3, kHeight - 3}, WizardMetrics::FaceColor));
}

TEST_F(ButtonTest, FillsPixelsWhateverThePageUnitAndRestoresThat) {
    Gdiplus::Graphics graphics(canvas.Device());
    graphics.SetPageUnit(Gdiplus::UnitPoint);
    const Gdiplus::SolidBrush brush(Gdiplus::Color(0xFFFFFFFF));
    HV::FillRoundedRect(graphics, brush, {0, 0, 30, 12}, 0);
    EXPECT_EQ(graphics.GetPageUnit(), Gdiplus::UnitPoint);
    EXPECT_TRUE(canvas.IsFilled({2, 2, 28, 10}, 0xFFFFFF));
    EXPECT_TRUE(canvas.IsFilled({30, 0, kWidth, kHeight}, 0));
    EXPECT_TRUE(canvas.IsFilled({0, 12, kWidth, kHeight}, 0));
}

// Where the next object of the drawing interface finds room. Room that is given back is used again, so only objects
// that are kept push it on.
int NextRoom() {
    const HBRUSH brush = ::CreateSolidBrush(RGB(1, 2, 3));
    ::DeleteObject(brush);
    return LOWORD(reinterpret_cast<std::uintptr_t>(brush));
}

TEST_F(ButtonTest, KeepsNothingOfADrawing) {
    button.text = "Continue";
    HV::ProductCheckButton box;
    box.displayName = "Tessaly Glow";
    box.background = WizardMetrics::Instance().PageBrush;
    box.handle = button.handle;
    const auto drawBoth = [&] {
        Draw();
        HV::DrawCheckButton(box, DrawRequest(canvas, box.handle, kPlace));
    };
    drawBoth();
    const int before = NextRoom();
    int drawings = 0;
    for (; drawings < 1000; ++drawings) {
        drawBoth();
    }
    EXPECT_EQ(drawings, 1000);
    EXPECT_LT(std::abs(NextRoom() - before), 500);
}

// Left, top, right, bottom of what a rounded rectangle at (0, 0) covers.
std::array<float, 4> BoundsOf(int width, int height) {
    Gdiplus::GraphicsPath path;
    HV::AddRoundedRect(path, 0, 0, width, height);
    Gdiplus::RectF bounds;
    path.GetBounds(&bounds);
    return {bounds.X, bounds.Y, bounds.X + bounds.Width, bounds.Y + bounds.Height};
}

TEST_F(ButtonTest, IsOnePixelShortOfItsRectangle) {
    EXPECT_EQ(BoundsOf(80, 25), (std::array<float, 4>{0, 0, 79, 24}));
}

// How far the first corner, the upper left one, reaches along both edges.
void ExpectFirstCorner(int width, int height, float radius) {
    Gdiplus::GraphicsPath path;
    HV::AddRoundedRect(path, 0, 0, width, height);
    std::array<Gdiplus::PointF, 32> points;
    path.GetPathPoints(points.data(), static_cast<INT>(points.size()));
    EXPECT_NEAR(points[0].Y, radius, 0.01) << width << " by " << height;
    EXPECT_NEAR(points[3].X, radius, 0.01) << width << " by " << height;
}

TEST_F(ButtonTest, HasCornersAsSmallAsATinyRectangle) {
    ExpectFirstCorner(80, 25, 2.0F);
    ExpectFirstCorner(3, 25, 1.5F);
    ExpectFirstCorner(25, 2, 1.0F);
}

TEST_F(ButtonTest, StartsAPathAnew) {
    Gdiplus::GraphicsPath path;
    HV::AddRoundedRect(path, 0, 0, 80, 25);
    const INT once = path.GetPointCount();
    HV::AddRoundedRect(path, 0, 0, 80, 25);
    EXPECT_EQ(path.GetPointCount(), once);
}

class ButtonControlTest : public ButtonTest {
protected:
    // What the control has painted itself is done; what is left has been asked for since.
    [[nodiscard]] bool NeedsPainting() const { return ::GetUpdateRect(button.handle, nullptr, FALSE) != FALSE; }
    void Settle() const { ::ValidateRect(button.handle, nullptr); }
};

TEST_F(ButtonControlTest, IsPaintedAgainForAnotherText) {
    Settle();
    ASSERT_FALSE(NeedsPainting());
    button.SetText("Install");
    EXPECT_TRUE(NeedsPainting());
    EXPECT_EQ(button.text, "Install");
}

TEST_F(ButtonControlTest, IsNotPaintedAgainForTheSameText) {
    button.SetText("Install");
    Settle();
    button.SetText("Install");
    EXPECT_FALSE(NeedsPainting());
}

/// Counts how often the background of a control is erased, while it lives.
class EraseCounter {
public:
    explicit EraseCounter(HWND control) : control_(control) {
        count = 0;
        own = reinterpret_cast<WNDPROC>(::SetWindowLongPtrW(control, GWLP_WNDPROC, reinterpret_cast<LONG_PTR>(&Count)));
    }
    ~EraseCounter() { ::SetWindowLongPtrW(control_, GWLP_WNDPROC, reinterpret_cast<LONG_PTR>(own)); }
    EraseCounter(const EraseCounter&) = delete;
    EraseCounter& operator=(const EraseCounter&) = delete;

    static inline int count = 0;

private:
    static LRESULT CALLBACK Count(HWND window, UINT message, WPARAM wide, LPARAM parameter) {
        count += message == WM_ERASEBKGND ? 1 : 0;
        return ::CallWindowProcW(own, window, message, wide, parameter);
    }

    static inline WNDPROC own = nullptr;
    HWND control_;
};

TEST_F(ButtonControlTest, IsErasedBeforeItIsPaintedAgain) {
    ::UpdateWindow(button.handle);
    const EraseCounter erased(button.handle);
    button.SetText("Install");
    ::UpdateWindow(button.handle);
    EXPECT_EQ(EraseCounter::count, 1);
    button.SetHighlighted(true);
    ::UpdateWindow(button.handle);
    EXPECT_EQ(EraseCounter::count, 2);
}

TEST_F(ButtonControlTest, IsCalledByItsText) {
    button.SetText("Install");
    EXPECT_EQ(ControlsOf(Parent()).at(0).text, L"Install");
}

// A single ampersand would make a key of the letter after it.
TEST_F(ButtonControlTest, IsCalledByItsTextWithItsAmpersandsDoubled) {
    button.SetText("R&D & more – é™");
    EXPECT_EQ(ControlsOf(Parent()).at(0).text, L"R&&D && more – é™");
    EXPECT_EQ(button.text, "R&D & more – é™");
}

TEST_F(ButtonControlTest, IsPaintedAgainWhenTheHighlightChanges) {
    Settle();
    button.SetHighlighted(false);
    EXPECT_FALSE(NeedsPainting());
    button.SetHighlighted(true);
    EXPECT_TRUE(NeedsPainting());
}

TEST_F(ButtonControlTest, TakesATextBeforeItIsMade) {
    CustomButton none;
    none.SetText("Continue");
    none.SetHighlighted(true);
    EXPECT_EQ(none.text, "Continue");
    EXPECT_TRUE(none.highlighted);
}

TEST_F(ButtonControlTest, HasTheStyleOfTheHouse) {
    CustomButton disabled;
    HV::MakeButton(disabled, Parent(), "Back", 6, {1, 2, 31, 27}, HV::kDisabledButtonStyle);
    EXPECT_EQ(ControlsOf(Parent()), (std::vector<Control>{{5, L"Button", L"", {0, 0, 80, 25}, 0x5001000B},
                                                          {6, L"Button", L"Back", {1, 2, 31, 27}, 0x5801000B}}));
}

}  // namespace
