// What the buttons do, state by state.
#include "tests/installer/WizardTest.h"

namespace {

using HV::WizardPart;
using HV::WizardState;

constexpr WizardState kStates[] = {WizardState::Welcome, WizardState::Selection, WizardState::Installing,
                                   WizardState::Finished, WizardState::Failed};

class WizardCommands : public WizardTest {
protected:
    WizardCommands() {
        Ships(Product("glow"));
        Ships(Product("keyer"));
    }
};

// The identifiers of the controls, as whoever drives the window from outside knows them.
TEST(WizardCommandNumbers, AreThoseOfTheControls) {
    EXPECT_EQ(HV::kContinueCommand, 1124);
    EXPECT_EQ(HV::kBackCommand, 1125);
    EXPECT_EQ(HV::kCancelCommand, 1126);
    EXPECT_EQ(HV::kReadLicenseCommand, 1127);
    EXPECT_EQ(HV::kAgreeCommand, 1128);
    EXPECT_EQ(HV::kDisagreeCommand, 1129);
    EXPECT_EQ(HV::kWhatsNewCommand, 1133);
    EXPECT_EQ(HV::kResourcesCommand, 1134);
    EXPECT_EQ(HV::kCloseCommand, 1165);
    EXPECT_EQ(HV::kProgressTimer, 62017U);
    EXPECT_EQ(HV::kGrowTimer, 62018U);
}

TEST_F(WizardCommands, AllButContinueAndBackMayAlwaysRun) {
    Begin();
    int asked = 0;
    for (const WizardState state : kStates) {
        wizard.state = state;
        for (const int command : {HV::kCancelCommand, HV::kCloseCommand, HV::kReadLicenseCommand, HV::kAgreeCommand,
                                  HV::kDisagreeCommand, HV::kWhatsNewCommand, HV::kResourcesCommand}) {
            EXPECT_TRUE(wizard.CanPerform(command)) << command << " in " << static_cast<int>(state);
            ++asked;
        }
    }
    EXPECT_EQ(asked, 35);
    EXPECT_EQ(toolkit.calls.size(), 4U) << "to ask does nothing";
}

TEST_F(WizardCommands, BackMayRunOnTheSelectionPageAlone) {
    Begin();
    int asked = 0;
    for (const WizardState state : kStates) {
        wizard.state = state;
        EXPECT_EQ(wizard.CanPerform(HV::kBackCommand), state == WizardState::Selection) << static_cast<int>(state);
        ++asked;
    }
    EXPECT_EQ(asked, 5);
}

TEST_F(WizardCommands, BackDoesNothingElsewhere) {
    BeginAndAgree();
    const auto before = toolkit.calls;
    int tried = 0;
    for (const WizardState state : {WizardState::Welcome, WizardState::Installing, WizardState::Finished}) {
        wizard.state = state;
        wizard.Perform(HV::kBackCommand);
        EXPECT_EQ(wizard.state, state);
        ++tried;
    }
    EXPECT_EQ(tried, 3);
    EXPECT_EQ(toolkit.calls, before);
}

TEST_F(WizardCommands, ContinueMayNotRunDuringTheInstall) {
    GoToSelection();
    wizard.state = WizardState::Installing;
    EXPECT_FALSE(wizard.CanPerform(HV::kContinueCommand));
    wizard.state = WizardState::Selection;
    EXPECT_TRUE(wizard.CanPerform(HV::kContinueCommand));
}

TEST_F(WizardCommands, ContinueMayRunInEveryOtherState) {
    Begin();
    for (const WizardState state : {WizardState::Welcome, WizardState::Finished, WizardState::Failed}) {
        wizard.state = state;
        EXPECT_TRUE(wizard.CanPerform(HV::kContinueCommand)) << static_cast<int>(state);
    }
}

TEST_F(WizardCommands, ContinueNeedsTheAgreementOnTheSelectionPage) {
    GoToSelection();
    toolkit.DeselectAll();
    wizard.agreed = false;
    EXPECT_FALSE(wizard.CanPerform(HV::kContinueCommand));
    wizard.Perform(HV::kContinueCommand);
    EXPECT_EQ(wizard.state, WizardState::Selection);
    EXPECT_TRUE(toolkit.boxes.empty()) << "the missing agreement comes before the missing choice";
}

TEST_F(WizardCommands, ContinueDoesNothingOnTheFirstPageWithoutTheAgreement) {
    Begin();
    const auto before = toolkit.calls;
    wizard.Perform(HV::kContinueCommand);
    EXPECT_EQ(toolkit.calls, before);
    EXPECT_EQ(wizard.state, WizardState::Welcome);
    EXPECT_EQ(wizard.selectionPage, nullptr);
}

TEST_F(WizardCommands, ContinueDoesNothingAfterAFailure) {
    GoToSelection();
    wizard.state = WizardState::Failed;
    const auto before = toolkit.calls;
    wizard.Perform(HV::kContinueCommand);
    EXPECT_EQ(toolkit.calls, before);
}

TEST_F(WizardCommands, ContinueEndsTheFinishedWizard) {
    Begin();
    wizard.state = WizardState::Finished;
    wizard.Perform(HV::kContinueCommand);
    EXPECT_EQ(toolkit.quits, std::vector{0});
}

TEST_F(WizardCommands, OthersDoNothing) {
    BeginAndAgree();
    const auto before = toolkit.calls;
    int tried = 0;
    for (const int command : {0, 1, 2, 1123, 1130, 1131, 1132, 1135, 1144, 1164, 1166, -1}) {
        EXPECT_FALSE(wizard.CanPerform(command)) << command;
        wizard.Perform(command);
        ++tried;
    }
    EXPECT_EQ(tried, 12);
    EXPECT_EQ(toolkit.calls, before);
}

TEST_F(WizardCommands, AgreeOpensTheWayAndCannotBeTakenBack) {
    Begin();
    toolkit.Press(HV::kAgreeCommand);
    EXPECT_EQ(toolkit.CallsFrom("Press Agree"),
              (std::vector<std::string>{"Press Agree", "EnableWindow ContinueButton true",
                                        "SetContinueHighlighted true", "SetContinueText \"Continue\"",
                                        "EnableWindow AgreeButton false", "RedrawWindow AgreeButton",
                                        "EnableWindow DisagreeButton false", "RedrawWindow DisagreeButton"}));
    EXPECT_TRUE(wizard.agreed);
    EXPECT_EQ(wizard.state, WizardState::Welcome);
    EXPECT_TRUE(toolkit.CanPress(HV::kContinueCommand));
    EXPECT_TRUE(toolkit.Window().continueHighlighted);
    EXPECT_FALSE(toolkit.CanPress(HV::kAgreeCommand));
    EXPECT_FALSE(toolkit.CanPress(HV::kDisagreeCommand));
    EXPECT_TRUE(toolkit.CanPress(HV::kReadLicenseCommand));
}

TEST_F(WizardCommands, DisagreeEndsTheWizard) {
    Begin();
    toolkit.Press(HV::kDisagreeCommand);
    EXPECT_EQ(toolkit.quits, std::vector{0});
    EXPECT_FALSE(wizard.agreed);
}

TEST_F(WizardCommands, CancelAndCloseEndTheWizardInEveryState) {
    Begin();
    int tried = 0;
    for (const WizardState state : kStates) {
        for (const int command : {HV::kCancelCommand, HV::kCloseCommand}) {
            wizard.state = state;
            wizard.Perform(command);
            ++tried;
        }
    }
    EXPECT_EQ(tried, 10);
    EXPECT_EQ(toolkit.quits, std::vector<int>(10, 0));
    EXPECT_TRUE(toolkit.exits.empty());
}

TEST_F(WizardCommands, CancelLeavesAnEngineAloneThatDoesNotExistYet) {
    Begin();
    HV::DeployJob notStarted("");
    wizard.job = &notStarted;
    wizard.state = WizardState::Installing;
    wizard.Perform(HV::kCancelCommand);
    EXPECT_EQ(toolkit.quits, std::vector{0});
    EXPECT_FALSE(log.Has("CRIT hvdeploy-detail: Cancel invoked"));
    wizard.job = nullptr;
}

TEST_F(WizardCommands, CancelLeavesTheEngineAloneOutsideOfTheInstall) {
    Begin();
    HV::DeployJob job("");
    job.cli = std::make_unique<HV::DeployCLI>(&job);
    wizard.job = &job;
    int tried = 0;
    for (const WizardState state :
         {WizardState::Welcome, WizardState::Selection, WizardState::Finished, WizardState::Failed}) {
        wizard.state = state;
        wizard.Perform(HV::kCancelCommand);
        ++tried;
    }
    EXPECT_EQ(tried, 4);
    EXPECT_FALSE(log.Has("CRIT hvdeploy-detail: Cancel invoked"));
    wizard.state = WizardState::Installing;
    wizard.Perform(HV::kCancelCommand);
    EXPECT_TRUE(log.Has("CRIT hvdeploy-detail: Cancel invoked"));
    wizard.job = nullptr;
}

TEST_F(WizardCommands, ReadLicenseOpensAnotherViewerAtEachPress) {
    Begin();
    EXPECT_EQ(wizard.eulaController, nullptr);
    toolkit.Press(HV::kReadLicenseCommand);
    toolkit.Press(HV::kReadLicenseCommand);
    EXPECT_EQ(wizard.eulaController, &toolkit.Viewers());
    EXPECT_EQ(toolkit.Viewers().opened, 2);
    EXPECT_FALSE(toolkit.CanPress(HV::kContinueCommand)) << "to read is not to agree";
    toolkit.Press(HV::kAgreeCommand);
    toolkit.Press(HV::kReadLicenseCommand);
    EXPECT_EQ(toolkit.Viewers().opened, 3);
}

class WizardLinks : public WizardTest {
protected:
    WizardLinks() { Ships(Product("glow")); }

    std::vector<std::string> UrlsOf(const std::string& productUrl) {
        ShipsSuiteWithUrl(productUrl);
        Begin();
        wizard.Perform(HV::kWhatsNewCommand);
        wizard.Perform(HV::kResourcesCommand);
        return toolkit.urls;
    }
    using Urls = std::vector<std::string>;
};

TEST_F(WizardLinks, LeadBelowTheProductsPage) {
    EXPECT_EQ(UrlsOf("https://x/tessaly"), (Urls{"https://x/tessaly/whats-new/", "https://x/tessaly/resources/"}));
}

TEST_F(WizardLinks, LeadBelowAProductsPageWithASlash) {
    EXPECT_EQ(UrlsOf("https://x/tessaly/"), (Urls{"https://x/tessaly/whats-new/", "https://x/tessaly/resources/"}));
}

TEST_F(WizardLinks, KeepToThePageOfTheLanternSuiteForItsNews) {
    EXPECT_EQ(UrlsOf("https://x/lantern-suite"),
              (Urls{"https://x/lantern-suite", "https://x/lantern-suite/resources/"}));
}

TEST_F(WizardLinks, KeepToThePageOfTheHarbourSuiteForItsNews) {
    EXPECT_EQ(UrlsOf("https://x/harbour-suite/"),
              (Urls{"https://x/harbour-suite/", "https://x/harbour-suite/resources/"}));
}

TEST_F(WizardLinks, LeadNowhereWithAnEmptyPage) {
    EXPECT_EQ(UrlsOf(""), Urls{});
}

TEST_F(WizardLinks, LeadNowhereWithoutAPage) {
    setup.HasSuite(R"({"identifier": "com.halvorn.tessaly-suite", "product_type": "0"})");
    Begin();
    wizard.Perform(HV::kWhatsNewCommand);
    wizard.Perform(HV::kResourcesCommand);
    EXPECT_TRUE(toolkit.urls.empty());
}

}  // namespace
