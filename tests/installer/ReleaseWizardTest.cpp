// The sample release, installed by the wizard as a user does it, from a folder with a name that has everything.
#include "hvframework/FileUtils.h"
#include "tests/installer/WizardWalk.h"

namespace {

constexpr const char* kFolder = R"(C:\Users\Public\Ann's, Bob's & (new) = Downloads)";

class ReleaseWizard : public WizardWalk {
protected:
    ReleaseWizard() : WizardWalk({PackagesFolder()}) {
        EXPECT_EQ(HVL::FileUtils::CopyFileOrDirectory(HV_RELEASE_PACKAGES, PackagesFolder()), 0);
    }

    static std::string PackagesFolder() { return std::string(kFolder) + R"(\packages)"; }
    static constexpr const char* kGlow =
        R"(C:\Program Files\Adobe\Common\Plug-ins\7.0\MediaCore\Halvorn\Tessaly\TessalyGlow.aex)";
    static constexpr const char* kViewerHistory =
        R"(C:\ProgramData\Halvorn\.hvdeploy\history\com.halvorn.tessaly.viewer_v4.2.0_hvmanifest.xml)";
};

TEST_F(ReleaseWizard, InstallsEverythingOnAMachineWithEveryHost) {
    HasHostsOf("everything");
    GoToSelection();
    EXPECT_EQ(toolkit.Window().caption, Model().GetString("installer.title.noversion"));
    EXPECT_FALSE(toolkit.Window().caption.empty());
    EXPECT_TRUE(toolkit.boxes.empty());
    EXPECT_EQ(toolkit.Selection().items.size(), Model().ShownIdentifiers().size());
    (void)InstallAndPoll();
    EXPECT_EQ(Argument("dir="), '"' + PackagesFolder() + '"');
    EXPECT_EQ(Argument("skip="), "");
    EXPECT_TRUE(machine.HasFile(kGlow));
    EXPECT_TRUE(machine.HasFile(kViewerHistory));
}

TEST_F(ReleaseWizard, InstallsWhatNeedsNoHostOnACleanMachine) {
    toolkit.AnswerNext(kOk);
    GoToSelection();
    EXPECT_EQ(toolkit.boxes, std::vector{kMissingHosts});
    std::string skipped;
    for (const std::string& identifier : toolkit.UncheckedIdentifiers(toolkit.Selection())) {
        skipped += (skipped.empty() ? "" : ",") + identifier;
    }
    EXPECT_NE(skipped.find("com.halvorn.tessaly.glow"), std::string::npos);
    (void)InstallAndPoll();
    EXPECT_EQ(Argument("skip="), '"' + skipped + '"');
    EXPECT_FALSE(machine.HasFile(kGlow));
    EXPECT_TRUE(machine.HasFile(kViewerHistory));
}

TEST_F(ReleaseWizard, LeavesOutWhatIsNotChosen) {
    HasHostsOf("everything");
    GoToSelection();
    toolkit.Toggle("com.halvorn.tessaly.glow");
    (void)InstallAndPoll();
    EXPECT_EQ(Argument("skip="), R"("com.halvorn.tessaly.glow")");
    EXPECT_FALSE(machine.HasFile(kGlow));
    EXPECT_TRUE(machine.HasFile(kViewerHistory));
}

TEST_F(ReleaseWizard, IsRefusedWithAStranger) {
    machine.Has(PackagesFolder() + R"(\com.halvorn.stranger.zip)", "not of this release");
    toolkit.AnswerNext(kOk);
    BeginAndEnd();
    EXPECT_EQ(toolkit.boxes, std::vector{kInvalidPackages});
}

}  // namespace
