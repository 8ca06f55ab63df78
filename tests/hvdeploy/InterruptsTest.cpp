// Interrupts from the keyboard: who hears of them, and until when.
#include "hvdeploy/src/Interrupts.h"

#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <memory>
#include <thread>

namespace {

void Pause(int milliseconds) {
    std::this_thread::sleep_for(std::chrono::milliseconds(milliseconds));
}

TEST(Interrupts, CallTheFunctionForInterruptsAlone) {
    int calls = 0;
    const HV::Interrupts interrupts([&] { ++calls; });
    EXPECT_EQ(HV::Interrupts::OnEvent(CTRL_C_EVENT), TRUE);
    EXPECT_EQ(HV::Interrupts::OnEvent(CTRL_BREAK_EVENT), TRUE);
    EXPECT_EQ(calls, 2);
    EXPECT_EQ(HV::Interrupts::OnEvent(2), FALSE) << "the console is closed, which nobody can keep from happening";
    EXPECT_EQ(calls, 2);
}

TEST(Interrupts, ArriveNowhereOnceTheObjectIsGone) {
    int calls = 0;
    {
        const HV::Interrupts interrupts([&] { ++calls; });
    }
    EXPECT_EQ(HV::Interrupts::OnEvent(CTRL_C_EVENT), FALSE);
    EXPECT_EQ(calls, 0);
}

// The platform's thread may stand in the function in the last moment of a run, and the function uses what the run had.
TEST(Interrupts, LetTheObjectGoOnlyWhenNoCallIsUnderWay) {
    std::atomic<bool> entered{false};
    std::atomic<bool> isGoing{false};
    std::atomic<bool> left{false};
    auto interrupts = std::make_unique<HV::Interrupts>([&] {
        entered = true;
        while (!isGoing) {
            Pause(1);
        }
        Pause(100);
        left = true;
    });
    std::thread platform([] { EXPECT_EQ(HV::Interrupts::OnEvent(CTRL_C_EVENT), TRUE); });
    while (!entered) {
        Pause(1);
    }
    isGoing = true;
    interrupts.reset();
    EXPECT_TRUE(left);
    platform.join();
}

}  // namespace
