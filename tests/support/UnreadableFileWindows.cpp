#include <gtest/gtest.h>

#include "platform/filesystem.h"
#include "platform/win32.h"
#include "tests/support/UnreadableFile.h"

struct UnreadableFile::Lock {
    HANDLE handle = INVALID_HANDLE_VALUE;
};

// Opened without a share in it for anybody else, which holds for folders too.
UnreadableFile::UnreadableFile(const Machine&, const std::string& path) : lock_(std::make_unique<Lock>()) {
    lock_->handle = CreateFileW(fs::path(path).c_str(), GENERIC_READ, 0, nullptr, OPEN_EXISTING,
                                FILE_FLAG_BACKUP_SEMANTICS, nullptr);
    EXPECT_NE(lock_->handle, INVALID_HANDLE_VALUE) << path;
}

UnreadableFile::~UnreadableFile() {
    EXPECT_NE(CloseHandle(lock_->handle), 0);
}
