#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>

namespace platform {

/// A file that is read and written at given places, without a buffer and without a position of its own. Each target has
/// its own; what is destroyed is closed.
class RawFile {
public:
    enum class Mode { Read, Change, Create };

    virtual ~RawFile() = default;

    /// How many bytes were read, fewer than `count` only at the file's end; -1 on failure.
    virtual std::int64_t ReadAt(std::uint64_t place, void* bytes, std::size_t count) = 0;
    /// False on failure; how much was written is not known then.
    virtual bool WriteAt(std::uint64_t place, const void* bytes, std::size_t count) = 0;
    [[nodiscard]] virtual std::uint64_t Size() const = 0;
    /// Whether `name` leads to this very file, and nobody has changed it since it was opened, as far as its times tell.
    [[nodiscard]] virtual bool IsStillAt(const wchar_t* name) const = 0;
    /// False when something that was written may be lost.
    virtual bool Close() = 0;
};

/// Null when there is no such file, it is none of the ordinary ones, or it may not be opened so. As long as it is open
/// others may only read it, and it stays where it is; a hosted machine does not keep them from anything.
std::unique_ptr<RawFile> OpenRawFile(const wchar_t* name, RawFile::Mode mode);

}  // namespace platform
