#include <gtest/gtest.h>
#include <sys/stat.h>

#include "tests/support/FolderAccess.h"
#include "tests/support/Machine.h"

bool OthersMayWrite(const Machine& machine, const std::string& folder) {
    struct stat status {};
    if (stat(machine.HostName(folder).c_str(), &status) != 0) {
        ADD_FAILURE() << "there is no folder " << folder;
        return false;
    }
    return (status.st_mode & (S_IWGRP | S_IWOTH)) == (S_IWGRP | S_IWOTH);
}
