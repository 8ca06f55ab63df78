#pragma once

#include <cstddef>
#include <memory>
#include <string>

namespace platform {

/// SHA-256 (FIPS 180-4) of data that comes in pieces: a digest that nobody can make a second file for.
///
/// On Windows it is the system's own, which knows what its processor can do. One object hashes one message; it is not
/// shared between threads.
class Sha256 {
public:
    /// Throws std::runtime_error when the system cannot give one.
    Sha256();
    ~Sha256();
    Sha256(const Sha256&) = delete;
    Sha256& operator=(const Sha256&) = delete;

    /// Takes in the next `size` bytes at `data`. How the message is cut into pieces does not matter.
    void Update(const void* data, std::size_t size);

    /// The digest of all that was taken in, as 64 lower-case hexadecimal digits. It ends the message: nothing may be
    /// asked of the object afterwards.
    [[nodiscard]] std::string Finish();

private:
    struct State;
    std::unique_ptr<State> state_;
};

}  // namespace platform
