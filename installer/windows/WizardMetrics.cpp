#include "installer/windows/WizardMetrics.h"

#include <algorithm>
#include <string_view>

namespace HV {

namespace {

HFONT MakeFont(LONG height, LONG weight) {
    constexpr std::string_view kFace = "Tahoma";
    // Positive: the height of a line of text, not of its letters.
    LOGFONTA font{};
    font.lfHeight = height;
    font.lfWeight = weight;
    std::copy(kFace.begin(), kFace.end(), font.lfFaceName);
    return ::CreateFontIndirectA(&font);
}

HBRUSH MakeBrush(unsigned rgb) {
    return ::CreateSolidBrush(ColorOf(rgb));
}

}  // namespace

WizardMetrics::WizardMetrics()
    : PageBrush(MakeBrush(PageColor)),
      BarBrush(MakeBrush(BarColor)),
      LightBrush(MakeBrush(LightColor)),
      TrackBrush(MakeBrush(TrackColor)),
      FillBrush(MakeBrush(FillColor)),
      TitleFont(MakeFont(20, 300)),
      BodyFont(MakeFont(13, 300)),
      StrongFont(MakeFont(13, 600)),
      WaitFont(MakeFont(16, 300)) {}

const WizardMetrics& WizardMetrics::Instance() {
    static const WizardMetrics* const metrics = new WizardMetrics;
    return *metrics;
}

}  // namespace HV
