#include "tests/resources/ResourceFile.h"

#include <gtest/gtest.h>

#include <fstream>
#include <iterator>

std::string ResourceFile(const std::string& name) {
    std::ifstream file(HV_RESOURCES "/" + name, std::ios::binary);
    std::string bytes{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
    EXPECT_FALSE(bytes.empty()) << name;
    return bytes;
}

std::uint32_t Number16(const std::string& bytes, std::size_t position) {
    const auto byte = [&](std::size_t at) {
        return static_cast<std::uint32_t>(static_cast<unsigned char>(bytes.at(at)));
    };
    return byte(position) | byte(position + 1) << 8;
}

std::uint32_t Number32(const std::string& bytes, std::size_t position) {
    return Number16(bytes, position) | Number16(bytes, position + 2) << 16;
}
