// What suites and products are called, as the wizard shows it: every character of it, and no more than there is room
// for.
#include <filesystem>

#include "tests/support/PackageBuilder.h"
#include "tests/support/RunningProgram.h"
#include "tests/wizard/WizardTest.h"

namespace {

const std::string kSuite = "Café & Crème – R&D Suite™";
/// Two letters of the first follow an ampersand: neither is a key.
const std::string kCheese = "Blend&Zoom & Söhne – Übergänge™";
const std::string kLong = "A façade of a name & far too long for one column – it has to end early™";
const std::string kAscii = "Plain & simple";

std::string Times(int count, const std::string& text) {
    std::string all;
    for (int i = 0; i < count; ++i) {
        all += text;
    }
    return all;
}

/// A release of a test's own, in C:\Named, with the names that it gives.
class NamesTest : public WizardTest {
protected:
    NamesTest() {
        machine().HasFolder(named + R"(\packages)");
        std::error_code error;
        std::filesystem::copy_file("Z:" HV_PROGRAM_FOLDER "/wizard_of_any_release.exe", named + R"(\hvinstaller.exe)",
                                   error);
        EXPECT_FALSE(error) << error.message();
    }

    void HasSuite(const std::string& name) {
        machine().Has(
            named + R"(\packages\suite.json)",
            R"({"identifier": "com.halvorn.named", "version": "1.0", "product_type": "0", "display_name": ")" + name +
                R"("})");
    }

    /// A product that needs no host, in a file of this name, which waits at its script when a test asks for that.
    void HasProduct(const std::string& name, const std::string& file) {
        (void)PackageBuilder("com.halvorn." + file)
            .DisplayName(name)
            .Policy("show", "true")
            .Payload("resource")
            .To("programdata", "Named")
            .File(file + ".txt", file)
            .Preflight("echo wait-here")
            .Named(file + ".hvpkg")
            .WriteTo(named + R"(\packages)");
    }

    static look::Mark TitleLine(HWND window, const std::string& text) {
        RECT client{};
        GetClientRect(window, &client);
        return look::WordsInOneLine(text, {170, 0, client.right, 28}, look::Title, look::AtTheBottom, look::Text,
                                    look::Page);
    }

    static look::Mark Wait(const std::string& text) {
        return look::WordsInOneLine(text, {1, 46, 390, 68}, look::Wait, look::OneLine, look::Text, look::Page);
    }

    static look::Mark Status(const std::string& text) {
        return look::WordsInOneLine(text, {1, 94, 370, 113}, look::Body, look::OneLine, look::Text, look::Page);
    }

    static look::Mark Paragraph(const std::string& text) {
        return look::Words(text, {0, 20, 410, 65}, look::Body, look::Wrapped, look::Text, look::Page);
    }

    const std::string named = R"(C:\Named)";
};

TEST_F(NamesTest, AreShownAsTheyAreWritten) {
    HasSuite(kSuite);
    HasProduct(kCheese, "Käse & Brot™");
    HasProduct(kAscii, "plain");
    HoldAtScript("wait-here");
    RunningWizard wizard(named);
    const HWND window = wizard.Window();

    EXPECT_EQ(TextOf(window), kSuite + " Installer");
    EXPECT_TRUE(wizard.Shows(window, {TitleLine(window, kSuite + " 1.0 Installer")}));
    EXPECT_TRUE(wizard.Shows(wizard.PageWith(id::Agree),
                             {Paragraph("This will install " + kSuite +
                                        " 1.0 on your computer.\r\nIt is recommended you close all other applications "
                                        "before continuing.")}));
    KeepPicture("names-welcome", window);

    GoToSelection(wizard);
    const HWND page = wizard.Page();
    EXPECT_TRUE(wizard.Shows(page, {look::CheckBox(kCheese, ProductPart(0), true, true),
                                    look::CheckBox(kAscii, ProductPart(1), true, true)}));
    KeepPicture("names-selection", window);

    wizard.Press(window, id::Continue);
    WaitUntilHeld();
    EXPECT_TRUE(wizard.Shows(wizard.PageWithoutControls(), {Wait("Installing " + kSuite + ", please wait..."),
                                                            Status("Installing Käse & Brot™.hvpkg...")}));
    KeepPicture("names-installing", window);
    LetGo();
    EXPECT_TRUE(Eventually([&] { return GetDlgItem(window, id::Close) != nullptr; }));
}

TEST_F(NamesTest, EndInThreeDotsWhereTheyFindNoRoom) {
    const std::string suite = Times(4, "Tessaly Übergänge & more™ ") + "Suite";
    const std::string file = Times(4, "an überlong file & name ") + "end";
    HasSuite(suite);
    HasProduct(kLong, file);
    HoldAtScript("wait-here");
    RunningWizard wizard(named);
    const HWND window = wizard.Window();

    const std::string title = suite + " 1.0 Installer";
    RECT client{};
    GetClientRect(window, &client);
    EXPECT_NE(Picture::Shortened(title, client.right - 170, look::Title.height, look::Title.weight), title);
    EXPECT_EQ(TextOf(window), suite + " Installer");
    EXPECT_TRUE(wizard.Shows(window, {TitleLine(window, title)}));
    KeepPicture("long-names-welcome", window);

    GoToSelection(wizard);
    EXPECT_NE(Picture::Shortened(kLong, 161, look::Body.height, look::Body.weight), kLong);
    EXPECT_TRUE(wizard.Shows(wizard.Page(), {look::CheckBox(kLong, ProductPart(0), true, true)}));
    KeepPicture("long-names-selection", window);

    wizard.Press(window, id::Continue);
    WaitUntilHeld();
    EXPECT_TRUE(wizard.Shows(wizard.PageWithoutControls(), {Wait("Installing " + suite + ", please wait..."),
                                                            Status("Installing " + file + ".hvpkg...")}));
    KeepPicture("long-names-installing", window);
    LetGo();
}

// The paragraph has room for three lines.
TEST_F(NamesTest, EndInThreeDotsOnTheLastWholeLineOfTheFirstPage) {
    HasSuite(Times(30, "very "));
    HasProduct(kAscii, "plain");
    RunningWizard wizard(named);
    const HWND page = wizard.PageWith(id::Agree);
    KeepPicture("long-paragraph", wizard.Window());
    const Picture shown = Picture::OfClient(page);
    EXPECT_FALSE(shown.IsAll({0, 20 + 26, 410, 20 + 39}, look::Page)) << "no third line";
    EXPECT_TRUE(shown.IsAll({0, 20 + 39, 410, 85}, look::Page)) << "half a line";
}

// An ampersand in the text of a control makes a key of the letter after it, unless it is doubled.
TEST_F(NamesTest, MakeNoKeysOfTheirLetters) {
    HasSuite(kSuite);
    HasProduct(kCheese, "cheese");
    HasProduct(Times(40, "Long & ") + "end", "long");
    RunningWizard wizard(named);
    GoToSelection(wizard);
    const HWND page = wizard.Page();
    const HWND box = GetDlgItem(page, ProductId(0));
    EXPECT_EQ(TextOf(box), "Blend&&Zoom && Söhne – Übergänge™");
    // Cut at 255 letters, each ampersand counted once.
    EXPECT_EQ(TextOf(GetDlgItem(page, ProductId(1))), Times(36, "Long && ") + "Lon");

    // With the Alt key and without; what is posted last is dealt with last.
    bool other = true;
    for (const UINT message : {WM_SYSCHAR, WM_CHAR}) {
        PostMessageW(GetDlgItem(page, id::DeselectAll), message, 'z', message == WM_SYSCHAR ? 1 << 29 | 1 : 1);
        PostMessageW(GetDlgItem(page, ProductId(1)), BM_CLICK, 0, 0);
        other = !other;
        EXPECT_TRUE(wizard.Shows(page, {look::CheckBox(kCheese, ProductPart(0), true, true),
                                        look::CheckBox(Times(40, "Long & ") + "end", ProductPart(1), other, true)}))
            << message;
    }
    EXPECT_TRUE(other);
}

TEST_F(NamesTest, OfRunningProgramsStandInTheBoxAsTheyAreWritten) {
    HasHosts("motion-design");
    HasSuite(kSuite);
    (void)PackageBuilder("com.halvorn.host")
        .DisplayName("For a host")
        .Policy("show", "true")
        .Payload("plugin")
        .ForHost("premiere")
        .File("host.prm", "host")
        .WriteTo(named + R"(\packages)");
    // Whatever runs below a folder of this name counts.
    const RunningProgram host(machine(), R"(C:\Adobe Premiere Pro.exe\Käse & Brot – R&D™.exe)");
    RunningWizard wizard(named);
    GoToSelection(wizard);
    wizard.PressForBox(wizard.Window(), id::Continue);
    const Box box = wizard.WaitForBox("Host applications running.");
    EXPECT_EQ(box.text,
              "Käse & Brot – R&D™ is a host application for products in the installer; please quit this application "
              "and retry or cancel to exit the installer.");
    KeepPicture("names-box", box.handle);
    wizard.Answer(box, IDCANCEL);
    EXPECT_EQ(wizard.ExitStatus(), 0U);
}

}  // namespace
