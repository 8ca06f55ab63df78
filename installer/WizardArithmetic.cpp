#include "installer/WizardArithmetic.h"

#include <algorithm>

namespace HV {

namespace {

constexpr LONG kGrowthOfASide = 25;
constexpr int kWholeBar = 100;
constexpr int kRows = 6;
constexpr LONG kRowHeight = 22;
constexpr LONG kLeftMargin = 10;
constexpr LONG kRightMargin = 30;
constexpr int kLargestCorner = 4;
constexpr LONG kViewerButtonBottom = 590;
constexpr LONG kViewerButtonHeight = 25;

}  // namespace

Growth Grow(const RECT& window, LONG width) {
    Growth step{{window.left - kGrowthOfASide, window.top, window.right + kGrowthOfASide, window.bottom}, false};
    const LONG over = step.window.right - step.window.left - width;
    step.finished = over >= 0;
    if (over > 0) {
        // An odd column is taken from the left.
        step.window.left += over / 2 + over % 2;
        step.window.right -= over / 2;
    }
    return step;
}

RECT KeptOnScreen(const RECT& window, const RECT& screen) {
    const LONG width = window.right - window.left;
    const LONG left = std::min(std::max(window.left, screen.left), screen.right - width);
    return {left, window.top, left + width, window.bottom};
}

ViewerPlaces PlacesInViewer(LONG width, LONG height) {
    const LONG right = width - kViewerWidth;
    const LONG down = height - kViewerHeight;
    const LONG top = kViewerButtonBottom - kViewerButtonHeight + down;
    const LONG bottom = kViewerButtonBottom + down;
    return {{350 + right, top, 430 + right, bottom},
            {440 + right, top, 520 + right, bottom},
            {30, 50, std::max<LONG>(510 + right, 30), std::max<LONG>(545 + down, 50)}};
}

LONG FillWidth(int percent, LONG barWidth) {
    if (percent >= kWholeBar) {
        return barWidth;
    }
    return std::max(percent, 0) * barWidth / kWholeBar;
}

RECT CheckBoxPlace(int index, const RECT& page, LONG firstRow) {
    const LONG left = page.left + kLeftMargin;
    const LONG width = (page.right - kRightMargin - left) / 2;
    // One column of pixels lies between the two columns of boxes.
    const LONG ownLeft = index < kRows ? left : left + width + 1;
    const LONG top = firstRow + index % kRows * kRowHeight;
    return {ownLeft, top, ownLeft + width, top + kRowHeight};
}

LONG CheckBoxLabelLeft(const RECT& box) {
    // Fixed (contracts, wizard): measured from the row's height and not from the picture's width.
    const LONG height = box.bottom - box.top;
    return box.left + height - 8 + 10;
}

int CornerDiameter(int width, int height) {
    return std::min({kLargestCorner, width, height});
}

}  // namespace HV
