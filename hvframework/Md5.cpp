#include "hvframework/Md5.h"

#include <algorithm>
#include <bit>
#include <cstring>
#include <utility>

namespace HVL {
namespace {

static_assert(std::endian::native == std::endian::little, "the words of a block are read as they lie in memory");

constexpr std::size_t kSteps = 64;
constexpr std::size_t kWords = 16;
constexpr std::size_t kLengthSize = sizeof(std::uint64_t);

using State = std::array<std::uint32_t, 4>;
using Words = std::array<std::uint32_t, kWords>;

// The whole part of 2^32 * |sin(i + 1)|, with i in radians.
constexpr std::array<std::uint32_t, kSteps> kSines = {
    0xd76aa478U, 0xe8c7b756U, 0x242070dbU, 0xc1bdceeeU, 0xf57c0fafU, 0x4787c62aU, 0xa8304613U, 0xfd469501U,
    0x698098d8U, 0x8b44f7afU, 0xffff5bb1U, 0x895cd7beU, 0x6b901122U, 0xfd987193U, 0xa679438eU, 0x49b40821U,
    0xf61e2562U, 0xc040b340U, 0x265e5a51U, 0xe9b6c7aaU, 0xd62f105dU, 0x02441453U, 0xd8a1e681U, 0xe7d3fbc8U,
    0x21e1cde6U, 0xc33707d6U, 0xf4d50d87U, 0x455a14edU, 0xa9e3e905U, 0xfcefa3f8U, 0x676f02d9U, 0x8d2a4c8aU,
    0xfffa3942U, 0x8771f681U, 0x6d9d6122U, 0xfde5380cU, 0xa4beea44U, 0x4bdecfa9U, 0xf6bb4b60U, 0xbebfbc70U,
    0x289b7ec6U, 0xeaa127faU, 0xd4ef3085U, 0x04881d05U, 0xd9d4d039U, 0xe6db99e5U, 0x1fa27cf8U, 0xc4ac5665U,
    0xf4292244U, 0x432aff97U, 0xab9423a7U, 0xfc93a039U, 0x655b59c3U, 0x8f0ccc92U, 0xffeff47dU, 0x85845dd1U,
    0x6fa87e4fU, 0xfe2ce6e0U, 0xa3014314U, 0x4e0811a1U, 0xf7537e82U, 0xbd3af235U, 0x2ad7d2bbU, 0xeb86d391U,
};

constexpr std::array<std::array<int, 4>, 4> kRotations = {
    {{7, 12, 17, 22}, {5, 9, 14, 20}, {4, 11, 16, 23}, {6, 10, 15, 21}}};

constexpr std::size_t WordOf(std::size_t step) {
    constexpr std::array<std::size_t, 4> kStride = {1, 5, 3, 7};
    constexpr std::array<std::size_t, 4> kStart = {0, 1, 5, 0};
    return (kStart[step / 16] + kStride[step / 16] * (step % 16)) % kWords;
}

// One step with everything about it known to the compiler. The digest is one long chain of dependent operations through
// `b`, so the sums are grouped to keep all that does not need `b` out of the chain; that is where the speed comes from.
template <std::size_t step>
[[gnu::always_inline]] inline void Step(State& state, const Words& words) {
    std::uint32_t& a = state[(kSteps - step) % 4];
    const std::uint32_t b = state[(kSteps - step + 1) % 4];
    const std::uint32_t c = state[(kSteps - step + 2) % 4];
    const std::uint32_t d = state[(kSteps - step + 3) % 4];
    std::uint32_t sum = a + kSines[step] + words[WordOf(step)];
    if constexpr (step < 16) {
        sum += d ^ (b & (c ^ d));
    } else if constexpr (step < 32) {
        // The two halves share no bit, so adding them is the same as "or", and the first half is ready early.
        sum += c & ~d;
        sum += b & d;
    } else if constexpr (step < 48) {
        sum += b ^ (c ^ d);
    } else {
        sum += c ^ (b | ~d);
    }
    a = b + std::rotl(sum, kRotations[step / 16][step % 4]);
}

template <std::size_t... steps>
[[gnu::always_inline]] inline void AllSteps(State& state, const Words& words, std::index_sequence<steps...>) {
    (Step<steps>(state, words), ...);
}

}  // namespace

void Md5::TakeBlocks(const unsigned char* data, std::size_t blocks) {
    State state = state_;
    for (; blocks > 0; --blocks, data += kBlockSize) {
        Words words;
        std::memcpy(words.data(), data, kBlockSize);
        const State before = state;
        AllSteps(state, words, std::make_index_sequence<kSteps>());
        for (std::size_t index = 0; index < state.size(); ++index) {
            state[index] += before[index];
        }
    }
    state_ = state;
}

void Md5::Update(const void* data, std::size_t size) {
    if (size == 0) {
        return;
    }
    const auto* bytes = static_cast<const unsigned char*>(data);
    const std::size_t filled = length_ % kBlockSize;
    length_ += size;
    if (filled > 0) {
        const std::size_t taken = std::min(size, kBlockSize - filled);
        std::memcpy(pending_.data() + filled, bytes, taken);
        if (filled + taken < kBlockSize) {
            return;
        }
        TakeBlocks(pending_.data(), 1);
        bytes += taken;
        size -= taken;
    }
    TakeBlocks(bytes, size / kBlockSize);
    std::memcpy(pending_.data(), bytes + (size - size % kBlockSize), size % kBlockSize);
}

std::string Md5::Finish() {
    // The end of the message: one bit, zeros up to the last 8 bytes of a block, and there the length in bits.
    constexpr std::array<unsigned char, kBlockSize> kPadding = {0x80};
    const std::uint64_t bits = length_ * 8;
    const std::size_t filled = length_ % kBlockSize;
    const std::size_t room = kBlockSize - kLengthSize;
    Update(kPadding.data(), filled < room ? room - filled : room + kBlockSize - filled);
    Update(&bits, sizeof bits);

    constexpr const char* kDigits = "0123456789abcdef";
    std::string text;
    for (const std::uint32_t word : state_) {
        for (unsigned shift = 0; shift < 32; shift += 8) {
            text += kDigits[(word >> (shift + 4)) & 0xfU];
            text += kDigits[(word >> shift) & 0xfU];
        }
    }
    return text;
}

}  // namespace HVL
