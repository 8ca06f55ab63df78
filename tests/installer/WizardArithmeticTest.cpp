#include "installer/WizardArithmetic.h"

#include <gtest/gtest.h>

#include <vector>

namespace {

using HV::Columns;
using HV::Growth;
using HV::Place;

// The widths that a window passes on its way.
std::vector<int> Widths(Columns window, int width) {
    std::vector<int> passed;
    Growth step;
    do {
        step = HV::Grow(window, width);
        window = step.columns;
        passed.push_back(window.right - window.left);
    } while (!step.finished && passed.size() < 100);
    return passed;
}

TEST(Grow, TakesFourStepsFrom600To800) {
    EXPECT_EQ(Widths({212, 812}, 800), (std::vector<int>{650, 700, 750, 800}));
}

TEST(Grow, MovesBothSidesEvenly) {
    const Growth step = HV::Grow({200, 800}, 800);
    EXPECT_EQ(step.columns.left, 175);
    EXPECT_EQ(step.columns.right, 825);
    EXPECT_FALSE(step.finished);
}

TEST(Grow, EndsAtTheWidthItself) {
    const Growth step = HV::Grow({100, 850}, 800);
    EXPECT_EQ(step.columns.left, 75);
    EXPECT_EQ(step.columns.right, 875);
    EXPECT_TRUE(step.finished);
}

TEST(Grow, TakesAnEvenOvershootBackOnBothSides) {
    // 790 grows to 840, 40 too many.
    const Growth step = HV::Grow({100, 890}, 800);
    EXPECT_EQ(step.columns.left, 95);
    EXPECT_EQ(step.columns.right, 895);
    EXPECT_TRUE(step.finished);
}

TEST(Grow, TakesAnOvershootOfOneFromTheLeftAlone) {
    const Growth step = HV::Grow({100, 851}, 800);
    EXPECT_EQ(step.columns.left, 76);
    EXPECT_EQ(step.columns.right, 876);
    EXPECT_TRUE(step.finished);
}

TEST(Grow, EndsAtExactlyTheWidthFromAnyWidth) {
    int rounds = 0;
    for (int width = 600; width <= 900; ++width) {
        const std::vector<int> passed = Widths({-30, -30 + width}, 800);
        EXPECT_EQ(passed.back(), 800) << "from " << width;
        ++rounds;
    }
    EXPECT_EQ(rounds, 301);
}

TEST(Grow, LeavesAnOddColumnOnTheRight) {
    int rounds = 0;
    for (int over = 1; over < 50; over += 2) {
        const Growth step = HV::Grow({0, 750 + over}, 800);
        EXPECT_EQ(step.columns.left, -25 + over / 2 + 1) << over;
        EXPECT_EQ(step.columns.right, 775 + over - over / 2) << over;
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
        const Place box = HV::CheckBoxPlace(index, {0, 410}, 80);
        EXPECT_EQ(box.left, index < 6 ? 10 : 196) << index;
        EXPECT_EQ(box.right - box.left, 185) << index;
        EXPECT_EQ(box.top, 80 + index % 6 * 22) << index;
        EXPECT_EQ(box.bottom - box.top, 22) << index;
        ++boxes;
    }
    EXPECT_EQ(boxes, 12);
}

TEST(CheckBoxPlace, FollowsThePage) {
    const Place box = HV::CheckBoxPlace(7, {100, 311}, 5);
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
    const Columns kept = HV::KeptOnScreen({112, 912}, {0, 1024});
    EXPECT_EQ(kept.left, 112);
    EXPECT_EQ(kept.right, 912);
}

TEST(KeptOnScreen, MovesAWindowInFromBothSides) {
    EXPECT_EQ(HV::KeptOnScreen({-60, 590}, {0, 1024}).left, 0);
    EXPECT_EQ(HV::KeptOnScreen({-60, 590}, {0, 1024}).right, 650);
    EXPECT_EQ(HV::KeptOnScreen({500, 1150}, {100, 1024}).left, 374);
    EXPECT_EQ(HV::KeptOnScreen({500, 1150}, {100, 1024}).right, 1024);
}

TEST(KeptOnScreen, KeepsTheRightEndOfAWindowThatDoesNotFit) {
    const Columns kept = HV::KeptOnScreen({0, 800}, {0, 640});
    EXPECT_EQ(kept.left, -160);
    EXPECT_EQ(kept.right, 640);
}

void ExpectPlace(const Place& place, const Place& expected) {
    EXPECT_EQ(place.left, expected.left);
    EXPECT_EQ(place.top, expected.top);
    EXPECT_EQ(place.right, expected.right);
    EXPECT_EQ(place.bottom, expected.bottom);
}

TEST(PlacesInViewer, AreThoseOfTheDesignInAWholeViewer) {
    const HV::ViewerPlaces places = HV::PlacesInViewer(560, 640);
    ExpectPlace(places.closeButton, {350, 565, 430, 590});
    ExpectPlace(places.saveButton, {440, 565, 520, 590});
    ExpectPlace(places.text, {30, 50, 510, 545});
}

TEST(PlacesInViewer, KeepTheButtonsAtTheLowerEdgeOfALowViewer) {
    const HV::ViewerPlaces places = HV::PlacesInViewer(560, 576);
    ExpectPlace(places.closeButton, {350, 501, 430, 526});
    ExpectPlace(places.saveButton, {440, 501, 520, 526});
    ExpectPlace(places.text, {30, 50, 510, 481});
}

TEST(PlacesInViewer, KeepTheButtonsAtTheRightEdgeOfANarrowViewer) {
    const HV::ViewerPlaces places = HV::PlacesInViewer(480, 640);
    ExpectPlace(places.closeButton, {270, 565, 350, 590});
    ExpectPlace(places.saveButton, {360, 565, 440, 590});
    ExpectPlace(places.text, {30, 50, 430, 545});
}

TEST(PlacesInViewer, NeverTurnTheTextInsideOut) {
    const HV::ViewerPlaces places = HV::PlacesInViewer(40, 80);
    ExpectPlace(places.text, {30, 50, 30, 50});
}

}  // namespace
