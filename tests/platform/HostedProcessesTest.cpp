// How the host's processes appear on the machine. On Windows these names are the system's own.
#include <fcntl.h>
#include <gtest/gtest.h>
#include <signal.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <filesystem>
#include <functional>
#include <string>
#include <thread>
#include <vector>

#include "platform/win32.h"
#include "tests/support/Machine.h"
#include "tests/support/RunningProgram.h"

namespace {

std::vector<DWORD> Listed() {
    std::vector<DWORD> numbers(100'000);
    DWORD filled = 0;
    EXPECT_TRUE(K32EnumProcesses(numbers.data(), static_cast<DWORD>(numbers.size() * sizeof(DWORD)), &filled));
    numbers.resize(filled / sizeof(DWORD));
    return numbers;
}

std::string PathOf(HANDLE process) {
    HMODULE module = nullptr;
    DWORD needed = 0;
    char path[4096] = "";
    EXPECT_TRUE(K32EnumProcessModules(process, &module, sizeof module, &needed));
    EXPECT_EQ(needed, sizeof module);
    const DWORD length = K32GetModuleFileNameExA(process, module, path, sizeof path);
    return {path, length};
}

/// The paths of all processes that can be opened.
std::vector<std::string> Paths() {
    std::vector<std::string> paths;
    for (const DWORD number : Listed()) {
        if (const HANDLE process = OpenProcess(PROCESS_QUERY_INFORMATION, FALSE, number)) {
            paths.push_back(PathOf(process));
            EXPECT_TRUE(CloseHandle(process));
        }
    }
    return paths;
}

bool Has(const std::vector<std::string>& paths, const std::string& path) {
    return std::ranges::find(paths, path) != paths.end();
}

/// A child of this process that does what it is told and is there until the object ends.
class Child {
public:
    explicit Child(const std::function<int()>& work) : number(fork()) {
        if (number == 0) {
            _exit(work());
        }
    }
    ~Child() { Wait(); }
    Child(const Child&) = delete;
    Child& operator=(const Child&) = delete;

    /// Until it has ended, without taking notice: the host keeps its entry.
    void WaitForEnd() const {
        siginfo_t information{};
        while (waitid(P_PID, static_cast<id_t>(number), &information, WEXITED | WNOWAIT) != 0 && errno == EINTR) {
        }
    }

    int Wait() {
        if (number > 0) {
            while (waitpid(number, &status_, 0) < 0 && errno == EINTR) {
            }
        }
        const_cast<pid_t&>(number) = 0;
        return WIFEXITED(status_) ? WEXITSTATUS(status_) : -1;
    }

    const pid_t number;

private:
    int status_ = 0;
};

TEST(HostedProcesses, LieOnDriveCInsideTheMachine) {
    Machine machine;
    const std::string path = R"(C:\Program Files\Adobe\AfterFX.exe)";
    const RunningProgram program(machine, path);
    EXPECT_TRUE(Has(Paths(), path));
}

TEST(HostedProcesses, LieOnDriveZOutsideOfIt) {
    const Machine machine;
    std::string path = "Z:" + std::filesystem::read_symlink("/proc/self/exe").string();
    std::ranges::replace(path, '/', '\\');
    EXPECT_TRUE(Has(Paths(), path));
}

TEST(HostedProcesses, KeepTheirPathWhenTheirFileGoes) {
    Machine machine;
    const std::string path = R"(C:\Program Files\Adobe\AfterFX.exe)";
    const RunningProgram program(machine, path);
    ASSERT_EQ(_unlink(path.c_str()), 0);
    EXPECT_TRUE(Has(Paths(), path));
}

TEST(HostedProcesses, MayHaveTheNameThatTheHostGivesToDeletedFiles) {
    Machine machine;
    const std::string path = R"(C:\Program Files\AfterFX.exe (deleted))";
    const RunningProgram program(machine, path);
    EXPECT_TRUE(Has(Paths(), path));
}

TEST(HostedProcesses, AreListedInRisingOrder) {
    const auto numbers = Listed();
    EXPECT_TRUE(std::ranges::is_sorted(numbers));
    EXPECT_EQ(std::ranges::count(numbers, static_cast<DWORD>(getpid())), 1);
}

TEST(HostedProcesses, AreNotTheThreadsWithinThem) {
    std::atomic<DWORD> thread{0};
    std::atomic<bool> end{false};
    std::thread other([&] {
        thread = static_cast<DWORD>(gettid());
        thread.notify_one();
        end.wait(false);
    });
    thread.wait(0);
    EXPECT_EQ(std::ranges::count(Listed(), thread.load()), 0);
    end = true;
    end.notify_one();
    other.join();
}

TEST(HostedProcesses, AreListedAsFarAsThereIsRoom) {
    const auto all = Listed();
    ASSERT_GE(all.size(), 2U);
    DWORD numbers[2] = {};
    DWORD filled = 0;
    EXPECT_TRUE(K32EnumProcesses(numbers, 7, &filled));
    EXPECT_EQ(filled, 4U);
    EXPECT_EQ(numbers[0], all[0]);
    EXPECT_EQ(numbers[1], 0U);
}

TEST(HostedProcesses, CannotBeListedWithoutADescriptor) {
    rlimit before{};
    getrlimit(RLIMIT_NOFILE, &before);
    const rlimit none{0, before.rlim_max};
    setrlimit(RLIMIT_NOFILE, &none);
    DWORD number = 0;
    DWORD filled = 0;
    const BOOL listed = K32EnumProcesses(&number, sizeof number, &filled);
    setrlimit(RLIMIT_NOFILE, &before);
    EXPECT_FALSE(listed);
}

TEST(HostedProcesses, CannotBeOpenedWhenThereAreNone) {
    Child child([] { return 0; });
    const auto number = static_cast<DWORD>(child.number);
    child.Wait();
    EXPECT_EQ(OpenProcess(PROCESS_QUERY_INFORMATION, FALSE, number), nullptr);
    EXPECT_EQ(GetLastError(), DWORD{ERROR_INVALID_PARAMETER});
}

TEST(HostedProcesses, CannotBeOpenedOnceTheyHaveEnded) {
    const Child child([] { return 0; });
    child.WaitForEnd();
    EXPECT_EQ(OpenProcess(PROCESS_QUERY_INFORMATION, FALSE, static_cast<DWORD>(child.number)), nullptr);
    EXPECT_EQ(GetLastError(), DWORD{ERROR_ACCESS_DENIED});
}

TEST(HostedProcesses, CannotBeOpenedByAnotherUser) {
    const auto target = static_cast<DWORD>(geteuid() == 0 ? getpid() : 1);
    Child child([target] {
        constexpr uid_t nobody = 65534;
        if (geteuid() == 0 && (setgid(nobody) != 0 || setuid(nobody) != 0)) {
            return 2;
        }
        return OpenProcess(PROCESS_QUERY_INFORMATION, FALSE, target) == nullptr ? 0 : 1;
    });
    EXPECT_EQ(child.Wait(), 0);
}

TEST(HostedProcesses, TellWhoRunsThem) {
    const HANDLE process = OpenProcess(PROCESS_QUERY_INFORMATION, FALSE, static_cast<DWORD>(getpid()));
    HANDLE token = nullptr;
    ASSERT_TRUE(OpenProcessToken(process, TOKEN_READ, &token));
    DWORD needed = 0;
    EXPECT_FALSE(GetTokenInformation(token, TokenUser, nullptr, 0, &needed));
    EXPECT_EQ(GetLastError(), DWORD{ERROR_INSUFFICIENT_BUFFER});
    ASSERT_EQ(needed, 4U);
    DWORD user = 0;
    EXPECT_TRUE(GetTokenInformation(token, TokenUser, &user, sizeof user, &needed));
    EXPECT_EQ(user, geteuid());
    EXPECT_TRUE(CloseHandle(token));
    EXPECT_TRUE(CloseHandle(process));
}

TEST(HostedProcesses, GiveWhatFitsOfTheirPath) {
    const Machine machine;
    const HANDLE process = OpenProcess(PROCESS_QUERY_INFORMATION, FALSE, static_cast<DWORD>(getpid()));
    char path[5] = "xxxx";
    EXPECT_EQ(K32GetModuleFileNameExA(process, nullptr, path, 4), 4U);
    EXPECT_STREQ(path, "Z:\\");
    EXPECT_EQ(K32GetModuleFileNameExA(process, nullptr, path, 0), 0U);
}

// Windows says so of itself; Wine leaves the end out.
TEST(HostedModuleName, IsTerminatedWhereItIsCut) {
    const Machine machine;
    char path[] = "xxxxxxxxx";
    EXPECT_EQ(GetModuleFileNameA(nullptr, path, 4), 4U);
    EXPECT_STREQ(path, "Z:\\");
}

TEST(HostedProcesses, AnswerOnlyToTheirOwnHandles) {
    HANDLE token = nullptr;
    HMODULE module = nullptr;
    DWORD needed = 0;
    char path[16] = "";
    EXPECT_FALSE(OpenProcessToken(nullptr, TOKEN_READ, &token));
    EXPECT_FALSE(K32EnumProcessModules(INVALID_HANDLE_VALUE, &module, sizeof module, &needed));
    EXPECT_EQ(K32GetModuleFileNameExA(nullptr, nullptr, path, sizeof path), 0U);
    EXPECT_FALSE(GetTokenInformation(nullptr, TokenUser, nullptr, 0, &needed));
    EXPECT_EQ(GetLastError(), DWORD{ERROR_INVALID_HANDLE});
}

}  // namespace
