#include "installer/WizardArithmetic.h"

#include <algorithm>

namespace HV {

namespace {

constexpr int kGrowthOfASide = 25;
constexpr int kWholeBar = 100;
constexpr int kRows = 6;
constexpr int kRowHeight = 22;
constexpr int kLeftMargin = 10;
constexpr int kRightMargin = 30;
constexpr int kLargestCorner = 4;
constexpr int kViewerButtonBottom = 590;
constexpr int kViewerButtonHeight = 25;

}  // namespace

Growth Grow(Columns window, int width) {
    Growth step{{window.left - kGrowthOfASide, window.right + kGrowthOfASide}, false};
    const int over = step.columns.right - step.columns.left - width;
    step.finished = over >= 0;
    if (over > 0) {
        // An odd column is taken from the left.
        step.columns.left += over / 2 + over % 2;
        step.columns.right -= over / 2;
    }
    return step;
}

Columns KeptOnScreen(Columns window, Columns screen) {
    const int width = window.right - window.left;
    const int left = std::min(std::max(window.left, screen.left), screen.right - width);
    return {left, left + width};
}

ViewerPlaces PlacesInViewer(int width, int height) {
    const int right = width - kViewerWidth;
    const int down = height - kViewerHeight;
    const int top = kViewerButtonBottom - kViewerButtonHeight + down;
    const int bottom = kViewerButtonBottom + down;
    return {{350 + right, top, 430 + right, bottom},
            {440 + right, top, 520 + right, bottom},
            {30, 50, std::max(510 + right, 30), std::max(545 + down, 50)}};
}

int FillWidth(int percent, int barWidth) {
    if (percent >= kWholeBar) {
        return barWidth;
    }
    return std::max(percent, 0) * barWidth / kWholeBar;
}

Place CheckBoxPlace(int index, Columns page, int firstRow) {
    const int left = page.left + kLeftMargin;
    const int width = (page.right - kRightMargin - left) / 2;
    // One column of pixels lies between the two columns of boxes.
    const int ownLeft = index < kRows ? left : left + width + 1;
    const int top = firstRow + index % kRows * kRowHeight;
    return {ownLeft, top, ownLeft + width, top + kRowHeight};
}

int CheckBoxLabelLeft(const Place& box) {
    // Fixed (contracts, wizard): measured from the row's height and not from the picture's width.
    const int height = box.bottom - box.top;
    return box.left + height - 8 + 10;
}

int CornerDiameter(int width, int height) {
    return std::min({kLargestCorner, width, height});
}

}  // namespace HV
