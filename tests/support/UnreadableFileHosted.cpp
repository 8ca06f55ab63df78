#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include "tests/support/UnreadableFile.h"

namespace {

constexpr uid_t kNobody = 65534;

}  // namespace

struct UnreadableFile::Lock {
    std::string name;
    mode_t rights = 0;
    uid_t user = geteuid();
};

// Root may read everything, so it is not root meanwhile.
UnreadableFile::UnreadableFile(const Machine& machine, const std::string& path) : lock_(std::make_unique<Lock>()) {
    lock_->name = machine.HostName(path);
    EXPECT_EQ(chmod((machine.HostName("C:\\") + "/..").c_str(), 0755), 0);
    struct stat status = {};
    EXPECT_EQ(stat(lock_->name.c_str(), &status), 0);
    lock_->rights = status.st_mode & 07777U;
    EXPECT_EQ(chmod(lock_->name.c_str(), 0), 0);
    if (lock_->user == 0) {
        EXPECT_EQ(seteuid(kNobody), 0);
    }
}

UnreadableFile::~UnreadableFile() {
    if (lock_->user == 0) {
        EXPECT_EQ(seteuid(lock_->user), 0);
    }
    EXPECT_EQ(chmod(lock_->name.c_str(), lock_->rights), 0);
}
