// A tour of the wizard, for demonstrations and pictures: from the first page to the last, with a picture of each. The
// machine keeps what is installed. HV_WALK_RELEASE names the folder with the release, HV_WALK_PICTURES that for the
// pictures.

#include "tests/wizard/WizardTest.h"

// It needs what the header above includes.
#include <psapi.h>

#include <cstdio>
#include <cstdlib>

namespace {

std::string Variable(const char* name) {
    const char* const value = std::getenv(name);
    return value != nullptr ? value : "";
}

void TakePicture(const std::string& name, HWND window) {
    Sleep(150);
    Picture::OfScreen(OnScreen(window)).Save(Variable("HV_WALK_PICTURES") + "\\" + name + ".bmp");
    std::printf("  %s\n", name.c_str());
    std::fflush(stdout);
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

void ReadTheAgreement(RunningWizard& wizard) {
    wizard.Press(wizard.PageWith(id::ReadLicense), id::ReadLicense);
    ASSERT_TRUE(Eventually([&] { return wizard.Viewers().size() == 1; }));
    const HWND viewer = wizard.Viewers().front();
    TakePicture("agreement", viewer);
    wizard.Press(viewer, id::CloseViewer);
}

void ChooseProducts(RunningWizard& wizard) {
    wizard.Press(wizard.Window(), id::Continue);
    const HWND page = wizard.PageWith(id::DeselectAll);
    TakePicture("selection", wizard.Window());
    wizard.Press(page, ProductId(2));
    wizard.Press(page, ProductId(8));
    TakePicture("selection-some-off", wizard.Window());
    wizard.Press(page, id::SelectAll);
}

/// Held at a script in the middle, so that there is something to see.
void Install(RunningWizard& wizard) {
    WaitUntilTheMachineIsQuiet();
    wizard.Press(wizard.Window(), id::Continue);
    EXPECT_TRUE(Eventually([] { return Exists(R"(C:\held.txt)"); }));
    // The window looks at the run three times a second.
    Sleep(700);
    TakePicture("installing", wizard.Window());
    DeleteFileA(R"(C:\hold.txt)");
}

TEST(Tour, GoesFromTheFirstPageToTheLast) {
    WriteFile(R"(C:\hold.txt)", "requirements");
    SetEnvironmentVariableA("COMSPEC", "Z:" HV_PROGRAM_FOLDER "/script_gate.exe");
    RunningWizard wizard(Variable("HV_WALK_RELEASE"));
    wizard.PageWith(id::Agree);
    SetForegroundWindow(wizard.Window());
    TakePicture("welcome", wizard.Window());
    ReadTheAgreement(wizard);
    wizard.Press(wizard.Page(), id::Agree);
    TakePicture("agreed", wizard.Window());
    ChooseProducts(wizard);
    Install(wizard);
    ASSERT_TRUE(Eventually([&] {
        const RECT part = OnScreen(wizard.Window());
        return part.right - part.left == 800;
    }));
    TakePicture("final", wizard.Window());
    wizard.Press(wizard.Window(), id::Close);
    EXPECT_EQ(wizard.ExitStatus(), 0U);
    DeleteFileA(R"(C:\held.txt)");
}

}  // namespace
