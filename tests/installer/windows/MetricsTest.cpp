#include <gtest/gtest.h>

#include <string>

#include "installer/windows/WizardMetrics.h"
#include "tests/installer/windows/WindowTest.h"

namespace {

using HV::WizardMetrics;

COLORREF ColorOfBrush(HBRUSH brush) {
    LOGBRUSH logical{};
    ::GetObjectW(brush, sizeof logical, &logical);
    EXPECT_EQ(logical.lbStyle, static_cast<UINT>(BS_SOLID));
    return logical.lbColor;
}

std::string Describe(HFONT font) {
    LOGFONTA logical{};
    ::GetObjectA(font, sizeof logical, &logical);
    const int rest = logical.lfWidth + logical.lfEscapement + logical.lfOrientation + logical.lfItalic +
                     logical.lfUnderline + logical.lfStrikeOut + logical.lfCharSet + logical.lfOutPrecision +
                     logical.lfClipPrecision + logical.lfQuality + logical.lfPitchAndFamily;
    return std::string(logical.lfFaceName) + " " + std::to_string(logical.lfHeight) + " " +
           std::to_string(logical.lfWeight) + " " + std::to_string(rest);
}

TEST(WizardMetrics, GivesColoursInTheOrderOfRedGreenBlue) {
    EXPECT_EQ(HV::ColorOf(0x123456), RGB(0x12, 0x34, 0x56));
    EXPECT_EQ(HV::OpaqueOf(0x123456), 0xFF123456U);
}

TEST(WizardMetrics, HasTheColoursOfTheHouse) {
    EXPECT_EQ(WizardMetrics::PageColor, 0x1A1A1AU);
    EXPECT_EQ(WizardMetrics::BarColor, 0x222222U);
    EXPECT_EQ(WizardMetrics::LightColor, 0xDEDEDEU);
    EXPECT_EQ(WizardMetrics::TextColor, 0xF0F0F0U);
    EXPECT_EQ(WizardMetrics::DisabledTextColor, 0x646464U);
    EXPECT_EQ(WizardMetrics::FaceColor, 0x434343U);
    EXPECT_EQ(WizardMetrics::DisabledFaceColor, 0x303030U);
    EXPECT_EQ(WizardMetrics::HighlightColor, 0x009FE1U);
    EXPECT_EQ(WizardMetrics::TrackColor, 0x1E1E1EU);
    EXPECT_EQ(WizardMetrics::FillColor, 0x429EDBU);
}

TEST(WizardMetrics, HasBrushesOfItsColours) {
    const WizardMetrics& metrics = WizardMetrics::Instance();
    EXPECT_EQ(ColorOfBrush(metrics.PageBrush), RGB(0x1A, 0x1A, 0x1A));
    EXPECT_EQ(ColorOfBrush(metrics.BarBrush), RGB(0x22, 0x22, 0x22));
    EXPECT_EQ(ColorOfBrush(metrics.LightBrush), RGB(0xDE, 0xDE, 0xDE));
    EXPECT_EQ(ColorOfBrush(metrics.TrackBrush), RGB(0x1E, 0x1E, 0x1E));
    EXPECT_EQ(ColorOfBrush(metrics.FillBrush), RGB(0x42, 0x9E, 0xDB));
}

TEST(WizardMetrics, HasFontsOfLineHeightsAndNothingElse) {
    const WizardMetrics& metrics = WizardMetrics::Instance();
    EXPECT_EQ(Describe(metrics.TitleFont), "Tahoma 20 300 0");
    EXPECT_EQ(Describe(metrics.BodyFont), "Tahoma 13 300 0");
    EXPECT_EQ(Describe(metrics.StrongFont), "Tahoma 13 600 0");
    EXPECT_EQ(Describe(metrics.WaitFont), "Tahoma 16 300 0");
}

TEST(WizardMetrics, HasTheRectanglesOfTheHouse) {
    EXPECT_EQ(WizardMetrics::WindowRect, (RECT{0, 0, 600, 430}));
    EXPECT_EQ(WizardMetrics::BannerRect, (RECT{0, 0, 160, 350}));
    EXPECT_EQ(WizardMetrics::PageRect, (RECT{170, 37, 580, 345}));
    EXPECT_EQ(WizardMetrics::BottomRect, (RECT{0, 350, 600, 430}));
    EXPECT_EQ(WizardMetrics::WideWindowRect, (RECT{0, 0, 800, 430}));
    EXPECT_EQ(WizardMetrics::FinalRect, (RECT{0, 0, 800, 350}));
    EXPECT_EQ(WizardMetrics::ButtonHeight, 25);
    EXPECT_EQ(WizardMetrics::TitleHeight, 32);
    EXPECT_EQ(WizardMetrics::ProgressHeight, 12);
}

TEST(WizardMetrics, IsMadeOnce) {
    EXPECT_EQ(&WizardMetrics::Instance(), &WizardMetrics::Instance());
}

}  // namespace
