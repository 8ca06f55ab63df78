#include "installer/windows/Painting.h"

#include "installer/windows/WizardMetrics.h"

namespace HV {

void DrawPageText(HDC device, const std::string& text, RECT place, HFONT font, unsigned format) {
    ::SetBkColor(device, ColorOf(WizardMetrics::PageColor));
    DrawColoredText(device, text, place, font, format, WizardMetrics::TextColor);
}

void DrawColoredText(HDC device, const std::string& text, RECT place, HFONT font, unsigned format, unsigned rgb) {
    ::SetTextColor(device, ColorOf(rgb));
    const HGDIOBJ before = ::SelectObject(device, font);
    ::DrawTextA(device, text.c_str(), static_cast<int>(text.size()), &place, format);
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
    const unsigned code = HIWORD(command);
    return code == BN_CLICKED || code == BN_DOUBLECLICKED;
}

}  // namespace HV
