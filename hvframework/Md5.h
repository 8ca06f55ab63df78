#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>

namespace HVL {

/// MD5 (RFC 1321) of data that comes in pieces.
///
/// It tells whether a file is the one that was released. It is no protection against someone who forges one on purpose.
/// One object hashes one message; it is not shared between threads.
class Md5 {
public:
    /// Takes in the next `size` bytes at `data`. How the message is cut into pieces does not matter.
    void Update(const void* data, std::size_t size);

    /// The digest of all that was taken in, as 32 lower-case hexadecimal digits. It ends the message: nothing may be
    /// asked of the object afterwards.
    [[nodiscard]] std::string Finish();

private:
    static constexpr std::size_t kBlockSize = 64;

    void TakeBlocks(const unsigned char* data, std::size_t blocks);

    std::array<std::uint32_t, 4> state_ = {0x67452301U, 0xefcdab89U, 0x98badcfeU, 0x10325476U};
    std::uint64_t length_ = 0;
    std::array<unsigned char, kBlockSize> pending_ = {};
};

}  // namespace HVL
