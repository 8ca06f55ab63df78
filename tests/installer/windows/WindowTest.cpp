#include "tests/installer/windows/WindowTest.h"

#include <algorithm>
#include <array>
#include <iomanip>

namespace {

constexpr unsigned kColours = 0xFFFFFF;

std::wstring ClassName(HWND window) {
    std::array<wchar_t, 64> name{};
    ::GetClassNameW(window, name.data(), static_cast<int>(name.size()));
    return name.data();
}

std::wstring TextOf(HWND window) {
    std::array<wchar_t, 512> text{};
    ::GetWindowTextW(window, text.data(), static_cast<int>(text.size()));
    return text.data();
}

BOOL CALLBACK DestroyOwn(HWND window, LPARAM) {
    ::DestroyWindow(window);
    return TRUE;
}

}  // namespace

std::ostream& operator<<(std::ostream& stream, const Control& control) {
    stream << control.identifier << " " << std::string(control.kind.begin(), control.kind.end()) << " \"";
    stream << std::string(control.text.begin(), control.text.end()) << "\" " << control.place;
    return stream << " style " << std::hex << control.style << std::dec;
}

std::vector<Control> ControlsOf(HWND parent) {
    std::vector<Control> controls;
    HWND window = ::GetTopWindow(parent);
    for (; window != nullptr; window = ::GetWindow(window, GW_HWNDNEXT)) {
        RECT place{};
        ::GetWindowRect(window, &place);
        ::MapWindowPoints(nullptr, parent, reinterpret_cast<POINT*>(&place), 2);
        controls.push_back({::GetDlgCtrlID(window), ClassName(window), TextOf(window), place,
                            static_cast<DWORD>(::GetWindowLongW(window, GWL_STYLE))});
    }
    // A new child stands below those before it.
    return controls;
}

HFONT FontOf(HWND window) {
    return reinterpret_cast<HFONT>(::SendMessageW(window, WM_GETFONT, 0, 0));
}

WindowTest::~WindowTest() {
    ::EnumThreadWindows(::GetCurrentThreadId(), DestroyOwn, 0);
    MSG message{};
    while (::PeekMessageW(&message, nullptr, 0, 0, PM_REMOVE) != FALSE) {
        ::DispatchMessageW(&message);
    }
}

HWND WindowTest::Parent() {
    if (parent_ == nullptr) {
        parent_ = ::CreateWindowExW(0, L"STATIC", L"parent", WS_POPUP | WS_VISIBLE, 0, 0, 700, 500, nullptr, nullptr,
                                    nullptr, nullptr);
    }
    return parent_;
}

void WindowTest::Press(HWND parent, int identifier, unsigned code) {
    ::SendMessageW(parent, WM_COMMAND, MAKEWPARAM(identifier, code),
                   reinterpret_cast<LPARAM>(::GetDlgItem(parent, identifier)));
}

Canvas::Canvas(int width, int height) : width_(width), height_(height), device_(::CreateCompatibleDC(nullptr)) {
    BITMAPINFO info{};
    info.bmiHeader.biSize = sizeof info.bmiHeader;
    info.bmiHeader.biWidth = width;
    info.bmiHeader.biHeight = -height;  // the first row is the top one
    info.bmiHeader.biPlanes = 1;
    info.bmiHeader.biBitCount = 32;
    void* points = nullptr;
    bitmap_ = ::CreateDIBSection(device_, &info, DIB_RGB_COLORS, &points, nullptr, 0);
    before_ = ::SelectObject(device_, bitmap_);
    points_ = static_cast<const unsigned*>(points);
}

Canvas::~Canvas() {
    ::SelectObject(device_, before_);
    ::DeleteObject(bitmap_);
    ::DeleteDC(device_);
}

unsigned Canvas::At(int x, int y) const {
    ::GdiFlush();
    return points_[y * width_ + x] & kColours;
}

int Canvas::Count(unsigned rgb) const {
    ::GdiFlush();
    return static_cast<int>(std::count_if(points_, points_ + width_ * height_,
                                          [rgb](unsigned point) { return (point & kColours) == rgb; }));
}

bool Canvas::IsFilled(const RECT& area, unsigned rgb) const {
    bool filled = area.left < area.right && area.top < area.bottom;
    for (LONG y = area.top; y < area.bottom; ++y) {
        for (LONG x = area.left; x < area.right; ++x) {
            filled = filled && At(static_cast<int>(x), static_cast<int>(y)) == rgb;
        }
    }
    return filled;
}

DRAWITEMSTRUCT DrawRequest(const Canvas& canvas, HWND control, const RECT& place, UINT state) {
    DRAWITEMSTRUCT request{};
    request.CtlType = ODT_BUTTON;
    request.CtlID = static_cast<UINT>(::GetDlgCtrlID(control));
    request.itemAction = ODA_DRAWENTIRE;
    request.itemState = state;
    request.hwndItem = control;
    request.hDC = canvas.Device();
    request.rcItem = place;
    return request;
}
