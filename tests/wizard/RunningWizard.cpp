#include "tests/wizard/RunningWizard.h"

#include <winternl.h>

#include <algorithm>
#include <cstddef>
#include <cstdlib>

#include "platform/utf8.h"

namespace {

constexpr DWORD kMinute = 60000;
constexpr DWORD kPoll = 20;
constexpr int kBoxText = 0xFFFF;

std::vector<HWND> ChildrenOf(HWND parent) {
    std::vector<HWND> children;
    for (HWND child = GetWindow(parent, GW_CHILD); child != nullptr; child = GetWindow(child, GW_HWNDNEXT)) {
        children.push_back(child);
    }
    return children;
}

bool IsPage(HWND window) {
    return ClassOf(window).rfind("ATL:", 0) == 0;
}

bool WaitUntilUsable(HWND parent, int id) {
    return Eventually([=] {
        const HWND button = GetDlgItem(parent, id);
        return button != nullptr && IsWindowVisible(button) && IsWindowEnabled(button);
    });
}

}  // namespace

bool Eventually(const std::function<bool()>& question) {
    const ULONGLONG start = GetTickCount64();
    while (!question()) {
        if (GetTickCount64() - start > kMinute) {
            return false;
        }
        Sleep(kPoll);
    }
    return true;
}

std::string TextOf(HWND window) {
    std::wstring wide(4096, L'\0');
    DWORD_PTR length = 0;
    // Asked of the window itself: a control's own text is not to be had otherwise from another process.
    SendMessageTimeoutW(window, WM_GETTEXT, wide.size(), reinterpret_cast<LPARAM>(wide.data()), SMTO_NORMAL, kMinute,
                        &length);
    std::string text(length * 3, '\0');
    text.resize(
        static_cast<std::size_t>(WideCharToMultiByte(CP_UTF8, 0, wide.data(), static_cast<int>(length), text.data(),
                                                     static_cast<int>(text.size()), nullptr, nullptr)));
    return text;
}

std::string ClassOf(HWND window) {
    char name[256];
    return {name, static_cast<std::size_t>(std::max(GetClassNameA(window, name, sizeof name), 0))};
}

RECT OnScreen(HWND window) {
    RECT part{};
    GetWindowRect(window, &part);
    return part;
}

RECT InParent(HWND window) {
    RECT part = OnScreen(window);
    MapWindowPoints(nullptr, GetParent(window), reinterpret_cast<POINT*>(&part), 2);
    return part;
}

namespace {

Box ReadBox(HWND handle) {
    Box box;
    box.handle = handle;
    box.title = TextOf(box.handle);
    box.text = TextOf(GetDlgItem(box.handle, kBoxText));
    box.owner = GetWindow(box.handle, GW_OWNER);
    for (const HWND child : ChildrenOf(box.handle)) {
        if (ClassOf(child) == "Button" && IsWindowVisible(child)) {
            box.buttons.push_back(GetDlgCtrlID(child));
        }
        DWORD_PTR icon = 0;
        if (ClassOf(child) == "Static" && SendMessageTimeoutA(child, STM_GETICON, 0, 0, SMTO_NORMAL, kMinute, &icon)) {
            box.hasIcon = box.hasIcon || icon != 0;
        }
    }
    std::sort(box.buttons.begin(), box.buttons.end());
    return box;
}

}  // namespace

RunningWizard::RunningWizard(const std::string& folder) {
    STARTUPINFOA start{};
    start.cb = sizeof start;
    // Without standard streams, as the desktop starts it.
    start.dwFlags = STARTF_USESTDHANDLES;
    std::string line = "\"" + folder + "\\hvinstaller.exe\"";
    if (!CreateProcessA(nullptr, line.data(), nullptr, nullptr, FALSE, 0, nullptr, nullptr, &start, &process_)) {
        ADD_FAILURE() << "cannot start " << line << ": error " << GetLastError();
    }
}

RunningWizard::~RunningWizard() {
    if (IsRunning()) {
        TerminateProcess(process_.hProcess, 1);
        WaitForSingleObject(process_.hProcess, kMinute);
    }
    CloseHandle(process_.hThread);
    CloseHandle(process_.hProcess);
}

bool RunningWizard::IsRunning() const {
    return WaitForSingleObject(process_.hProcess, 0) == WAIT_TIMEOUT;
}

std::optional<DWORD> RunningWizard::ExitStatus() {
    DWORD status = 0;
    if (WaitForSingleObject(process_.hProcess, kMinute) != WAIT_OBJECT_0 ||
        !GetExitCodeProcess(process_.hProcess, &status)) {
        return std::nullopt;
    }
    return status;
}

namespace {

/// What a process was started with and works in, as far as this file asks for it. The header of the system has no names
/// for these fields.
struct ProcessParameters {
    std::byte before[0x38];
    UNICODE_STRING currentFolder;
};

template <class Block>
Block ReadFrom(HANDLE process, const void* place) {
    Block block{};
    EXPECT_TRUE(ReadProcessMemory(process, place, &block, sizeof block, nullptr)) << GetLastError();
    return block;
}

}  // namespace

std::string RunningWizard::CurrentFolder() const {
    PROCESS_BASIC_INFORMATION known{};
    EXPECT_GE(NtQueryInformationProcess(process_.hProcess, ProcessBasicInformation, &known, sizeof known, nullptr), 0);
    const auto process = ReadFrom<PEB>(process_.hProcess, known.PebBaseAddress);
    const auto parameters = ReadFrom<ProcessParameters>(process_.hProcess, process.ProcessParameters);
    std::wstring folder(parameters.currentFolder.Length / sizeof(wchar_t), L'\0');
    EXPECT_TRUE(ReadProcessMemory(process_.hProcess, parameters.currentFolder.Buffer, folder.data(),
                                  parameters.currentFolder.Length, nullptr));
    std::string text = platform::Utf8FromWide(folder);
    return text.ends_with('\\') ? text.substr(0, text.size() - 1) : text;
}

std::vector<HWND> RunningWizard::TopWindows() const {
    struct Search {
        DWORD process;
        std::vector<HWND> found;
    } search{process_.dwProcessId, {}};
    EnumWindows(
        [](HWND window, LPARAM parameter) -> BOOL {
            auto& of = *reinterpret_cast<Search*>(parameter);
            DWORD owner = 0;
            GetWindowThreadProcessId(window, &owner);
            if (owner == of.process && IsWindowVisible(window)) {
                of.found.push_back(window);
            }
            return TRUE;
        },
        reinterpret_cast<LPARAM>(&search));
    std::sort(search.found.begin(), search.found.end());
    return search.found;
}

bool RunningWizard::HasWindow() {
    if (window_ == nullptr) {
        for (const HWND window : TopWindows()) {
            if (GetDlgItem(window, id::Continue) != nullptr) {
                window_ = window;
            }
        }
    }
    return window_ != nullptr;
}

HWND RunningWizard::Window() {
    EXPECT_TRUE(Eventually([this] { return HasWindow(); })) << "the main window does not come";
    // It shows itself a little before it listens.
    EXPECT_EQ(WaitForInputIdle(process_.hProcess, kMinute), 0U);
    return window_;
}

HWND RunningWizard::Page() {
    for (const HWND child : ChildrenOf(Window())) {
        if (IsPage(child) && IsWindowVisible(child)) {
            return child;
        }
    }
    return nullptr;
}

HWND RunningWizard::PageWith(int id) {
    HWND page = nullptr;
    EXPECT_TRUE(Eventually([&] {
        page = Page();
        return page != nullptr && GetDlgItem(page, id) != nullptr;
    })) << "no page with the control "
        << id;
    return page;
}

HWND RunningWizard::PageWithoutControls() {
    HWND page = nullptr;
    EXPECT_TRUE(Eventually([&] {
        page = Page();
        return page != nullptr && GetWindow(page, GW_CHILD) == nullptr;
    })) << "no page without controls";
    return page;
}

std::vector<HWND> RunningWizard::Viewers() const {
    std::vector<HWND> viewers = TopWindows();
    std::erase_if(viewers, [](HWND window) { return GetDlgItem(window, id::SaveLicense) == nullptr; });
    return viewers;
}

std::vector<Control> RunningWizard::Controls(HWND parent) {
    std::vector<Control> controls;
    for (const HWND child : ChildrenOf(parent)) {
        if (!IsPage(child)) {
            controls.push_back({child, GetDlgCtrlID(child), ClassOf(child), InParent(child),
                                static_cast<DWORD>(GetWindowLongA(child, GWL_STYLE)) & ~(WS_VISIBLE | WS_DISABLED),
                                (GetWindowLongA(child, GWL_STYLE) & WS_VISIBLE) != 0, IsWindowEnabled(child) != FALSE});
        }
    }
    return controls;
}

Control RunningWizard::ControlOf(HWND parent, int id) {
    for (const Control& control : Controls(parent)) {
        if (control.id == id) {
            return control;
        }
    }
    ADD_FAILURE() << "no control " << id;
    return {};
}

void RunningWizard::Press(HWND parent, int id) {
    ASSERT_TRUE(WaitUntilUsable(parent, id)) << "button " << id << " cannot be pressed";
    DWORD_PTR result = 0;
    EXPECT_NE(SendMessageTimeoutA(GetDlgItem(parent, id), BM_CLICK, 0, 0, SMTO_NORMAL, kMinute, &result), 0)
        << "button " << id << " does not come up again";
}

void RunningWizard::PressForBox(HWND parent, int id) {
    ASSERT_TRUE(WaitUntilUsable(parent, id)) << "button " << id << " cannot be pressed";
    PostMessageA(GetDlgItem(parent, id), BM_CLICK, 0, 0);
}

void RunningWizard::PressBoth(HWND parent, int first, int second) {
    ASSERT_TRUE(WaitUntilUsable(parent, first)) << "button " << first << " cannot be pressed";
    ASSERT_TRUE(WaitUntilUsable(parent, second)) << "button " << second << " cannot be pressed";
    // Posted messages come before timers.
    PostMessageA(GetDlgItem(parent, first), BM_CLICK, 0, 0);
    PostMessageA(GetDlgItem(parent, second), BM_CLICK, 0, 0);
}

void RunningWizard::ClickQuickly(HWND parent, int id, int times) {
    const HWND control = GetDlgItem(parent, id);
    constexpr LPARAM kInside = MAKELPARAM(5, 5);
    for (int click = 0; click < times; ++click) {
        PostMessageA(control, click % 2 == 0 ? WM_LBUTTONDOWN : WM_LBUTTONDBLCLK, MK_LBUTTON, kInside);
        PostMessageA(control, WM_LBUTTONUP, 0, kInside);
    }
}

void RunningWizard::Command(HWND parent, int id) {
    DWORD_PTR result = 0;
    EXPECT_NE(SendMessageTimeoutA(parent, WM_COMMAND, MAKEWPARAM(id, BN_CLICKED),
                                  reinterpret_cast<LPARAM>(GetDlgItem(parent, id)), SMTO_NORMAL, kMinute, &result),
              0)
        << "the command " << id << " does not come to an end";
}

HWND RunningWizard::Focus() {
    GUITHREADINFO info{};
    info.cbSize = sizeof info;
    return GetGUIThreadInfo(process_.dwThreadId, &info) ? info.hwndFocus : nullptr;
}

bool RunningWizard::ComesToFocus(int id) {
    return Eventually([&] {
        const HWND focus = Focus();
        return focus != nullptr && GetDlgCtrlID(focus) == id;
    });
}

void RunningWizard::Type(WPARAM key) {
    const HWND focus = Focus();
    ASSERT_NE(focus, nullptr) << "nothing of the program has the focus";
    PostMessageA(focus, WM_KEYDOWN, key, 1);
    PostMessageA(focus, WM_KEYUP, key, static_cast<LPARAM>(0xC0000001));
}

void RunningWizard::CloseFromTitleBar(HWND window) {
    PostMessageA(window, WM_SYSCOMMAND, SC_CLOSE, 0);
}

bool RunningWizard::HasBox() const {
    const std::vector<HWND> windows = TopWindows();
    return std::any_of(windows.begin(), windows.end(), [](HWND window) { return ClassOf(window) == "#32770"; });
}

std::optional<Box> RunningWizard::OpenBox() const {
    for (const HWND window : TopWindows()) {
        if (ClassOf(window) == "#32770") {
            return ReadBox(window);
        }
    }
    return std::nullopt;
}

Box RunningWizard::WaitForBox(const std::string& title) {
    HWND handle = nullptr;
    EXPECT_TRUE(Eventually([&] {
        for (const HWND window : TopWindows()) {
            if (ClassOf(window) == "#32770" && TextOf(window) == title) {
                handle = window;
            }
        }
        return handle != nullptr;
    })) << "no box \""
        << title << "\"";
    return ReadBox(handle);
}

void RunningWizard::Answer(const Box& box, int button) {
    PostMessageA(GetDlgItem(box.handle, button), BM_CLICK, 0, 0);
    EXPECT_TRUE(Eventually([&] { return !IsWindow(box.handle); })) << "the box \"" << box.title << "\" stays";
}

void RunningWizard::AnswerOk(const Box& box) {
    ASSERT_EQ(box.buttons.size(), 1U) << box.title;
    Answer(box, box.buttons.front());
}

testing::AssertionResult RunningWizard::Shows(HWND window, const std::vector<look::Mark>& marks) {
    Picture picture(0, 0);
    const auto isMissing = [&](const look::Mark& mark) { return !mark.isIn(picture); };
    const bool shown = !marks.empty() && Eventually([&] {
        picture = Picture::OfClient(window);
        return std::none_of(marks.begin(), marks.end(), isMissing);
    });
    if (shown) {
        return testing::AssertionSuccess();
    }
    auto failure = testing::AssertionFailure() << "not to be seen:";
    for (const look::Mark& mark : marks) {
        if (isMissing(mark)) {
            failure << "\n  " << mark.description;
        }
    }
    const std::string saved =
        R"(Z:\tmp\wizard-)" + std::to_string(GetCurrentProcessId()) + "-" + std::to_string(GetTickCount64()) + ".bmp";
    picture.Save(saved);
    return failure << "\nthe picture is " << saved;
}
