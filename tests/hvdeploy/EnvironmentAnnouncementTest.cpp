// How other programs are told of a registry entry. What becomes of that is the system's affair, so the call itself is
// looked at: whoever does not answer holds it up only as long as these numbers say.
#include <string>
#include <vector>

#include "platform/win32.h"
#include "tests/hvdeploy/SideActionsTest.h"

namespace {

struct Announcement {
    HWND to;
    UINT message;
    WPARAM wide;
    std::string text;
    UINT flags;
    UINT milliseconds;
    bool wantsAnswer;
    bool operator==(const Announcement&) const = default;
};

std::vector<Announcement> announced;

LRESULT RecordAnnouncement(HWND to, UINT message, WPARAM wide, LPARAM text, UINT flags, UINT milliseconds,
                           PDWORD_PTR answer) {
    announced.push_back(
        {to, message, wide, reinterpret_cast<const char*>(text), flags, milliseconds, answer != nullptr});
    return 0;
}

}  // namespace

#define SendMessageTimeoutA RecordAnnouncement

// The operations under test, with the system's answer replaced: they stand here in place of those of their room.
#include "hvdeploy/src/DeploySideActions.cpp"

TEST_F(SideActionsTest, ARegistryEntryIsAnnouncedToAllForASecondAndNotToProgramsThatHang) {
    announced.clear();
    HV::RegistryEntry entry;
    entry.os = "windows";
    entry.key = R"(SOFTWARE\Halvorn)";
    entry.name = "Folder";
    EXPECT_EQ(engine.MakeRegistryEntry(entry), 0) << "what becomes of the announcement does not count";
    EXPECT_EQ(announced.size(), 1U);
    EXPECT_TRUE(announced == (std::vector<Announcement>{{HWND_BROADCAST, 0x1A, 0, "Environment", 2, 1000, false}}));
}
