// From the start of the program to the first page.
#include "tests/installer/WizardTest.h"

namespace {

using HV::WizardPart;

class WizardStart : public WizardTest {};

TEST_F(WizardStart, HasNothingBeforeItIsInitialized) {
    EXPECT_EQ(wizard.window, nullptr);
    EXPECT_EQ(wizard.state, HV::WizardState::Welcome);
    EXPECT_FALSE(wizard.agreed);
    EXPECT_FALSE(wizard.hasProductChoice);
    EXPECT_EQ(wizard.welcomePage, nullptr);
    EXPECT_EQ(wizard.selectionPage, nullptr);
    EXPECT_EQ(wizard.installingPage, nullptr);
    EXPECT_EQ(wizard.finalPage, nullptr);
    EXPECT_EQ(wizard.job, nullptr);
    EXPECT_EQ(wizard.eulaController, nullptr);
    EXPECT_FALSE(wizard.initialized);
}

TEST_F(WizardStart, NumbersItsStates) {
    EXPECT_EQ(static_cast<int>(HV::WizardState::Welcome), 0);
    EXPECT_EQ(static_cast<int>(HV::WizardState::Selection), 1);
    EXPECT_EQ(static_cast<int>(HV::WizardState::Installing), 2);
    EXPECT_EQ(static_cast<int>(HV::WizardState::Finished), 3);
    EXPECT_EQ(static_cast<int>(HV::WizardState::Failed), 4);
}

TEST_F(WizardStart, ShowsTheFirstPageInOrder) {
    Ships(Product("glow"));
    Start(7);
    const std::string caption = Model().GetString("installer.title.noversion");
    EXPECT_EQ(toolkit.calls, (std::vector<std::string>{"CreateInstallerWindow \"" + caption + "\"", "CreateWelcomePage",
                                                       "ShowWindow MainWindow 7", "SetContinueText \"Continue\""}));
    EXPECT_TRUE(wizard.hasProductChoice);
    EXPECT_TRUE(toolkit.boxes.empty());
    EXPECT_EQ(toolkit.VisiblePages(), std::vector{WizardPart::WelcomePage});
    EXPECT_FALSE(toolkit.CanPress(HV::kContinueCommand));
    EXPECT_FALSE(toolkit.CanPress(HV::kBackCommand));
    EXPECT_TRUE(toolkit.CanPress(HV::kCancelCommand));
    EXPECT_EQ(wizard.selectionPage, nullptr);
    EXPECT_TRUE(wizard.initialized);
}

TEST_F(WizardStart, OffersTheInstallAtOnceWhenThereIsNothingToChoose) {
    Ships(Hidden("core"));
    Begin();
    EXPECT_FALSE(wizard.hasProductChoice);
    EXPECT_EQ(toolkit.Window().continueText, "Install");
    EXPECT_TRUE(toolkit.boxes.empty()) << "hidden packages alone lack no hosts";
}

/// Each of these is told with the window on the screen behind the box.
class InvalidPackages : public WizardTest {
protected:
    void ExpectRefusal() {
        toolkit.AnswerNext(kOk);
        BeginAndEnd();
        EXPECT_EQ(toolkit.boxes, std::vector{kInvalidPackages});
        EXPECT_TRUE(toolkit.IsVisible(WizardPart::MainWindow));
        EXPECT_EQ(toolkit.VisiblePages(), std::vector{WizardPart::WelcomePage});
        EXPECT_EQ(toolkit.CallsFrom("ShowWindow MainWindow 10"),
                  (std::vector<std::string>{"ShowWindow MainWindow 10", "MessageBeep 16",
                                            "MessageBoxA \"Error: invalid installer packages.\"", "ExitProcess 0"}));
    }
};

TEST_F(InvalidPackages, EndTheRunWhenAByteIsChanged) {
    Ships(Product("glow"));
    const std::string file = InPackages("com.halvorn.glow.hvpkg");
    machine.Has(file, machine.Content(file) + "x");
    ExpectRefusal();
}

TEST_F(InvalidPackages, EndTheRunWhenAFileIsNotOfTheRelease) {
    Ships(Product("glow"));
    (void)setup.Has(Product("stranger"));
    ExpectRefusal();
}

TEST_F(InvalidPackages, EndTheRunWhenThereIsNone) {
    ExpectRefusal();
}

TEST_F(InvalidPackages, EndTheRunWhenTheFolderIsGone) {
    RemovePackagesFolder();
    ExpectRefusal();
}

TEST_F(InvalidPackages, EndTheRunBeforeMissingHostsAreLookedAt) {
    Ships(HostProduct("glow", "aftereffects"));
    (void)setup.Has(Product("stranger"));
    ExpectRefusal();
}

/// The window stands behind the boxes that come at the start, and they do not keep the user from it.
class BehindTheFirstBox : public WizardTest {
protected:
    /// The way to an install first, then every other button.
    void PressEverything() {
        const auto before = toolkit.calls;
        for (const int command : {HV::kAgreeCommand, HV::kContinueCommand, HV::kContinueCommand, HV::kBackCommand,
                                  HV::kReadLicenseCommand, HV::kWhatsNewCommand, HV::kResourcesCommand,
                                  HV::kDisagreeCommand, HV::kCancelCommand, HV::kCloseCommand}) {
            EXPECT_FALSE(wizard.CanPerform(command)) << command;
            wizard.Perform(command);
            ++pressed;
        }
        EXPECT_EQ(toolkit.calls, before);
        EXPECT_FALSE(wizard.agreed);
        EXPECT_EQ(wizard.state, HV::WizardState::Welcome);
        EXPECT_EQ(wizard.selectionPage, nullptr);
        EXPECT_EQ(wizard.job, nullptr);
    }

    void AnswerAfterPressing() {
        toolkit.AnswerNext(kOk, [this] { PressEverything(); });
    }

    int pressed = 0;
};

TEST_F(BehindTheFirstBox, RefusedPackagesCannotBeInstalled) {
    Ships(Product("glow"));
    const std::string file = InPackages("com.halvorn.glow.hvpkg");
    machine.Has(file, machine.Content(file) + "x");
    const auto before = machine.Files();
    AnswerAfterPressing();
    BeginAndEnd();
    EXPECT_EQ(pressed, 10);
    EXPECT_EQ(toolkit.boxes, std::vector{kInvalidPackages});
    EXPECT_TRUE(toolkit.quits.empty());
    EXPECT_EQ(machine.Files(), before);
}

TEST_F(BehindTheFirstBox, NothingIsInstalledForHostsThatAreNotThere) {
    Ships(HostProduct("glow", "aftereffects"));
    Ships(Hidden("core"));
    const auto before = machine.Files();
    AnswerAfterPressing();
    BeginAndEnd();
    EXPECT_EQ(pressed, 10);
    EXPECT_EQ(toolkit.boxes, std::vector{kNoHosts});
    EXPECT_TRUE(toolkit.quits.empty());
    EXPECT_EQ(machine.Files(), before);
}

TEST_F(BehindTheFirstBox, NobodyAgreesBeforeTheWarningIsRead) {
    Ships(HostProduct("glow", "aftereffects"));
    Ships(Product("titler"));
    AnswerAfterPressing();
    Begin();
    EXPECT_EQ(pressed, 10);
    EXPECT_EQ(toolkit.boxes, std::vector{kMissingHosts});
    EXPECT_TRUE(toolkit.quits.empty());
    // The wizard begins where it would have begun.
    EXPECT_EQ(toolkit.VisiblePages(), std::vector{WizardPart::WelcomePage});
    EXPECT_EQ(toolkit.Window().continueText, "Continue");
    EXPECT_FALSE(toolkit.CanPress(HV::kContinueCommand));
    toolkit.Press(HV::kAgreeCommand);
    toolkit.Press(HV::kContinueCommand);
    EXPECT_EQ(toolkit.VisiblePages(), std::vector{WizardPart::SelectionPage});
}

class Hosts : public WizardTest {};

TEST_F(Hosts, EndTheRunWhenEveryProductLacksThem) {
    Ships(HostProduct("glow", "aftereffects"));
    Ships(HostProduct("keyer", "resolve"));
    Ships(Hidden("core"));
    toolkit.AnswerNext(kOk);
    BeginAndEnd();
    EXPECT_EQ(toolkit.boxes, std::vector{kNoHosts});
    EXPECT_TRUE(toolkit.IsVisible(WizardPart::MainWindow));
}

TEST_F(Hosts, AreWarnedOfWhenAProductLacksThem) {
    Ships(HostProduct("glow", "aftereffects"));
    Ships(Product("titler"));
    toolkit.AnswerNext(kOk);
    Begin();
    EXPECT_EQ(toolkit.boxes, std::vector{kMissingHosts});
    EXPECT_EQ(toolkit.CallsFrom("ShowWindow MainWindow 10"),
              (std::vector<std::string>{"ShowWindow MainWindow 10", "MessageBeep 48",
                                        "MessageBoxA \"Warning: missing hosts.\"", "SetContinueText \"Continue\""}));
    EXPECT_TRUE(wizard.hasProductChoice);
}

TEST_F(Hosts, GoUnmentionedWhenTheyAreThere) {
    HasHostsOf("motion-design");
    Ships(HostProduct("glow", "aftereffects"));
    Ships(HostProduct("cuts", "premiere"));
    Begin();
    EXPECT_TRUE(toolkit.boxes.empty());
}

TEST_F(Hosts, GoUnmentionedWhenOnlyAHiddenPackageLacksThem) {
    Ships(Product("titler"));
    Ships(PackageBuilder("com.halvorn.bridge").Payload("plugin").ForHost("resolve").File("b.aex", "b"));
    Begin();
    EXPECT_TRUE(toolkit.boxes.empty());
}

}  // namespace
