#include <algorithm>
#include <filesystem>

#include "tests/wizard/WizardTest.h"

namespace {

class PackagesTest : public WizardTest {
protected:
    /// The box that ends the run, with the main window already behind it.
    static void ExpectEnd(RunningWizard& wizard, const std::string& title, const std::string& text) {
        const Box box = wizard.WaitForBox(title);
        ExpectBox(box, text, {IDOK}, true, nullptr);
        EXPECT_TRUE(IsWindowVisible(wizard.Window()));
        KeepPicture("box", wizard.Window());
        wizard.AnswerOk(box);
        EXPECT_EQ(wizard.ExitStatus(), 0U);
    }

    void KeepOnly(const std::vector<std::string>& parts) {
        int kept = 0;
        std::vector<std::string> others;
        for (const auto& entry : std::filesystem::directory_iterator(folder + "\\packages")) {
            const std::string name = entry.path().filename().string();
            const bool isWanted =
                std::any_of(parts.begin(), parts.end(), [&](const auto& part) { return name.find(part) != name.npos; });
            kept += isWanted ? 1 : 0;
            if (!isWanted && name != "suite.json") {
                others.push_back(name);
            }
        }
        for (const std::string& name : others) {
            RemovePackage(name);
        }
        EXPECT_EQ(kept, static_cast<int>(parts.size()));
    }

    const std::string invalid = "Error: invalid installer packages.";
    const std::string invalidText = "This installer contains invalid packages and cannot be run.";
};

TEST_F(PackagesTest, RefusesAPackageWithAChangedByte) {
    HasEveryHost();
    BreakPackage("com.halvorn.tessaly.glow.zip");
    RunningWizard wizard(folder);
    ExpectEnd(wizard, invalid, invalidText);
}

TEST_F(PackagesTest, RefusesAPackageThatItDoesNotKnow) {
    HasEveryHost();
    machine().Has(folder + R"(\packages\com.halvorn.other.zip)", "anything");
    RunningWizard wizard(folder);
    ExpectEnd(wizard, invalid, invalidText);
}

TEST_F(PackagesTest, RefusesAFolderWithoutASuite) {
    HasEveryHost();
    RemovePackage("suite.json");
    RunningWizard wizard(folder);
    ExpectEnd(wizard, invalid, invalidText);
}

TEST_F(PackagesTest, EndsWhenAllProductsLackTheirHosts) {
    KeepOnly({"tessaly.glow", "tessaly.keyer"});
    RunningWizard wizard(folder);
    ExpectEnd(wizard, "Error: no hosts found.",
              "This installer's products require host applications which are not installed on this computer.");
}

TEST_F(PackagesTest, EndsBeforeAnyWindowWithoutThePackagesFolder) {
    std::filesystem::rename(folder + "\\packages", folder + "\\elsewhere");
    RunningWizard wizard(folder);
    const Box box = wizard.WaitForBox("Packages Directory Not Found");
    ExpectBox(
        box,
        "This installer application has been moved. It must be run from its original folder containing a packages "
        "directory. The installer will now exit.",
        {IDOK}, true, nullptr);
    wizard.AnswerOk(box);
    EXPECT_EQ(wizard.ExitStatus(), 0U);
}

TEST_F(PackagesTest, WithNothingToChooseTheFirstButtonInstalls) {
    HasEveryHost();
    KeepOnly({"imagecore", "colorscience"});
    RunningWizard wizard(folder);
    const HWND window = wizard.Window();
    EXPECT_TRUE(wizard.Shows(window, {look::Button("Install", {495, 358, 575, 383}, look::DisabledFace, look::Strip)}));
    wizard.Press(wizard.PageWith(id::Agree), id::Agree);
    wizard.Press(window, id::Continue);
    EXPECT_TRUE(Eventually([&] { return GetDlgItem(window, id::Close) != nullptr; }));
    wizard.Press(window, id::Close);
    EXPECT_EQ(wizard.ExitStatus(), 0U);
    EXPECT_TRUE(IsRegistered());
}

}  // namespace
