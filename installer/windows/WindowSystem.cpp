#include "installer/windows/WindowSystem.h"

#include "platform/windows/gdiplus.h"

namespace HV {

namespace {

constexpr DWORD kAllControls = 0x37FF;

}  // namespace

WindowSystem::WindowSystem() {
    ::OleInitialize(nullptr);
    const INITCOMMONCONTROLSEX controls{sizeof controls, kAllControls};
    ::InitCommonControlsEx(&controls);
    // Brings the rich text control. Without it the agreement viewer stays empty, and everything else works.
    ::LoadLibraryW(L"MSFTEDIT.DLL");
    const Gdiplus::GdiplusStartupInput input(nullptr, FALSE, FALSE);
    Gdiplus::GdiplusStartup(&gdiplus_, &input, nullptr);
}

WindowSystem::~WindowSystem() {
    ::OleUninitialize();
    Gdiplus::GdiplusShutdown(gdiplus_);
}

}  // namespace HV
