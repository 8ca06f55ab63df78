// How the host's processes appear on the machine.
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

#include "platform/files.h"
#include "platform/running_processes.h"
#include "tests/support/Machine.h"
#include "tests/support/RunningProgram.h"

namespace {

constexpr std::size_t kMany = 100'000;

std::vector<platform::RunningProcess> Running(std::size_t most = kMany) {
    const auto running = platform::RunningProcesses(most);
    EXPECT_TRUE(running.has_value());
    return running.value_or(std::vector<platform::RunningProcess>{});
}

std::vector<std::string> Paths() {
    std::vector<std::string> paths;
    std::ranges::transform(Running(), std::back_inserter(paths), &platform::RunningProcess::program);
    return paths;
}

std::vector<std::uint32_t> Numbers() {
    std::vector<std::uint32_t> numbers;
    std::ranges::transform(Running(), std::back_inserter(numbers), &platform::RunningProcess::number);
    return numbers;
}

bool IsSeen(pid_t process) {
    return std::ranges::count(Numbers(), static_cast<std::uint32_t>(process)) != 0;
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

class HostedProcesses : public testing::Test {
protected:
    Machine machine;
};

TEST_F(HostedProcesses, LieOnDriveCInsideTheMachine) {
    const std::string path = R"(C:\Program Files\Adobe\AfterFX.exe)";
    const RunningProgram program(machine, path);
    EXPECT_TRUE(Has(Paths(), path));
}

TEST_F(HostedProcesses, LieOnDriveZOutsideOfIt) {
    std::string path = "Z:" + std::filesystem::read_symlink("/proc/self/exe").string();
    std::ranges::replace(path, '/', '\\');
    EXPECT_TRUE(Has(Paths(), path));
}

TEST_F(HostedProcesses, KeepTheirPathWhenTheirFileGoes) {
    const std::string path = R"(C:\Program Files\Adobe\AfterFX.exe)";
    const RunningProgram program(machine, path);
    ASSERT_EQ(platform::RemoveFile(path), 0);
    EXPECT_TRUE(Has(Paths(), path));
}

TEST_F(HostedProcesses, MayHaveTheNameThatTheHostGivesToDeletedFiles) {
    const std::string path = R"(C:\Program Files\AfterFX.exe (deleted))";
    const RunningProgram program(machine, path);
    EXPECT_TRUE(Has(Paths(), path));
}

TEST_F(HostedProcesses, MayHaveAPathThatIsTooLongToBeToldWhole) {
    std::string path = "C:";
    while (path.size() <= platform::kLongestProgram) {
        path += "\\" + std::string(200, 'x');
    }
    const RunningProgram program(machine, path);
    EXPECT_TRUE(Has(Paths(), path.substr(0, platform::kLongestProgram)));
}

TEST_F(HostedProcesses, AreListedInRisingOrder) {
    const auto numbers = Numbers();
    EXPECT_TRUE(std::ranges::is_sorted(numbers));
    EXPECT_EQ(std::ranges::count(numbers, static_cast<std::uint32_t>(getpid())), 1);
}

TEST_F(HostedProcesses, AreNotTheThreadsWithinThem) {
    std::atomic<pid_t> thread{0};
    std::atomic<bool> end{false};
    std::thread other([&] {
        thread = gettid();
        thread.notify_one();
        end.wait(false);
    });
    thread.wait(0);
    EXPECT_FALSE(IsSeen(thread));
    end = true;
    end.notify_one();
    other.join();
}

TEST_F(HostedProcesses, AreSeenAsFarAsOneLooks) {
    EXPECT_LE(Running(1).size(), 1U);
    EXPECT_TRUE(Running(0).empty());
}

TEST_F(HostedProcesses, CannotBeListedWithoutADescriptor) {
    rlimit before{};
    getrlimit(RLIMIT_NOFILE, &before);
    const rlimit none{0, before.rlim_max};
    setrlimit(RLIMIT_NOFILE, &none);
    const bool listed = platform::RunningProcesses(kMany).has_value();
    setrlimit(RLIMIT_NOFILE, &before);
    EXPECT_FALSE(listed);
}

TEST_F(HostedProcesses, AreNotSeenOnceTheyHaveEnded) {
    Child child([] { return 0; });
    child.WaitForEnd();
    EXPECT_FALSE(IsSeen(child.number)) << "nobody has taken notice of its end yet";
    const pid_t number = child.number;
    child.Wait();
    EXPECT_FALSE(IsSeen(number));
}

TEST_F(HostedProcesses, AreNotSeenByAnotherUser) {
    const pid_t target = geteuid() == 0 ? getpid() : 1;
    Child child([target] {
        constexpr uid_t nobody = 65534;
        if (geteuid() == 0 && (setgid(nobody) != 0 || setuid(nobody) != 0)) {
            return 2;
        }
        return IsSeen(target) ? 1 : 0;
    });
    EXPECT_EQ(child.Wait(), 0);
}

TEST_F(HostedProcesses, TellWhoRunsThem) {
    const auto all = Running();
    const auto own = std::ranges::find(all, static_cast<std::uint32_t>(getpid()), &platform::RunningProcess::number);
    ASSERT_NE(own, all.end());
    EXPECT_EQ(own->ownerTag, geteuid());
}

}  // namespace
