#pragma once

#include <memory>
#include <string>

#include "tests/support/Machine.h"

/// While it lives, the file or the folder is there and cannot be read: by its rights on the hosted machine,
/// by another's handle on Windows. What cannot be arranged fails the test.
class UnreadableFile {
public:
    UnreadableFile(const Machine& machine, const std::string& path);
    ~UnreadableFile();
    UnreadableFile(const UnreadableFile&) = delete;
    UnreadableFile& operator=(const UnreadableFile&) = delete;

private:
    struct Lock;
    std::unique_ptr<Lock> lock_;
};
