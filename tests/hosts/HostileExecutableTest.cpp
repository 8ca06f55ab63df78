// What others' executables may hold, against our own reader of version blocks.
#include <gtest/gtest.h>

#include <cstdint>
#include <numeric>
#include <string>
#include <vector>

#include "hvframework/FileVersion.h"
#include "tests/hosts/TestExecutables.h"
#include "tests/support/Machine.h"

namespace {

constexpr const char* kPath = R"(C:\host.exe)";

std::size_t Number(const std::string& bytes, std::size_t at, std::size_t size) {
    std::size_t number = 0;
    for (std::size_t i = size; i > 0; --i) {
        number = number << 8 | static_cast<unsigned char>(bytes[at + i - 1]);
    }
    return number;
}

void Put(std::string& bytes, std::size_t at, std::size_t size, std::uint64_t number) {
    for (std::size_t i = 0; i < size; ++i) {
        bytes[at + i] = static_cast<char>(number >> (8 * i));
    }
}

/// The executable with both versions, and where its parts are.
class HostileExecutable : public testing::Test {
protected:
    /// The version text of an executable with these bytes; "none" when it has none.
    std::string VersionOf(const std::string& bytes) {
        machine.Has(kPath, bytes);
        HVL::Version version;
        return HVL::GetFileVersion(kPath, version) ? version.text : "none";
    }

    std::size_t PeHeader() const { return Number(image, 60, 4); }
    std::size_t OptionalHeader() const { return PeHeader() + 24; }
    std::size_t ResourceDirectoryEntry() const { return OptionalHeader() + 112 + 16; }

    /// The resources' place in the file, from the section that holds them.
    std::size_t Resources() const {
        const std::size_t address = Number(image, ResourceDirectoryEntry(), 4);
        std::size_t section = OptionalHeader() + Number(image, PeHeader() + 20, 2);
        while (Number(image, section + 12, 4) != address) {
            section += 40;
        }
        return Number(image, section + 20, 4);
    }

    /// The entry of the only resource in the directory at `level`: 0 its type, 1 its name, 2 its language.
    std::size_t Entry(int level) const {
        std::size_t entry = Resources() + 16;
        for (int i = 0; i < level; ++i) {
            entry = Resources() + (Number(image, entry + 4, 4) & 0x7fffffff) + 16;
        }
        return entry;
    }
    /// The description of the resource's data: its address and its size.
    std::size_t Description() const { return Resources() + Number(image, Entry(2) + 4, 4); }
    /// The name of the block, three 16-bit numbers after its beginning.
    std::size_t Block() const { return image.find(std::string("V\0S\0_\0V\0", 8)) - 6; }

    std::size_t HeadersEnd() const {
        return OptionalHeader() + Number(image, PeHeader() + 20, 2) + 40 * Number(image, PeHeader() + 6, 2);
    }
    std::size_t BlockEnd() const { return Block() + Number(image, Block(), 2); }

    /// Every place in the headers, and from the resources' beginning to the block's end: the rest is never looked at.
    std::vector<std::size_t> PlacesThatCount() const {
        std::vector<std::size_t> places(HeadersEnd() + BlockEnd() - Resources());
        std::iota(places.begin(), places.end(), 0U);
        for (std::size_t i = HeadersEnd(); i < places.size(); ++i) {
            places[i] += Resources() - HeadersEnd();
        }
        return places;
    }

    Machine machine;
    const std::string image = TestExecutableBytes("both-versions");
};

TEST_F(HostileExecutable, IsReadWholeWithoutHarm) {
    EXPECT_EQ(VersionOf(image), "13.0.5");
}

TEST_F(HostileExecutable, MayBeA32BitImage) {
    // The addresses of the 32-bit header are half as long, so its directories begin 16 bytes earlier.
    std::string narrow = image;
    const std::size_t header = OptionalHeader();
    const std::size_t size = Number(image, PeHeader() + 20, 2);
    Put(narrow, PeHeader() + 4, 2, 0x14c);
    Put(narrow, header, 2, 0x10b);
    narrow.replace(header + 96 - 4, size - 112 + 4, image.substr(header + 112 - 4, size - 112 + 4));
    EXPECT_EQ(VersionOf(narrow), "13.0.5");
}

TEST_F(HostileExecutable, MayEndAnywhere) {
    std::size_t cuts = 0;
    for (const std::size_t length : PlacesThatCount()) {
        EXPECT_EQ(VersionOf(image.substr(0, length)), "none") << "cut at " << length;
        ++cuts;
    }
    EXPECT_EQ(cuts, HeadersEnd() + BlockEnd() - Resources());
    EXPECT_EQ(VersionOf(image.substr(0, BlockEnd())), "13.0.5");
}

TEST_F(HostileExecutable, MayHoldAnyByteAnywhere) {
    std::size_t changed = 0;
    std::size_t answers = 0;
    for (const std::size_t at : PlacesThatCount()) {
        for (const int byte : {0x00, 0x7f, 0xff}) {
            std::string garbled = image;
            garbled[at] = static_cast<char>(byte);
            answers += VersionOf(garbled).empty() ? 0U : 1U;
            ++changed;
        }
    }
    EXPECT_EQ(changed, 3 * (HeadersEnd() + BlockEnd() - Resources()));
    EXPECT_EQ(answers, changed);
}

TEST_F(HostileExecutable, IsPassedOverWhenAPartLeadsNowhere) {
    struct Lie {
        const char* what;
        std::size_t at;
        std::size_t size;
        std::uint64_t number;
    };
    const Lie lies[] = {
        {"no MZ", 0, 2, 0},
        {"the PE header is outside", 60, 4, 0xffffffff},
        {"no PE signature", PeHeader(), 4, 0x4551},
        {"no sections", PeHeader() + 6, 2, 0},
        {"more sections than the file can hold", PeHeader() + 6, 2, 0xffff},
        {"no optional header", PeHeader() + 20, 2, 0},
        {"an optional header larger than the file", PeHeader() + 20, 2, 0xffff},
        {"an optional header of an unknown kind", OptionalHeader(), 2, 0x107},
        {"too few data directories", OptionalHeader() + 108, 4, 2},
        {"no resources", ResourceDirectoryEntry(), 4, 0},
        {"resources outside all sections", ResourceDirectoryEntry(), 4, 0xfffffff0},
        {"a directory larger than the file", Resources() + 14, 2, 0xffff},
        {"an empty directory", Resources() + 14, 2, 0},
        {"another type", Entry(0), 4, 15},
        {"a type that leads outside", Entry(0) + 4, 4, 0xffffffff},
        {"a type that is data at once", Entry(0) + 4, 4, 0x10},
        {"a type that leads back to itself", Entry(0) + 4, 4, 0x80000000},
        {"another name", Entry(1), 4, 2},
        {"a name that is data at once", Entry(1) + 4, 4, 0x10},
        {"a language that is a directory", Entry(2) + 4, 4, 0x80000000},
        {"a language that leads outside", Entry(2) + 4, 4, 0x7fffffff},
        {"data outside all sections", Description(), 4, 0xffffffff},
        {"data larger than the file", Description() + 4, 4, 0xffffffff},
        {"data of no size", Description() + 4, 4, 0},
        {"data that ends before the root value", Description() + 4, 4, 40 + 51},
        {"a root value longer than the data", Block() + 2, 2, 0xffff},
        {"a root value too short for a version", Block() + 2, 2, 51},
        {"no root value", Block() + 2, 2, 0},
        {"a block of another name", Block() + 6, 2, 'X'},
        {"a block of a longer name", Block() + 6 + 2 * 15, 2, 'X'},
    };
    int checked = 0;
    for (const Lie& lie : lies) {
        std::string bytes = image;
        Put(bytes, lie.at, lie.size, lie.number);
        EXPECT_EQ(VersionOf(bytes), "none") << lie.what;
        ++checked;
    }
    EXPECT_EQ(checked, 30);
}

}  // namespace
