// finish_program PROGRAM.exe: what the linker leaves undone in a Windows program.
//
// The linker keeps the section .loadcfg (platform/windows/library_search.cpp) without telling the loader of it. This
// enters it in the program's directory, as its load configuration, and writes the checksum anew. The same program gives
// the same bytes, and a finished program stays as it is. It runs where the program is built, straight after the linker,
// so before anybody signs the program. A file that is no such program is left alone, with a line that says why.

#include <cstdint>
#include <cstring>
#include <fstream>
#include <iostream>
#include <iterator>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

constexpr std::size_t kHeaderOffsetPlace = 0x3C;
constexpr std::size_t kFileHeaderSize = 4 + 20;  // with the signature before it
constexpr std::size_t kSectionHeaderSize = 40;
constexpr std::uint16_t kMagic64 = 0x20B;

// Within the optional header of a 64-bit program.
constexpr std::size_t kChecksumPlace = 64;
constexpr std::size_t kLoadConfigurationEntry = 112 + 10 * 8;

class Program {
public:
    explicit Program(std::vector<char> bytes) : bytes_(std::move(bytes)) {
        header_ = Read<std::uint32_t>(kHeaderOffsetPlace);
        if (Read<std::uint32_t>(header_) != 0x4550 || Read<std::uint16_t>(OptionalHeader()) != kMagic64) {
            throw std::runtime_error("is no 64-bit Windows program");
        }
    }

    void EnterLoadConfiguration() {
        const std::size_t section = FindSection(".loadcfg");
        const auto address = Read<std::uint32_t>(section + 12);
        // The record begins with its own size.
        const auto size = Read<std::uint32_t>(Read<std::uint32_t>(section + 20));
        if (size == 0 || size > Read<std::uint32_t>(section + 16)) {
            throw std::runtime_error("has no record in its section .loadcfg");
        }
        Write(OptionalHeader() + kLoadConfigurationEntry, address);
        Write(OptionalHeader() + kLoadConfigurationEntry + 4, size);
    }

    // The sum of all 16-bit words but the checksum's own, with the carry added at the bottom, plus the file's size.
    void WriteChecksum() {
        Write(OptionalHeader() + kChecksumPlace, std::uint32_t{0});
        std::uint32_t sum = 0;
        for (std::size_t place = 0; place < bytes_.size(); place += 2) {
            sum += place + 1 < bytes_.size() ? Read<std::uint16_t>(place) : static_cast<unsigned char>(bytes_[place]);
            sum = (sum & 0xFFFF) + (sum >> 16);
        }
        Write(OptionalHeader() + kChecksumPlace, sum + static_cast<std::uint32_t>(bytes_.size()));
    }

    [[nodiscard]] const std::vector<char>& Bytes() const { return bytes_; }

private:
    // Numbers of a program are little-endian, as those of the machines that build it are.
    template <typename Number>
    [[nodiscard]] Number Read(std::size_t place) const {
        Require(place, sizeof(Number));
        Number number{};
        std::memcpy(&number, bytes_.data() + place, sizeof number);
        return number;
    }

    template <typename Number>
    void Write(std::size_t place, Number number) {
        Require(place, sizeof number);
        std::memcpy(bytes_.data() + place, &number, sizeof number);
    }

    void Require(std::size_t place, std::size_t size) const {
        if (place > bytes_.size() || bytes_.size() - place < size) {
            throw std::runtime_error("ends too early");
        }
    }

    [[nodiscard]] std::size_t OptionalHeader() const { return header_ + kFileHeaderSize; }

    [[nodiscard]] std::size_t FindSection(const char* name) const {
        std::size_t section = OptionalHeader() + Read<std::uint16_t>(header_ + 20);
        for (int left = Read<std::uint16_t>(header_ + 6); left > 0; --left, section += kSectionHeaderSize) {
            Require(section, kSectionHeaderSize);
            if (std::strncmp(bytes_.data() + section, name, 8) == 0) {
                return section;
            }
        }
        throw std::runtime_error(std::string("has no section ") + name);
    }

    std::vector<char> bytes_;
    std::size_t header_ = 0;
};

std::vector<char> Load(const char* path) {
    std::ifstream file(path, std::ios::binary);
    std::vector<char> bytes{std::istreambuf_iterator<char>(file), {}};
    if (!file) {
        throw std::runtime_error("cannot be read");
    }
    return bytes;
}

// In place: a file that is replaced would lose its mode.
void Save(const char* path, const std::vector<char>& bytes) {
    std::fstream file(path, std::ios::binary | std::ios::in | std::ios::out);
    file.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    file.close();
    if (!file) {
        throw std::runtime_error("cannot be written");
    }
}

}  // namespace

int main(int argc, char** argv) {
    if (argc != 2) {
        std::cerr << "usage: finish_program PROGRAM.exe\n";
        return 2;
    }
    try {
        Program program(Load(argv[1]));
        program.EnterLoadConfiguration();
        program.WriteChecksum();
        Save(argv[1], program.Bytes());
        return 0;
    } catch (const std::exception& error) {
        std::cerr << "finish_program: " << argv[1] << " " << error.what() << "\n";
        return 1;
    }
}
