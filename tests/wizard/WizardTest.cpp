#include "tests/wizard/WizardTest.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <ostream>
#include <sstream>

namespace {

/// An OK button is number 1 under Wine and 2 on Windows, where it is the one that Escape presses too.
std::vector<int> OfOneNumber(std::vector<int> buttons) {
    if (buttons == std::vector<int>{IDCANCEL}) {
        buttons = {IDOK};
    }
    return buttons;
}

std::string Variable(const char* name) {
    const char* const value = std::getenv(name);
    return value != nullptr ? value : "";
}

std::string ReadHostFile(const std::string& path) {
    std::ifstream file("Z:" + path, std::ios::binary);
    EXPECT_TRUE(file) << path;
    std::ostringstream content;
    content << file.rdbuf();
    return content.str();
}

/// Copies rather than reads and writes: a release is megabytes, and each walk has one.
void CopyRelease(const std::string& to) {
    namespace fs = std::filesystem;
    std::error_code error;
    const fs::path programs("Z:" HV_PROGRAM_FOLDER);
    fs::create_directories(to + "\\packages", error);
    fs::copy_file(programs / "hvinstaller.exe", to + "\\hvinstaller.exe", error);
    ASSERT_FALSE(error) << error.message();
    fs::copy(programs / "packages", to + "\\packages", error);
    ASSERT_FALSE(error) << error.message();
}

/// Registry text without the sections whose keys begin like this.
std::string Without(const std::string& key, const std::string& text) {
    std::istringstream lines(text);
    std::string kept;
    bool isLeftOut = false;
    for (std::string line; std::getline(lines, line);) {
        if (line.rfind('[', 0) == 0) {
            isLeftOut = line.rfind("[" + key, 0) == 0;
        }
        if (!isLeftOut) {
            kept += line + '\n';
        }
    }
    return kept;
}

}  // namespace

WizardTest::WizardTest() : folder(Variable("HV_WALK_RELEASE").empty() ? R"(C:\Release)" : Variable("HV_WALK_RELEASE")) {
    StartOver();
}

void WizardTest::StartOver() {
    gate_.reset();
    machine_.reset();
    machine_ = std::make_unique<Machine>();
    if (Variable("HV_WALK_RELEASE").empty()) {
        CopyRelease(folder);
    }
}

void WizardTest::HasHosts(const std::string& name) {
    machine().Loads(ReadHostFile(HV_SAMPLE_MACHINES "/" + name + ".reg"));
}

void WizardTest::HasEveryHost() {
    const std::string all = ReadHostFile(HV_SAMPLE_MACHINES "/everything.reg");
    const std::string kept = Without(R"(HKEY_LOCAL_MACHINE\SOFTWARE\FXHOME\HitFilm)", all);
    EXPECT_LT(kept.size(), all.size());
    machine().Loads(kept);
}

void WizardTest::BreakPackage(const std::string& name) {
    const std::string path = folder + "\\packages\\" + name;
    std::string content = machine().Content(path);
    ASSERT_GT(content.size(), 100U);
    content[content.size() / 2] = static_cast<char>(content[content.size() / 2] ^ 1);
    machine().Has(path, content);
}

void WizardTest::RemovePackage(const std::string& name) {
    std::error_code error;
    EXPECT_TRUE(std::filesystem::remove(folder + "\\packages\\" + name, error)) << name << ": " << error.message();
}

void WizardTest::HoldAtScript(const std::string& part) {
    machine().Has(R"(C:\hold.txt)", part);
    gate_ = std::make_unique<CommandGate>();
}

void WizardTest::WaitUntilHeld() {
    EXPECT_TRUE(Eventually([this] {
        return machine().HasFile(R"(C:\held.txt)") && !machine().Content(R"(C:\held.txt)").empty();
    })) << "no script is held";
}

void WizardTest::LetGo() {
    const DWORD id = std::strtoul(machine().Content(R"(C:\held.txt)").c_str(), nullptr, 10);
    const HANDLE gate = OpenProcess(SYNCHRONIZE, FALSE, id);
    EXPECT_NE(gate, nullptr) << "the script is not held any more";
    DeleteFileA(R"(C:\hold.txt)");
    // It has inherited the wizard's files, which cannot be cleared away before.
    EXPECT_EQ(WaitForSingleObject(gate, 60000), WAIT_OBJECT_0);
    CloseHandle(gate);
}

void WizardTest::GoToSelection(RunningWizard& wizard) {
    wizard.Press(wizard.PageWith(id::Agree), id::Agree);
    wizard.Press(wizard.Window(), id::Continue);
    wizard.PageWith(id::DeselectAll);
}

void WizardTest::GoToInstalling(RunningWizard& wizard) {
    GoToSelection(wizard);
    wizard.Press(wizard.Window(), id::Continue);
}

void WizardTest::GoToFinal(RunningWizard& wizard) {
    GoToInstalling(wizard);
    EXPECT_TRUE(Eventually([&] { return GetDlgItem(wizard.Window(), id::Close) != nullptr; })) << "no end comes";
    EXPECT_TRUE(Eventually([&] {
        const RECT part = OnScreen(wizard.Window());
        return part.right - part.left == 800;
    })) << "the window does not widen";
}

void WizardTest::ExpectControls(HWND parent, const std::vector<Expected>& expected) {
    const std::vector<Control> controls = RunningWizard::Controls(parent);
    EXPECT_EQ(controls.size(), expected.size());
    for (const Expected& wanted : expected) {
        const Control control = RunningWizard::ControlOf(parent, wanted.id);
        EXPECT_EQ(control.part, wanted.part) << wanted.id;
        // Visible and disabled are states: they change.
        EXPECT_EQ(control.style, wanted.style & ~(WS_VISIBLE | WS_DISABLED)) << wanted.id;
        EXPECT_EQ(control.visible, wanted.visible) << wanted.id;
        EXPECT_EQ(control.enabled, wanted.enabled) << wanted.id;
    }
}

void WizardTest::ExpectBox(const Box& box, const std::string& text, const std::vector<int>& buttons, bool hasIcon,
                           HWND owner) {
    EXPECT_EQ(box.text, text);
    EXPECT_EQ(OfOneNumber(box.buttons), buttons);
    EXPECT_EQ(box.hasIcon, hasIcon);
    EXPECT_EQ(box.owner, owner);
}

void WizardTest::KeepPicture(const std::string& name, HWND window) {
    const std::string pictures = Variable("HV_WALK_PICTURES");
    if (!pictures.empty()) {
        Sleep(100);
        Picture::OfScreen(OnScreen(window)).Save(pictures + "/" + name + ".bmp");
    }
}

std::string WizardTest::Registry() const {
    return Without(R"(HKEY_LOCAL_MACHINE\SYSTEM\CurrentControlSet\Hardware Profiles)", machine().Registry());
}

bool WizardTest::IsRegistered() const {
    return Registry().find(R"(CurrentVersion\Uninstall\)") != std::string::npos;
}

const std::vector<std::string>& ProductNames() {
    static const std::vector<std::string> names = {
        "Tessaly Denoise",    "Tessaly Glow",   "Tessaly Grain",  "Tessaly Keyer",       "Tessaly Preset Collection",
        "Tessaly Script Kit", "Tessaly Steady", "Tessaly Titler", "Tessaly Transitions", "Tessaly Viewer"};
    return names;
}

RECT ProductPart(int index) {
    const LONG left = index < 6 ? 10 : 10 + 185 + 1;
    const LONG top = 80 + index % 6 * 22;
    return {left, top, left + 185, top + 22};
}

int ProductId(int index) {
    return id::FirstProduct + index;
}
