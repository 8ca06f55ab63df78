// The request to quit the hosts, to the letter.
#include "installer/RunningHostsText.h"

#include <gtest/gtest.h>

#include <stdexcept>

namespace {

std::string TextFor(const std::vector<std::string>& names) {
    std::vector<HV::ProcessRecord> running;
    for (const std::string& name : names) {
        running.push_back({1, 0, name, "C:\\" + name});
    }
    return HV::RunningHostsText(running);
}

TEST(RunningHostsText, NamesOneHost) {
    EXPECT_EQ(TextFor({"Resolve.exe"}),
              "Resolve is a host application for products in the installer; please quit this application and retry or "
              "cancel to exit the installer.");
}

TEST(RunningHostsText, NamesTwoHostsAndLacksABlankAfterThem) {
    EXPECT_EQ(TextFor({"AfterFX.exe", "Resolve.exe"}),
              "After Effects and Resolve are host applications for products in the installer; please quit these "
              "applications and retryor cancel to exit the installer.");
}

TEST(RunningHostsText, PutsCommasBeforeTheLastTwo) {
    EXPECT_EQ(TextFor({"AfterFX.exe", "Adobe Premiere Pro.exe", "Resolve.exe", "AvidMediaComposer.exe"}),
              "After Effects, Adobe Premiere Pro, Resolve and AvidMediaComposer are host applications for products in "
              "the installer; please quit these applications and retryor cancel to exit the installer.");
}

TEST(RunningHostsText, NamesAHostAsOftenAsItRuns) {
    EXPECT_EQ(TextFor({"AfterFX.exe", "AfterFX.exe"}),
              "After Effects and After Effects are host applications for products in the installer; please quit these "
              "applications and retryor cancel to exit the installer.");
}

TEST(RunningHostsText, IsNotMadeForAProcessWithoutAName) {
    // The search for HitFilm finds such processes, and nothing catches what their names make of the text.
    EXPECT_THROW((void)TextFor({""}), std::out_of_range);
    EXPECT_THROW((void)TextFor({"Resolve.exe", "abc"}), std::out_of_range);
}

}  // namespace
