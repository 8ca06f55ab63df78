// Which calls prepare a process for windows, in which order, and which undo that. Neither the classes of controls that
// are asked for nor the order can be seen in a window, so the calls are written down on their way to the system.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "platform/windows/gdiplus.h"

namespace {

std::vector<std::string> calls;

HRESULT RecordOleInitialize(void* reserved) {
    calls.emplace_back("OleInitialize");
    return ::OleInitialize(reserved);
}

void RecordOleUninitialize() {
    calls.emplace_back("OleUninitialize");
    ::OleUninitialize();
}

BOOL RecordCommonControls(const INITCOMMONCONTROLSEX* controls) {
    calls.emplace_back("InitCommonControlsEx " + std::to_string(controls->dwSize) + " " +
                       std::to_string(controls->dwICC));
    return ::InitCommonControlsEx(controls);
}

HMODULE RecordLibrary(const wchar_t* name) {
    const std::wstring wide = name;
    calls.emplace_back("LoadLibraryW " + std::string(wide.begin(), wide.end()));
    return ::LoadLibraryW(name);
}

}  // namespace

namespace Gdiplus {

static Status RecordStartup(ULONG_PTR* token, const GdiplusStartupInput* input, GdiplusStartupOutput* output) {
    calls.emplace_back("GdiplusStartup " + std::to_string(input->GdiplusVersion) +
                       (input->DebugEventCallback == nullptr ? "" : " with a callback") +
                       (input->SuppressBackgroundThread == FALSE ? "" : " without a thread") +
                       (input->SuppressExternalCodecs == FALSE ? "" : " without codecs"));
    return GdiplusStartup(token, input, output);
}

static void RecordShutdown(ULONG_PTR token) {
    calls.emplace_back("GdiplusShutdown");
    GdiplusShutdown(token);
}

}  // namespace Gdiplus

#define OleInitialize RecordOleInitialize
#define OleUninitialize RecordOleUninitialize
#define InitCommonControlsEx RecordCommonControls
#undef LoadLibraryW
#define LoadLibraryW RecordLibrary
#define GdiplusStartup RecordStartup
#define GdiplusShutdown RecordShutdown

// The operations under test, which call what stands above.
#include "installer/windows/WindowSystem.cpp"

namespace {

TEST(WindowSystem, PreparesTheProcessInOrderAndUndoesItInOrder) {
    calls.clear();
    { const HV::WindowSystem system; }
    EXPECT_EQ(calls, (std::vector<std::string>{"OleInitialize", "InitCommonControlsEx 8 14335",  // 0x37FF
                                               "LoadLibraryW MSFTEDIT.DLL", "GdiplusStartup 1", "OleUninitialize",
                                               "GdiplusShutdown"}));
}

}  // namespace
