#pragma once

#include "platform/windows/gdiplus.h"

namespace HV {

/// A colour as the platform takes it, from the usual order of red, green, blue.
constexpr COLORREF ColorOf(unsigned rgb) {
    return (rgb & 0xFF) << 16 | (rgb & 0xFF00) | (rgb >> 16 & 0xFF);
}

/// The same for GDI+, opaque.
constexpr Gdiplus::ARGB OpaqueOf(unsigned rgb) {
    return 0xFF000000 | rgb;
}

/// The look of the wizard in one table: its colours, fonts and rectangles, with the brushes made of them.
///
/// Made once, on first use, by the main thread, and never released.
struct WizardMetrics {
    static const WizardMetrics& Instance();

    // Red, green, blue.
    static constexpr unsigned PageColor = 0x1A1A1A;   // the upper part of the window, pages, background of text
    static constexpr unsigned BarColor = 0x222222;    // the bottom strip
    static constexpr unsigned LightColor = 0xDEDEDE;  // background of the agreement
    static constexpr unsigned TextColor = 0xF0F0F0;
    static constexpr unsigned DisabledTextColor = 0x646464;
    static constexpr unsigned FaceColor = 0x434343;  // buttons
    static constexpr unsigned DisabledFaceColor = 0x303030;
    static constexpr unsigned HighlightColor = 0x009FE1;
    static constexpr unsigned TrackColor = 0x1E1E1E;  // the empty part of the progress bar
    static constexpr unsigned FillColor = 0x429EDB;

    HBRUSH PageBrush;
    HBRUSH BarBrush;
    HBRUSH LightBrush;
    HBRUSH TrackBrush;
    HBRUSH FillBrush;

    HFONT TitleFont;
    HFONT BodyFont;    // and every button and check box
    HFONT StrongFont;  // emphasised lines of the first page
    HFONT WaitFont;    // title of the installing page

    static constexpr int ButtonHeight = 25;
    static constexpr int TitleHeight = 32;
    static constexpr int ProgressHeight = 12;

    static constexpr RECT WindowRect{0, 0, 600, 430};  // frame included
    static constexpr RECT BannerRect{0, 0, 160, 350};
    static constexpr RECT PageRect{BannerRect.right + 10, TitleHeight + 5, WindowRect.right - 20,
                                   BannerRect.bottom - 5};
    static constexpr RECT BottomRect{0, 350, 600, 430};
    static constexpr RECT WideWindowRect{0, 0, 800, 430};
    static constexpr RECT FinalRect{0, 0, 800, 350};

private:
    WizardMetrics();
};

}  // namespace HV
