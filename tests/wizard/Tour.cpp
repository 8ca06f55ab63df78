// A tour of the wizard, for demonstrations and pictures: from the first page to the last, with a picture of each, named
// in the order of the walk. Any release will do. The machine keeps what is installed. HV_WALK_RELEASE names the folder
// with the release, HV_WALK_PICTURES that for the pictures.

#include "tests/wizard/WizardTest.h"

// It needs what the header above includes.
#include <psapi.h>

#include <cstdio>
#include <cstdlib>
#include <functional>
#include <optional>

namespace {

std::string Variable(const char* name) {
    const char* const value = std::getenv(name);
    return value != nullptr ? value : "";
}

void Keep(const Picture& picture, const std::string& name) {
    static int count = 0;
    const std::string numbered = std::to_string(++count) + "-" + name;
    picture.Save(Variable("HV_WALK_PICTURES") + "\\" + numbered + ".bmp");
    std::printf("  %s\n", numbered.c_str());
    std::fflush(stdout);
}

void TakePicture(const std::string& name, HWND window) {
    Sleep(150);
    Keep(Picture::OfScreen(OnScreen(window)), name);
}

/// Waits until the walk can go on. Boxes that only say something are answered; a wizard that has ended, or that asks
/// something, ends the wait at once.
testing::AssertionResult Comes(RunningWizard& wizard, const std::function<bool()>& question) {
    bool hasCome = false;
    std::string said;
    const bool waited = Eventually([&] {
        hasCome = question();
        const std::optional<Box> box = hasCome ? std::nullopt : wizard.OpenBox();
        if (box) {
            said = "\n" + box->title + ": " + box->text;
            if (box->buttons.size() != 1) {
                return true;
            }
            wizard.AnswerOk(*box);
        }
        return hasCome || !wizard.IsRunning();
    });
    if (hasCome) {
        return testing::AssertionSuccess();
    }
    return testing::AssertionFailure() << (!wizard.IsRunning() ? "the wizard has ended"
                                           : waited            ? "the wizard asks"
                                                               : "it did not come within a minute")
                                       << said;
}

/// The page with this control, or null after a failed wait for it.
HWND PageThatComesWith(RunningWizard& wizard, int control) {
    HWND page = nullptr;
    EXPECT_TRUE(Comes(wizard,
                      [&] {
                          page = wizard.HasWindow() ? wizard.Page() : nullptr;
                          return page != nullptr && GetDlgItem(page, control) != nullptr;
                      }))
        << "no page with the control " << control;
    return page != nullptr && GetDlgItem(page, control) != nullptr ? page : nullptr;
}

bool CanBeRead(HANDLE process) {
    HMODULE module = nullptr;
    DWORD needed = 0;
    char path[1024];
    return K32EnumProcessModules(process, &module, sizeof module, &needed) &&
           K32GetModuleFileNameExA(process, module, path, sizeof path) > 0;
}

bool EveryProcessCanBeRead() {
    DWORD ids[1024];
    DWORD size = 0;
    bool all = K32EnumProcesses(ids, sizeof ids, &size) != FALSE;
    for (DWORD i = 0; i < size / sizeof(DWORD); ++i) {
        const HANDLE process = OpenProcess(PROCESS_QUERY_INFORMATION | PROCESS_VM_READ, FALSE, ids[i]);
        // What cannot be opened is nobody's host.
        if (process != nullptr) {
            all = CanBeRead(process) && all;
            CloseHandle(process);
        }
    }
    return all;
}

/// Until no process has come or gone for a second. Where HitFilm is installed, a process that does so is taken for a
/// host without a name, and that ends the wizard.
void WaitUntilTheMachineIsQuiet() {
    int quiet = 0;
    EXPECT_TRUE(Eventually([&] { return (quiet = EveryProcessCanBeRead() ? quiet + 1 : 0) == 50; }));
}

void WriteFile(const std::string& path, const std::string& content) {
    FILE* const file = std::fopen(path.c_str(), "wb");
    ASSERT_NE(file, nullptr) << path;
    std::fputs(content.c_str(), file);
    std::fclose(file);
}

bool Exists(const std::string& path) {
    return GetFileAttributesA(path.c_str()) != INVALID_FILE_ATTRIBUTES;
}

void Welcome(RunningWizard& wizard) {
    ASSERT_NE(PageThatComesWith(wizard, id::Agree), nullptr);
    // What is to be said of packages and hosts comes right after the window, which listens to nobody before that.
    const ULONGLONG shown = GetTickCount64();
    ASSERT_TRUE(Comes(wizard, [=] { return GetTickCount64() - shown > 1000; }));
    SetForegroundWindow(wizard.Window());
    TakePicture("welcome", wizard.Window());
}

void ReadTheAgreement(RunningWizard& wizard) {
    wizard.Press(wizard.Page(), id::ReadLicense);
    ASSERT_TRUE(Comes(wizard, [&] { return wizard.Viewers().size() == 1; })) << "no agreement to read";
    const HWND viewer = wizard.Viewers().front();
    TakePicture("agreement", viewer);
    wizard.Press(viewer, id::CloseViewer);
}

void Agree(RunningWizard& wizard) {
    wizard.Press(wizard.Page(), id::Agree);
    TakePicture("agreed", wizard.Window());
    wizard.PressForBox(wizard.Window(), id::Continue);
}

/// The first product of the list that can be switched off and on; 0 when there is none.
int FirstProduct(HWND page) {
    for (int i = 0; GetDlgItem(page, ProductId(i)) != nullptr; ++i) {
        if (IsWindowEnabled(GetDlgItem(page, ProductId(i)))) {
            return ProductId(i);
        }
    }
    return 0;
}

void ChooseProducts(RunningWizard& wizard) {
    const HWND page = PageThatComesWith(wizard, id::DeselectAll);
    ASSERT_NE(page, nullptr);
    TakePicture("selection", wizard.Window());
    ASSERT_NE(FirstProduct(page), 0) << "there is no product to choose";
    wizard.Press(page, FirstProduct(page));
    TakePicture("selection-one-off", wizard.Window());
    wizard.Press(page, id::SelectAll);
}

bool IsAtTheEnd(RunningWizard& wizard) {
    return GetDlgItem(wizard.Window(), id::Close) != nullptr;
}

/// Whether the bar of a running install is to be seen, and not full.
bool ShowsTheBar(RunningWizard& wizard) {
    const HWND page = wizard.Page();
    return page != nullptr && GetWindow(page, GW_CHILD) == nullptr &&
           Picture::OfClient(page).At(389, 80) == look::Track;
}

/// Keeps the last sight of the bar before the end; or that at the script which holds the run.
void Install(RunningWizard& wizard) {
    WaitUntilTheMachineIsQuiet();
    wizard.PressForBox(wizard.Window(), id::Continue);
    Picture seen(0, 0);
    bool isHeld = false;
    ASSERT_TRUE(Comes(wizard, [&] {
        isHeld = Exists(R"(C:\held.txt)");
        if (isHeld) {
            // The window looks at the run three times a second.
            Sleep(700);
        }
        if (ShowsTheBar(wizard)) {
            seen = Picture::OfScreen(OnScreen(wizard.Window()));
        }
        return isHeld || IsAtTheEnd(wizard);
    })) << "the install does not come to its end";
    DeleteFileA(R"(C:\hold.txt)");
    ASSERT_GT(seen.Width(), 0) << "the install was over before its page could be seen";
    Keep(seen, "installing");
}

void End(RunningWizard& wizard) {
    ASSERT_TRUE(Comes(wizard, [&] {
        const RECT part = OnScreen(wizard.Window());
        return IsAtTheEnd(wizard) && part.right - part.left == 800;
    })) << "the final page does not come";
    TakePicture("final", wizard.Window());
    wizard.Press(wizard.Window(), id::Close);
    EXPECT_EQ(wizard.ExitStatus(), 0U);
}

/// The sample release has a script in its middle by which the run is held, so its pictures are the same every time.
/// Releases without such a script run through.
void HoldTheSampleRelease() {
    WriteFile(R"(C:\hold.txt)", "requirements");
}

TEST(Tour, GoesFromTheFirstPageToTheLast) {
    HoldTheSampleRelease();
    const CommandGate gate;
    RunningWizard wizard(Variable("HV_WALK_RELEASE"));
    for (const auto step : {Welcome, ReadTheAgreement, Agree, ChooseProducts, Install, End}) {
        step(wizard);
        if (HasFailure()) {
            break;
        }
    }
    DeleteFileA(R"(C:\hold.txt)");
    DeleteFileA(R"(C:\held.txt)");
}

}  // namespace
