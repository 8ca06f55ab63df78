#pragma once

#include <string>
#include <vector>

#include "platform/hosted/filesystem.h"

namespace hosted::filesystem {

/// What a folder of the host holds, read once, `.` and `..` left out, in the order in which Windows lists it: that of
/// the names in upper case. The host's own listing says what an entry is, so nothing is asked for each but where it
/// does not.
class Folder {
public:
    struct Entry {
        std::string name;
        file_type type = status_error;  ///< What the entry itself is, a link being a link.
    };

    explicit Folder(const std::string& hostName);

    /// 0, or the errno of the reading; there are no entries then.
    [[nodiscard]] int Error() const { return error_; }
    [[nodiscard]] const std::vector<Entry>& Entries() const { return entries_; }

private:
    std::vector<Entry> entries_;
    int error_ = 0;
};

}  // namespace hosted::filesystem
