#include "tests/support/Stranger.h"

#include <grp.h>
#include <gtest/gtest.h>
#include <signal.h>
#include <sys/prctl.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <exception>

namespace {

// The account "nobody" of every Linux.
constexpr uid_t kNobody = 65534;

[[noreturn]] void BeStranger(const std::function<void()>& attack, int ready) {
    // The stranger ends with the test, whatever becomes of it.
    prctl(PR_SET_PDEATHSIG, SIGKILL);
    const bool strange = setgroups(0, nullptr) == 0 && setgid(kNobody) == 0 && setuid(kNobody) == 0;
    const char word = strange ? 'y' : 'n';
    if (write(ready, &word, 1) != 1 || !strange) {
        _exit(1);
    }
    // Nobody else's mask is his.
    for (umask(0);;) {
        try {
            attack();
        } catch (const std::exception&) {
            // What he is after may have gone meanwhile; he must not come out into the test.
        }
    }
}

}  // namespace

struct Stranger::Process {
    pid_t number = -1;
};

bool Stranger::CanBe() {
    return geteuid() == 0;
}

Stranger::Stranger(std::function<void()> attack) : process_(std::make_unique<Process>()) {
    int ends[2];
    if (pipe(ends) != 0) {
        ADD_FAILURE() << "no pipe to a stranger";
        return;
    }
    process_->number = fork();
    if (process_->number == 0) {
        BeStranger(attack, ends[1]);
    }
    close(ends[1]);
    char word = 'n';
    const bool told = read(ends[0], &word, 1) == 1;
    close(ends[0]);
    EXPECT_TRUE(told && word == 'y') << "the stranger's account cannot be taken";
}

Stranger::~Stranger() {
    if (process_->number > 0) {
        kill(process_->number, SIGKILL);
        while (waitpid(process_->number, nullptr, 0) < 0 && errno == EINTR) {
        }
    }
}

void Stranger::Owns(const std::string& hostPath) {
    EXPECT_EQ(chown(hostPath.c_str(), kNobody, kNobody), 0) << hostPath;
}
