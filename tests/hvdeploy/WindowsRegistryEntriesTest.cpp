// Other programs hear of registry entries, and only on Windows are there other programs.
#include <atomic>
#include <chrono>
#include <future>
#include <thread>

#include "platform/win32.h"
#include "tests/hvdeploy/SideActionsTest.h"

namespace {

std::atomic<int> announcements{0};

LRESULT CALLBACK Listen(HWND window, UINT message, WPARAM wide, LPARAM text) {
    if (message == WM_SETTINGCHANGE && wide == 0 && text != 0 &&
        std::string(reinterpret_cast<const char*>(text)) == "Environment") {
        ++announcements;
    }
    return DefWindowProcA(window, message, wide, text);
}

/// A top-level window on a thread of its own, as another program would have one.
class Listener {
public:
    Listener() {
        announcements = 0;
        std::promise<DWORD> ready;
        thread_ = std::thread([&ready] {
            WNDCLASSA kind{};
            kind.lpfnWndProc = Listen;
            kind.lpszClassName = "halvorn listener";
            RegisterClassA(&kind);
            HWND const window =
                CreateWindowA("halvorn listener", "", WS_POPUP, 0, 0, 1, 1, nullptr, nullptr, nullptr, nullptr);
            ready.set_value(window != nullptr ? GetCurrentThreadId() : 0);
            MSG message{};
            while (window != nullptr && GetMessageA(&message, nullptr, 0, 0) > 0) {
                DispatchMessageA(&message);
            }
        });
        threadId_ = ready.get_future().get();
    }
    ~Listener() {
        PostThreadMessageA(threadId_, WM_QUIT, 0, 0);
        thread_.join();
    }
    Listener(const Listener&) = delete;
    Listener& operator=(const Listener&) = delete;

    bool IsListening() const { return threadId_ != 0; }

private:
    std::thread thread_;
    DWORD threadId_ = 0;
};

/// A top-level window whose program has stopped to answer.
class HungProgram {
public:
    HungProgram() {
        std::promise<bool> ready;
        thread_ = std::thread([this, &ready] {
            HWND const window = CreateWindowA("STATIC", "", WS_POPUP, 0, 0, 1, 1, nullptr, nullptr, nullptr, nullptr);
            ready.set_value(window != nullptr);
            end_.get_future().wait();
            DestroyWindow(window);
        });
        hasWindow_ = ready.get_future().get();
    }
    ~HungProgram() {
        end_.set_value();
        thread_.join();
    }
    HungProgram(const HungProgram&) = delete;
    HungProgram& operator=(const HungProgram&) = delete;

    bool HasWindow() const { return hasWindow_; }

private:
    std::promise<void> end_;
    std::thread thread_;
    bool hasWindow_ = false;
};

HV::RegistryEntry Entry() {
    HV::RegistryEntry entry;
    entry.os = "windows";
    entry.key = R"(SOFTWARE\Halvorn)";
    entry.name = "Folder";
    return entry;
}

}  // namespace

TEST_F(SideActionsTest, ARegistryEntryIsAnnouncedToOtherProgramsWhateverItsKey) {
    const Listener listener;
    ASSERT_TRUE(listener.IsListening());
    EXPECT_EQ(engine.MakeRegistryEntry(Entry()), 0);
    EXPECT_EQ(announcements, 1);
    EXPECT_EQ(engine.MakeRegistryEntry(Entry()), 0);
    EXPECT_EQ(announcements, 2);
}

TEST_F(SideActionsTest, ARegistryEntryThatIsNotWrittenIsNotAnnounced) {
    const Listener listener;
    ASSERT_TRUE(listener.IsListening());
    HV::RegistryEntry entry = Entry();
    entry.os = "mac";
    EXPECT_EQ(engine.MakeRegistryEntry(entry), 0);
    entry.os = "windows";
    entry.key = R"(SOFTWARE\)" + std::string(300, 'x');
    EXPECT_EQ(engine.MakeRegistryEntry(entry), -1);
    EXPECT_EQ(announcements, 0);
}

TEST_F(SideActionsTest, ARegistryEntryWaitsForNoProgramThatDoesNotAnswer) {
    const HungProgram program;
    ASSERT_TRUE(program.HasWindow());
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(engine.MakeRegistryEntry(Entry()), 0) << "what becomes of the announcement does not count";
    // A second is what one such program may cost.
    const auto took = std::chrono::steady_clock::now() - start;
    EXPECT_LT(took, std::chrono::seconds(10));
}
