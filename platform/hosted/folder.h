#pragma once

#include <dirent.h>

#include <string>

#include "platform/hosted/filesystem.h"

namespace hosted::filesystem {

/// Reads a folder of the host, entry by entry; `.` and `..` are left out. The host's own listing says what an entry is,
/// so nothing is asked for each; only where it does not say, Type() asks.
class Folder {
public:
    explicit Folder(const std::string& hostName);
    ~Folder();
    Folder(const Folder&) = delete;
    Folder& operator=(const Folder&) = delete;

    /// False at the end and on a failure.
    bool Next();
    /// 0, or the errno of the opening or of the last Next().
    [[nodiscard]] int Error() const { return error_; }
    [[nodiscard]] const char* Name() const { return entry_->d_name; }
    /// What the entry itself is, a link being a link.
    [[nodiscard]] file_type Type() const;

private:
    DIR* stream_;
    const dirent* entry_ = nullptr;
    int error_;
};

}  // namespace hosted::filesystem
