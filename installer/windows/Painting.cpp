#include "installer/windows/Painting.h"

#include "installer/windows/WizardMetrics.h"
#include "platform/utf8.h"

namespace HV {

namespace {

// An ampersand is a letter like any other, and what finds no room ends in three dots. Of several lines the last one
// that fits whole gets the dots, which takes the rules of edit controls.
unsigned AsWritten(unsigned format) {
    constexpr unsigned kWholeLines = DT_EDITCONTROL;
    return format | DT_NOPREFIX | DT_END_ELLIPSIS | ((format & DT_WORDBREAK) != 0 ? kWholeLines : 0);
}

}  // namespace

void DrawPageText(HDC device, const std::string& text, RECT place, HFONT font, unsigned format) {
    ::SetBkColor(device, ColorOf(WizardMetrics::PageColor));
    DrawColoredText(device, text, place, font, format, WizardMetrics::TextColor);
}

void DrawColoredText(HDC device, const std::string& text, RECT place, HFONT font, unsigned format, unsigned rgb) {
    const std::wstring wide = platform::WideFromUtf8(text);
    ::SetTextColor(device, ColorOf(rgb));
    const HGDIOBJ before = ::SelectObject(device, font);
    ::DrawTextW(device, wide.c_str(), static_cast<int>(wide.size()), &place, AsWritten(format));
    ::SelectObject(device, before);
}

void DrawBitmap(HDC device, HBITMAP bitmap, int left, int top) {
    BITMAP size{};
    if (::GetObjectW(bitmap, sizeof size, &size) == 0) {
        return;
    }
    const HDC source = ::CreateCompatibleDC(device);
    const HGDIOBJ before = ::SelectObject(source, bitmap);
    ::BitBlt(device, left, top, size.bmWidth, size.bmHeight, source, 0, 0, SRCCOPY);
    ::SelectObject(source, before);
    ::DeleteDC(source);
}

HBITMAP LoadOwnBitmap(int number) {
    return ::LoadBitmapW(::GetModuleHandleW(nullptr), MAKEINTRESOURCEW(number));
}

void FillClient(HWND window, HDC device, HBRUSH brush) {
    RECT client{};
    ::GetClientRect(window, &client);
    ::FillRect(device, &client, brush);
}

bool IsPress(WPARAM command) {
    return HIWORD(command) == BN_CLICKED;
}

}  // namespace HV
