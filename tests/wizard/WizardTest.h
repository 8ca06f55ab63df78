#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "tests/support/Machine.h"
#include "tests/support/Rectangles.h"
#include "tests/wizard/CommandGate.h"
#include "tests/wizard/RunningWizard.h"

/// A machine with the sample release in C:\Release and, where a test asks for them, hosts; and what the walks through
/// the wizard there have in common.
///
/// The environment variable HV_WALK_RELEASE names another folder with a release, which is used where it lies: that is
/// how a shipped one is walked through. HV_WALK_PICTURES names a folder for the pictures that a walk takes on its way.
class WizardTest : public testing::Test {
protected:
    WizardTest();

    /// The host applications of this file of samples/machines.
    void HasHosts(const std::string& name);
    /// Hosts for every product, without HitFilm: where that is, a process that just comes or goes is taken for a host
    /// without a name, and that ends the wizard. Tests without a window know more of it.
    void HasEveryHost();
    /// Puts a changed byte into a package, or takes it away.
    void BreakPackage(const std::string& name);
    void RemovePackage(const std::string& name);

    /// Makes the next wizard wait at the script whose command holds this text; until it is let go.
    void HoldAtScript(const std::string& part);
    void WaitUntilHeld();
    void LetGo();

    /// From the first page to the one named.
    static void GoToSelection(RunningWizard& wizard);
    static void GoToInstalling(RunningWizard& wizard);
    static void GoToFinal(RunningWizard& wizard);

    /// The window's buttons and controls, compared in one go: identifiers, classes, rectangles, styles.
    struct Expected {
        int id;
        RECT part;
        DWORD style;
        bool visible;
        bool enabled;
    };
    static void ExpectControls(HWND parent, const std::vector<Expected>& expected);
    static void ExpectBox(const Box& box, const std::string& text, const std::vector<int>& buttons, bool hasIcon,
                          HWND owner);

    /// Keeps a picture of the window with its frame, when pictures are asked for.
    static void KeepPicture(const std::string& name, HWND window);

    /// The registry as the machine gives it, without the display's own entries, which come with the first window.
    [[nodiscard]] std::string Registry() const;
    /// Whether the list of installed programs names the suite.
    [[nodiscard]] bool IsRegistered() const;

    [[nodiscard]] Machine& machine() const { return *machine_; }
    /// Another machine of the same kind, without hosts, in place of this one.
    void StartOver();

    const std::string folder;

private:
    std::unique_ptr<Machine> machine_;
    std::unique_ptr<CommandGate> gate_;
};

/// The products that the selection page offers, in its order.
const std::vector<std::string>& ProductNames();
/// Where the check box of the n-th product stands.
RECT ProductPart(int index);
int ProductId(int index);
