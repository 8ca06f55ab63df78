#pragma once

#include <zlib.h>

#include <cstddef>
#include <cstdint>
#include <string>

namespace HV {

/// The library's lengths and results are ints: what it is asked for at once stays below.
inline constexpr std::uint64_t kLargestPiece = std::uint64_t{1} << 30;

/// Unpacks one deflated stream into room that has exactly its size.
///
/// The archive library stops where an entry is said to end, and does not tell whether its stream ends there. This does:
/// a stream that is damaged, shorter or longer than the room, or followed by anything, is no success.
class Inflater {
public:
    /// The room stays the caller's.
    Inflater(char* room, std::uint64_t size);
    ~Inflater();
    Inflater(const Inflater&) = delete;
    Inflater& operator=(const Inflater&) = delete;

    /// Takes the next packed bytes. False, and nothing more is taken, when they cannot be unpacked, go on after the
    /// end of the stream, or hold more than the room does.
    [[nodiscard]] bool Take(char* packed, std::size_t count);

    /// Whether the stream has come to its end and filled the room.
    [[nodiscard]] bool IsComplete() const { return ended_ && done_ == size_; }

    /// Of what has been unpacked so far.
    [[nodiscard]] std::uint32_t Checksum() const { return static_cast<std::uint32_t>(checksum_); }

    /// Why it is no success, in words.
    [[nodiscard]] std::string Problem() const;

private:
    void MakeRoom();
    int Step();

    z_stream stream_{};
    char* room_;
    std::uint64_t size_;
    std::uint64_t done_ = 0;
    uLong checksum_ = 0;
    Bytef spare_ = 0;  // where the first byte too many goes
    bool ready_ = false;
    bool ended_ = false;
    std::string problem_;
};

}  // namespace HV
