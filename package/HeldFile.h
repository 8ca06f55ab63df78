#pragma once

#include <memory>
#include <string>

#include "platform/filesystem.h"

namespace platform {
class RawFile;
}

namespace HV {

/// What the bytes of a file are known by, in lower-case hexadecimal digits.
struct FileDigests {
    std::string md5;
    std::string sha256;
    bool operator==(const FileDigests&) const = default;
};

/// A file of a release that is held, so that what was tested is what is installed.
///
/// On Windows nobody can write, rename or delete it while it is held, nor rename a folder above it. A hosted machine
/// cannot keep others from that; there IsUntouched() tells whether they did. A file that cannot be opened is held by
/// nobody: it has no bytes, and is never untouched.
class HeldFile {
public:
    explicit HeldFile(fs::path path);
    ~HeldFile();
    HeldFile(HeldFile&& other) noexcept;
    HeldFile& operator=(HeldFile&& other) noexcept;

    [[nodiscard]] const fs::path& Path() const { return path_; }

    /// The digests of its bytes, in one reading; of no bytes when it cannot be opened. A failure in the middle of
    /// reading leaves digests of what came before it.
    [[nodiscard]] FileDigests Digests() const;

    /// Whether the path still leads to the file that was opened, and nobody has written to it since.
    [[nodiscard]] bool IsUntouched() const;

private:
    fs::path path_;
    std::unique_ptr<platform::RawFile> file_;
};

}  // namespace HV
