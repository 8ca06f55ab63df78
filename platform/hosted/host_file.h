#pragma once

#include <sys/stat.h>

#include <cstdio>
#include <string>
#include <string_view>
#include <utility>

/// The host's own files, as this room needs them. Names are the host's; what fails gives its errno.
namespace hosted {

/// Owns a descriptor of the host.
class Descriptor {
public:
    explicit Descriptor(int number = -1) : number_(number) {}
    ~Descriptor() { Close(); }
    Descriptor(Descriptor&& other) noexcept : number_(other.Give()) {}
    Descriptor& operator=(Descriptor&& other) noexcept {
        std::swap(number_, other.number_);
        return *this;
    }

    [[nodiscard]] bool IsOpen() const { return number_ >= 0; }
    [[nodiscard]] int Get() const { return number_; }
    /// Leaves the descriptor to the caller.
    [[nodiscard]] int Give() { return std::exchange(number_, -1); }
    /// 0, or the errno: what was written may turn out lost only now.
    int Close();

private:
    int number_;
};

/// 0, or the errno with which the host stopped taking the bytes.
[[nodiscard]] int WriteAll(int descriptor, std::string_view bytes);

/// As platform::OpenOwnFile() says. `path` is the machine's.
[[nodiscard]] std::FILE* OpenOwnFile(std::string_view path);

/// Without any right to write: what Windows calls read-only, and keeps from being written and deleted whoever asks. The
/// host lets root do both.
[[nodiscard]] bool IsReadOnly(const struct stat& found);

/// Says that the file is open in the machine, for as long as the descriptor and its copies are.
void MarkAsOpen(int descriptor);
/// True while some process has the file open in the machine: then Windows neither deletes nor renames nor replaces it.
[[nodiscard]] bool IsOpenSomewhere(const std::string& hostName);

}  // namespace hosted
