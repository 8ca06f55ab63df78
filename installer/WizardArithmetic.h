#pragma once

#include "platform/rectangle.h"

/// The arithmetic of the wizard's windows, in pixels: where things stand and how far they reach. It makes no window.
namespace HV {

/// One step of a window's widening.
struct Growth {
    RECT window{};          // where the window stands after the step
    bool finished = false;  // it has its width, and no step follows
};

/// Widens a window by 25 columns on each side. A step that reaches or passes `width` ends at exactly that width.
[[nodiscard]] Growth Grow(const RECT& window, LONG width);

/// The window at its height, moved, if it must be, into the columns of the screen. Where it does not fit, its right end
/// is in sight.
[[nodiscard]] RECT KeptOnScreen(const RECT& window, const RECT& screen);

/// The outer size of the agreement viewer where the screen has room for it.
constexpr LONG kViewerWidth = 560;
constexpr LONG kViewerHeight = 640;

/// Where things stand in the agreement viewer.
struct ViewerPlaces {
    RECT closeButton;
    RECT saveButton;
    RECT text;
};

/// Their places in a viewer of this outer size. In one that has been cut to its screen the buttons stand as far from
/// the right and lower edges as in a whole one, and the text has the room that is left.
[[nodiscard]] ViewerPlaces PlacesInViewer(LONG width, LONG height);

/// How many columns of a bar `percent` fills. Below 0 is as 0, above 100 is as 100; parts of a column do not count.
[[nodiscard]] LONG FillWidth(int percent, LONG barWidth);

/// How many products the selection page has room for: two columns of six. Nothing scrolls.
constexpr int kCheckBoxes = 12;

/// Where the check box of the product `index`, from 0 on, stands on a page. Below the first six in the left column, the
/// next six in the right one; `firstRow` is the top of both.
[[nodiscard]] RECT CheckBoxPlace(int index, const RECT& page, LONG firstRow);

/// The left edge of a check box's label.
[[nodiscard]] LONG CheckBoxLabelLeft(const RECT& box);

/// The diameter of the corners of a rounded rectangle.
[[nodiscard]] int CornerDiameter(int width, int height);

}  // namespace HV
