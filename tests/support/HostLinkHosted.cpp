#include <gtest/gtest.h>
#include <unistd.h>

#include "tests/support/HostLink.h"
#include "tests/support/Machine.h"

HostLink::HostLink(const Machine& machine, const std::string& path, const std::string& target)
    : path_(machine.HostName(path)) {
    EXPECT_EQ(symlink(machine.HostName(target).c_str(), path_.c_str()), 0) << path;
}

HostLink::~HostLink() {
    (void)unlink(path_.c_str());
}
