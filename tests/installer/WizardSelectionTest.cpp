// Choosing products, there and back again.
#include <stdexcept>

#include "tests/installer/WizardTest.h"

namespace {

using HV::WizardPart;
using HV::WizardState;

class WizardSelection : public WizardTest {
protected:
    [[nodiscard]] std::vector<std::string> Products() {
        std::vector<std::string> texts;
        for (const HV::ProductItem& item : toolkit.Selection().items) {
            texts.push_back(item.displayName + " " + item.identifier + (item.checked ? " checked" : " unchecked") +
                            (item.enabled ? "" : " disabled"));
        }
        return texts;
    }
    using Texts = std::vector<std::string>;
};

TEST_F(WizardSelection, ComesAfterTheAgreement) {
    Ships(Product("glow"));
    BeginAndAgree();
    toolkit.Press(HV::kContinueCommand);
    EXPECT_EQ(toolkit.CallsFrom("CreateSelectionPage"),
              (Texts{"CreateSelectionPage", "SetContinueText \"Install\"", "ShowWindow WelcomePage 0",
                     "ShowWindow SelectionPage 5", "EnableWindow BackButton true"}));
    EXPECT_EQ(wizard.state, WizardState::Selection);
    EXPECT_EQ(wizard.selectionPage, &toolkit.Selection());
    EXPECT_EQ(toolkit.VisiblePages(), std::vector{WizardPart::SelectionPage});
}

TEST_F(WizardSelection, ListsShownProductsByNameAndChecksThem) {
    Ships(Product("keyer").DisplayName("Keyer").Named("a.hvpkg"));
    Ships(Hidden("core").DisplayName("Core").Named("b.hvpkg"));
    Ships(Product("glow").DisplayName("Glow").Named("c.hvpkg"));
    GoToSelection();
    EXPECT_EQ(Products(), (Texts{"Glow com.halvorn.glow checked", "Keyer com.halvorn.keyer checked"}));
}

TEST_F(WizardSelection, DisablesProductsWithoutTheirHosts) {
    HasHostsOf("motion-design");
    Ships(HostProduct("cuts", "resolve"));
    Ships(HostProduct("glow", "aftereffects"));
    Ships(Product("titler"));
    toolkit.AnswerNext(kOk);
    GoToSelection();
    EXPECT_EQ(Products(), (Texts{"cuts com.halvorn.cuts unchecked disabled", "glow com.halvorn.glow checked",
                                 "titler com.halvorn.titler checked"}));
}

TEST_F(WizardSelection, IsMadeOnce) {
    Ships(Product("glow"));
    GoToSelection();
    try {
        wizard.CreateSelectionPage();
        ADD_FAILURE() << "a second page";
    } catch (const std::runtime_error& error) {
        EXPECT_STREQ(error.what(), "This program not be allocating the selection page twice.");
    }
}

TEST_F(WizardSelection, GoesBackToTheFirstPageWhichGoesOnReadingInstall) {
    Ships(Product("glow"));
    GoToSelection();
    toolkit.Press(HV::kBackCommand);
    EXPECT_EQ(toolkit.CallsFrom("Press Back"), (Texts{"Press Back", "ShowWindow SelectionPage 0",
                                                      "ShowWindow WelcomePage 5", "EnableWindow BackButton false"}));
    EXPECT_EQ(wizard.state, WizardState::Welcome);
    EXPECT_EQ(toolkit.VisiblePages(), std::vector{WizardPart::WelcomePage});
    EXPECT_EQ(toolkit.Window().continueText, "Install");
    EXPECT_TRUE(toolkit.CanPress(HV::kContinueCommand));
    EXPECT_FALSE(toolkit.CanPress(HV::kBackCommand));
    EXPECT_FALSE(toolkit.CanPress(HV::kAgreeCommand));
}

TEST_F(WizardSelection, KeepsTheChoiceOnATripToTheFirstPage) {
    Ships(Product("blur"));
    Ships(Product("glow"));
    Ships(Product("keyer"));
    GoToSelection();
    toolkit.Toggle("com.halvorn.glow");
    const HV::SelectionPage* page = wizard.selectionPage;
    toolkit.Press(HV::kBackCommand);
    toolkit.Press(HV::kContinueCommand);
    EXPECT_EQ(wizard.selectionPage, page);
    EXPECT_EQ(toolkit.VisiblePages(), std::vector{WizardPart::SelectionPage});
    EXPECT_EQ(Products(), (Texts{"blur com.halvorn.blur checked", "glow com.halvorn.glow unchecked",
                                 "keyer com.halvorn.keyer checked"}));
    EXPECT_TRUE(toolkit.CanPress(HV::kBackCommand));
}

TEST_F(WizardSelection, WantsOneProductAtLeast) {
    Ships(Product("glow"));
    Ships(Product("keyer"));
    GoToSelection();
    toolkit.DeselectAll();
    toolkit.AnswerNext(kOk);
    toolkit.Press(HV::kContinueCommand);
    EXPECT_EQ(toolkit.boxes, std::vector{kNothingSelected});
    EXPECT_EQ(wizard.state, WizardState::Selection);
    EXPECT_EQ(wizard.job, nullptr);
    EXPECT_EQ(toolkit.VisiblePages(), std::vector{WizardPart::SelectionPage});
}

TEST_F(WizardSelection, AsksAgainAtEachPress) {
    Ships(Product("glow"));
    GoToSelection();
    toolkit.DeselectAll();
    toolkit.AnswerNext(kOk);
    toolkit.AnswerNext(kOk);
    toolkit.Press(HV::kContinueCommand);
    toolkit.Press(HV::kContinueCommand);
    EXPECT_EQ(toolkit.boxes, (std::vector{kNothingSelected, kNothingSelected}));
}

TEST_F(WizardSelection, CountsNoDisabledProductAsAChoice) {
    Ships(HostProduct("cuts", "resolve"));
    Ships(Product("glow"));
    toolkit.AnswerNext(kOk);
    GoToSelection();
    toolkit.SelectAll();
    toolkit.DeselectAll();
    toolkit.AnswerNext(kOk);
    toolkit.Press(HV::kContinueCommand);
    EXPECT_EQ(toolkit.boxes, (std::vector{kMissingHosts, kNothingSelected}));
}

TEST_F(WizardSelection, IsSatisfiedWithOneProduct) {
    Ships(Product("glow"));
    Ships(Product("keyer"));
    GoToSelection();
    toolkit.DeselectAll();
    toolkit.Toggle("com.halvorn.keyer");
    EXPECT_TRUE(wizard.CanPerform(HV::kContinueCommand));
    EXPECT_TRUE(toolkit.boxes.empty());
}

TEST_F(WizardSelection, OnlyFlashesByWhenThereIsNothingToChoose) {
    Ships(Hidden("core"));
    BeginAndAgree();
    EXPECT_EQ(toolkit.Window().continueText, "Install") << "after the agreement too";
    toolkit.Press(HV::kContinueCommand);
    EXPECT_EQ(wizard.state, WizardState::Installing);
    EXPECT_TRUE(toolkit.Selection().items.empty());
    EXPECT_EQ(toolkit.CallsFrom("CreateSelectionPage"),
              (Texts{"CreateSelectionPage", "SetContinueText \"Install\"", "ShowWindow WelcomePage 0",
                     "ShowWindow SelectionPage 5", "EnableWindow BackButton true",
                     "CreateInstallingPage \"Detecting host applications...\" 0", "ShowWindow SelectionPage 0",
                     "ShowWindow InstallingPage 5", "EnableWindow BackButton false",
                     "EnableWindow ContinueButton false", "SetTimer Progress 333"}));
    WaitForJob();
    EXPECT_EQ(machine.Content(PlaceOf("core")), TextOf("core"));
}

TEST_F(WizardSelection, InstallsTheProductsThatHaveNoBoxAnyMore) {
    for (char letter = 'a'; letter < 'a' + 14; ++letter) {
        Ships(Product(std::string("product-") + letter));
    }
    GoToSelection();
    ASSERT_EQ(toolkit.Selection().items.size(), 14U);
    toolkit.DeselectAll();
    EXPECT_EQ(toolkit.CheckedCount(toolkit.Selection()), 2) << "the thirteenth and the fourteenth";
    (void)InstallAndPoll();
    EXPECT_FALSE(machine.Exists(PlaceOf("product-a")));
    EXPECT_FALSE(machine.Exists(PlaceOf("product-l")));
    EXPECT_EQ(machine.Content(PlaceOf("product-m")), TextOf("product-m"));
    EXPECT_EQ(machine.Content(PlaceOf("product-n")), TextOf("product-n"));
}

}  // namespace
