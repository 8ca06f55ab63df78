#include "installer/windows/FinalPage.h"

#include "installer/windows/Painting.h"

namespace HV {

namespace {

constexpr int kPicture = 133;

}  // namespace

FinalPage::FinalPage(WinWizardController& controller) : controller_(controller) {}

FinalPage::~FinalPage() {
    ::DeleteObject(picture_);
}

ATL::CWndClassInfo& FinalPage::GetWndClassInfo() {
    static ATL::CWndClassInfo info;
    return info;
}

BOOL FinalPage::ProcessWindowMessage(HWND window, UINT message, WPARAM, LPARAM, LRESULT& result) {
    switch (message) {
        case WM_CREATE:
            picture_ = LoadOwnBitmap(kPicture);
            return TRUE;
        case WM_ERASEBKGND:
            // Nothing: the picture covers the page, and the rows below it show the main window's colour.
            result = TRUE;
            return TRUE;
        case WM_PAINT:
            DrawBitmap(PaintDevice(window), picture_, 0, 0);
            return TRUE;
        default:
            return FALSE;
    }
}

}  // namespace HV
