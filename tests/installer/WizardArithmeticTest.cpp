#include "installer/WizardArithmetic.h"

#include <gtest/gtest.h>

#include <vector>

#include "tests/support/Rectangles.h"

namespace {

using HV::Growth;

// A window, or a screen, with these columns.
RECT Across(LONG left, LONG right) {
    return {left, 20, right, 450};
}

// The widths that a window passes on its way.
std::vector<LONG> Widths(RECT window, LONG width) {
    std::vector<LONG> passed;
    Growth step;
    do {
        step = HV::Grow(window, width);
        window = step.window;
        passed.push_back(window.right - window.left);
    } while (!step.finished && passed.size() < 100);
    return passed;
}

TEST(Grow, TakesFourStepsFrom600To800) {
    EXPECT_EQ(Widths(Across(212, 812), 800), (std::vector<LONG>{650, 700, 750, 800}));
}

TEST(Grow, MovesBothSidesEvenly) {
    const Growth step = HV::Grow(Across(200, 800), 800);
    EXPECT_EQ(step.window, Across(175, 825));
    EXPECT_FALSE(step.finished);
}

TEST(Grow, EndsAtTheWidthItself) {
    const Growth step = HV::Grow(Across(100, 850), 800);
    EXPECT_EQ(step.window, Across(75, 875));
    EXPECT_TRUE(step.finished);
}

TEST(Grow, TakesAnEvenOvershootBackOnBothSides) {
    // 790 grows to 840, 40 too many.
    const Growth step = HV::Grow(Across(100, 890), 800);
    EXPECT_EQ(step.window, Across(95, 895));
    EXPECT_TRUE(step.finished);
}

TEST(Grow, TakesAnOvershootOfOneFromTheLeftAlone) {
    const Growth step = HV::Grow(Across(100, 851), 800);
    EXPECT_EQ(step.window, Across(76, 876));
    EXPECT_TRUE(step.finished);
}

TEST(Grow, EndsAtExactlyTheWidthFromAnyWidth) {
    int rounds = 0;
    for (int width = 600; width <= 900; ++width) {
        const std::vector<LONG> passed = Widths(Across(-30, -30 + width), 800);
        EXPECT_EQ(passed.back(), 800) << "from " << width;
        ++rounds;
    }
    EXPECT_EQ(rounds, 301);
}

TEST(Grow, LeavesAnOddColumnOnTheRight) {
    int rounds = 0;
    for (int over = 1; over < 50; over += 2) {
        const Growth step = HV::Grow(Across(0, 750 + over), 800);
        EXPECT_EQ(step.window, Across(-25 + over / 2 + 1, 775 + over - over / 2)) << over;
        ++rounds;
    }
    EXPECT_EQ(rounds, 25);
}

TEST(FillWidth, IsHalfOfTheBarAtFiftyPercent) {
    EXPECT_EQ(HV::FillWidth(50, 390), 195);
}

TEST(FillWidth, CountsWholeColumnsOnly) {
    EXPECT_EQ(HV::FillWidth(1, 390), 3);
    EXPECT_EQ(HV::FillWidth(99, 390), 386);
}

TEST(FillWidth, IsNothingAtZeroAndBelow) {
    EXPECT_EQ(HV::FillWidth(0, 390), 0);
    EXPECT_EQ(HV::FillWidth(-1, 390), 0);
}

TEST(FillWidth, IsTheWholeBarAtAHundredAndAbove) {
    EXPECT_EQ(HV::FillWidth(100, 390), 390);
    EXPECT_EQ(HV::FillWidth(101, 390), 390);
    EXPECT_EQ(HV::FillWidth(2147483647, 390), 390);
}

TEST(CheckBoxPlace, RunsDownTwoColumnsOfSix) {
    int boxes = 0;
    for (int index = 0; index < HV::kCheckBoxes; ++index) {
        const RECT box = HV::CheckBoxPlace(index, {0, 0, 410, 308}, 80);
        EXPECT_EQ(box.left, index < 6 ? 10 : 196) << index;
        EXPECT_EQ(box.right - box.left, 185) << index;
        EXPECT_EQ(box.top, 80 + index % 6 * 22) << index;
        EXPECT_EQ(box.bottom - box.top, 22) << index;
        ++boxes;
    }
    EXPECT_EQ(boxes, 12);
}

TEST(CheckBoxPlace, FollowsThePage) {
    const RECT box = HV::CheckBoxPlace(7, {100, 0, 311, 308}, 5);
    EXPECT_EQ(box.left, 100 + 10 + 85 + 1);
    EXPECT_EQ(box.right, box.left + 85);
    EXPECT_EQ(box.top, 27);
}

TEST(CheckBoxLabel, IsMeasuredFromTheHeightOfTheRow) {
    EXPECT_EQ(HV::CheckBoxLabelLeft({10, 80, 195, 102}), 34);
    EXPECT_EQ(HV::CheckBoxLabelLeft({0, 0, 195, 30}), 32);
}

TEST(CornerDiameter, IsFourWhereThereIsRoom) {
    EXPECT_EQ(HV::CornerDiameter(80, 25), 4);
    EXPECT_EQ(HV::CornerDiameter(4, 4), 4);
}

TEST(CornerDiameter, IsTheSmallerSideOfATinyRectangle) {
    EXPECT_EQ(HV::CornerDiameter(3, 25), 3);
    EXPECT_EQ(HV::CornerDiameter(25, 2), 2);
    EXPECT_EQ(HV::CornerDiameter(1, 1), 1);
    EXPECT_EQ(HV::CornerDiameter(0, 9), 0);
}

TEST(KeptOnScreen, LeavesAWindowThatIsInSight) {
    EXPECT_EQ(HV::KeptOnScreen(Across(112, 912), Across(0, 1024)), Across(112, 912));
}

TEST(KeptOnScreen, MovesAWindowInFromBothSides) {
    EXPECT_EQ(HV::KeptOnScreen(Across(-60, 590), Across(0, 1024)), Across(0, 650));
    EXPECT_EQ(HV::KeptOnScreen(Across(500, 1150), Across(100, 1024)), Across(374, 1024));
}

TEST(KeptOnScreen, KeepsTheRightEndOfAWindowThatDoesNotFit) {
    EXPECT_EQ(HV::KeptOnScreen(Across(0, 800), Across(0, 640)), Across(-160, 640));
}

TEST(KeptOnScreen, LeavesTheRowsOfAWindowAlone) {
    EXPECT_EQ(HV::KeptOnScreen({-60, -5, 590, 425}, {0, 0, 1024, 400}), (RECT{0, -5, 650, 425}));
}

TEST(PlacesInViewer, AreThoseOfTheDesignInAWholeViewer) {
    const HV::ViewerPlaces places = HV::PlacesInViewer(560, 640);
    EXPECT_EQ(places.closeButton, (RECT{350, 565, 430, 590}));
    EXPECT_EQ(places.saveButton, (RECT{440, 565, 520, 590}));
    EXPECT_EQ(places.text, (RECT{30, 50, 510, 545}));
}

TEST(PlacesInViewer, KeepTheButtonsAtTheLowerEdgeOfALowViewer) {
    const HV::ViewerPlaces places = HV::PlacesInViewer(560, 576);
    EXPECT_EQ(places.closeButton, (RECT{350, 501, 430, 526}));
    EXPECT_EQ(places.saveButton, (RECT{440, 501, 520, 526}));
    EXPECT_EQ(places.text, (RECT{30, 50, 510, 481}));
}

TEST(PlacesInViewer, KeepTheButtonsAtTheRightEdgeOfANarrowViewer) {
    const HV::ViewerPlaces places = HV::PlacesInViewer(480, 640);
    EXPECT_EQ(places.closeButton, (RECT{270, 565, 350, 590}));
    EXPECT_EQ(places.saveButton, (RECT{360, 565, 440, 590}));
    EXPECT_EQ(places.text, (RECT{30, 50, 430, 545}));
}

TEST(PlacesInViewer, NeverTurnTheTextInsideOut) {
    const HV::ViewerPlaces places = HV::PlacesInViewer(40, 80);
    EXPECT_EQ(places.text, (RECT{30, 50, 30, 50}));
}

}  // namespace
