#include "platform/sha256.h"

#include <algorithm>
#include <array>
#include <stdexcept>

#include "platform/win32.h"

// It takes its types from the header above.
#include <bcrypt.h>

namespace platform {
namespace {

/// One call takes at most this much; its count has 32 bits.
constexpr std::size_t LongestPiece = std::size_t{1} << 30;

void Require(NTSTATUS status) {
    if (status < 0) {
        throw std::runtime_error("the system cannot compute a SHA-256");
    }
}

}  // namespace

struct Sha256::State {
    State() {
        Require(BCryptOpenAlgorithmProvider(&algorithm, BCRYPT_SHA256_ALGORITHM, nullptr, 0));
        Require(BCryptCreateHash(algorithm, &hash, nullptr, 0, nullptr, 0, 0));
    }
    ~State() {
        BCryptDestroyHash(hash);
        BCryptCloseAlgorithmProvider(algorithm, 0);
    }
    State(const State&) = delete;
    State& operator=(const State&) = delete;

    BCRYPT_ALG_HANDLE algorithm = nullptr;
    BCRYPT_HASH_HANDLE hash = nullptr;
};

Sha256::Sha256() : state_(std::make_unique<State>()) {}
Sha256::~Sha256() = default;

void Sha256::Update(const void* data, std::size_t size) {
    // The interface has no const; the system only reads.
    auto* bytes = static_cast<PUCHAR>(const_cast<void*>(data));
    while (size > 0) {
        const std::size_t taken = std::min(size, LongestPiece);
        Require(BCryptHashData(state_->hash, bytes, static_cast<ULONG>(taken), 0));
        bytes += taken;
        size -= taken;
    }
}

std::string Sha256::Finish() {
    std::array<unsigned char, 32> digest{};
    Require(BCryptFinishHash(state_->hash, digest.data(), static_cast<ULONG>(digest.size()), 0));
    std::string text;
    for (const unsigned char byte : digest) {
        text += "0123456789abcdef"[byte >> 4];
        text += "0123456789abcdef"[byte & 0xf];
    }
    return text;
}

}  // namespace platform
