#include "installer/windows/FinalPage.h"

namespace HV {

namespace {

constexpr int kPicture = 133;

}  // namespace

FinalPage::FinalPage(WinWizardController& controller) : controller_(controller) {}

FinalPage::~FinalPage() {
    ::DeleteObject(picture_);
}

void FinalPage::OnCreate() {
    picture_ = LoadOwnBitmap(kPicture);
}

// The picture covers the page, and the rows below it show the main window's colour.
void FinalPage::OnPaint(HDC device) const {
    DrawBitmap(device, picture_, 0, 0);
}

}  // namespace HV
