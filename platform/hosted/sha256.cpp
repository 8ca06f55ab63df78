#include "platform/sha256.h"

#include <algorithm>
#include <array>
#include <bit>
#include <cstdint>
#include <cstring>

namespace platform {
namespace {

constexpr std::size_t BlockSize = 64;
constexpr std::size_t LengthSize = sizeof(std::uint64_t);
constexpr std::size_t Rounds = 64;

using Words = std::array<std::uint32_t, 8>;

// The first 32 bits of the fractional parts of the cube roots of the first 64 primes.
constexpr std::array<std::uint32_t, Rounds> Roots = {
    0x428a2f98U, 0x71374491U, 0xb5c0fbcfU, 0xe9b5dba5U, 0x3956c25bU, 0x59f111f1U, 0x923f82a4U, 0xab1c5ed5U,
    0xd807aa98U, 0x12835b01U, 0x243185beU, 0x550c7dc3U, 0x72be5d74U, 0x80deb1feU, 0x9bdc06a7U, 0xc19bf174U,
    0xe49b69c1U, 0xefbe4786U, 0x0fc19dc6U, 0x240ca1ccU, 0x2de92c6fU, 0x4a7484aaU, 0x5cb0a9dcU, 0x76f988daU,
    0x983e5152U, 0xa831c66dU, 0xb00327c8U, 0xbf597fc7U, 0xc6e00bf3U, 0xd5a79147U, 0x06ca6351U, 0x14292967U,
    0x27b70a85U, 0x2e1b2138U, 0x4d2c6dfcU, 0x53380d13U, 0x650a7354U, 0x766a0abbU, 0x81c2c92eU, 0x92722c85U,
    0xa2bfe8a1U, 0xa81a664bU, 0xc24b8b70U, 0xc76c51a3U, 0xd192e819U, 0xd6990624U, 0xf40e3585U, 0x106aa070U,
    0x19a4c116U, 0x1e376c08U, 0x2748774cU, 0x34b0bcb5U, 0x391c0cb3U, 0x4ed8aa4aU, 0x5b9cca4fU, 0x682e6ff3U,
    0x748f82eeU, 0x78a5636fU, 0x84c87814U, 0x8cc70208U, 0x90befffaU, 0xa4506cebU, 0xbef9a3f7U, 0xc67178f2U,
};

std::uint32_t BigEndian(const unsigned char* bytes) {
    return std::uint32_t{bytes[0]} << 24 | std::uint32_t{bytes[1]} << 16 | std::uint32_t{bytes[2]} << 8 | bytes[3];
}

using Schedule = std::array<std::uint32_t, Rounds>;

Schedule ScheduleOf(const unsigned char* block) {
    Schedule words{};
    for (std::size_t at = 0; at < 16; ++at) {
        words[at] = BigEndian(block + 4 * at);
    }
    for (std::size_t at = 16; at < Rounds; ++at) {
        const std::uint32_t near = words[at - 2];
        const std::uint32_t far = words[at - 15];
        words[at] = words[at - 16] + (std::rotr(far, 7) ^ std::rotr(far, 18) ^ far >> 3) + words[at - 7] +
                    (std::rotr(near, 17) ^ std::rotr(near, 19) ^ near >> 10);
    }
    return words;
}

void TakeBlock(Words& state, const unsigned char* block) {
    const Schedule words = ScheduleOf(block);
    auto [a, b, c, d, e, f, g, h] = state;
    for (std::size_t round = 0; round < Rounds; ++round) {
        const std::uint32_t first = h + (std::rotr(e, 6) ^ std::rotr(e, 11) ^ std::rotr(e, 25)) + (g ^ (e & (f ^ g))) +
                                    Roots[round] + words[round];
        const std::uint32_t second =
            (std::rotr(a, 2) ^ std::rotr(a, 13) ^ std::rotr(a, 22)) + ((a & b) | (c & (a | b)));
        h = g;
        g = f;
        f = e;
        e = d + first;
        d = c;
        c = b;
        b = a;
        a = first + second;
    }
    const Words after = {a, b, c, d, e, f, g, h};
    std::ranges::transform(state, after, state.begin(), std::plus<>());
}

}  // namespace

struct Sha256::State {
    // The first 32 bits of the fractional parts of the square roots of the first 8 primes.
    Words words = {0x6a09e667U, 0xbb67ae85U, 0x3c6ef372U, 0xa54ff53aU,
                   0x510e527fU, 0x9b05688cU, 0x1f83d9abU, 0x5be0cd19U};
    std::uint64_t length = 0;
    std::array<unsigned char, BlockSize> pending = {};
};

Sha256::Sha256() : state_(std::make_unique<State>()) {}
Sha256::~Sha256() = default;

void Sha256::Update(const void* data, std::size_t size) {
    const auto* bytes = static_cast<const unsigned char*>(data);
    while (size > 0) {
        const std::size_t filled = state_->length % BlockSize;
        const std::size_t taken = std::min(size, BlockSize - filled);
        if (taken == BlockSize) {
            TakeBlock(state_->words, bytes);
        } else {
            std::memcpy(state_->pending.data() + filled, bytes, taken);
            if (filled + taken == BlockSize) {
                TakeBlock(state_->words, state_->pending.data());
            }
        }
        state_->length += taken;
        bytes += taken;
        size -= taken;
    }
}

std::string Sha256::Finish() {
    // The end of the message: one bit, zeros up to the last 8 bytes of a block, and there the length in bits.
    constexpr std::array<unsigned char, BlockSize> Padding = {0x80};
    const std::uint64_t bits = state_->length * 8;
    const std::size_t filled = state_->length % BlockSize;
    const std::size_t room = BlockSize - LengthSize;
    Update(Padding.data(), filled < room ? room - filled : room + BlockSize - filled);
    std::array<unsigned char, LengthSize> length{};
    for (std::size_t at = 0; at < LengthSize; ++at) {
        length[at] = static_cast<unsigned char>(bits >> (56 - 8 * at));
    }
    Update(length.data(), length.size());

    std::string text;
    for (const std::uint32_t word : state_->words) {
        for (int shift = 28; shift >= 0; shift -= 4) {
            text += "0123456789abcdef"[(word >> shift) & 0xfU];
        }
    }
    return text;
}

}  // namespace platform
