#pragma once

#include <cstddef>
#include <cstdint>

namespace fuzzing {

/// The input taken as a row of choices, one a byte, for fuzzers that make something of which they know what must come.
/// When the bytes are used up, every choice is the first.
class Choices {
public:
    Choices(const std::uint8_t* data, std::size_t size) : data_(data), left_(size) {}

    /// One of `count` numbers from 0 on.
    std::size_t Next(std::size_t count) {
        if (left_ == 0) {
            return 0;
        }
        --left_;
        return *data_++ % count;
    }

private:
    const std::uint8_t* data_;
    std::size_t left_;
};

}  // namespace fuzzing
