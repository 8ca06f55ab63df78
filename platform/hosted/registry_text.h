#pragma once

#include <cstdint>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace hosted {

/// Registry text in the REGEDIT4 format, read and written. Nothing here knows a registry or a target.
///
/// Text is UTF-8. Values carry their data as the registry holds them through its ANSI calls: strings with their
/// terminator, numbers in little-endian order.

/// One change that a line of registry text asks for. Keys are full paths that begin with a hive's name.
struct RegistryChange {
    enum class Kind { MakeKey, DeleteKey, SetValue, DeleteValue };
    Kind kind = Kind::MakeKey;
    std::string key;
    std::string name;  ///< Of the value; empty is the key's default value.
    std::uint32_t type = 0;
    std::string data;
};

/// A line that is no registry text: its number, counted from 1, and what is wrong with it.
class RegistryTextError : public std::runtime_error {
public:
    RegistryTextError(std::size_t line, const std::string& what) : std::runtime_error(what), line_(line) {}
    [[nodiscard]] std::size_t Line() const { return line_; }

private:
    std::size_t line_;
};

/// How deep keys may nest, the hive counted, as on Windows.
inline constexpr std::size_t DeepestKey = 512;

/// How many names a key's path is made of; empty ones between separators do not count.
std::size_t CountNames(std::string_view path);

/// The changes that `text` asks for, in their order. Throws RegistryTextError.
std::vector<RegistryChange> ParseRegistryText(std::string_view text);

/// The first line of a file of registry text. Sections follow, each with an empty line before it.
std::string RegistryTextHeader();
/// The lines that make or open `key`, set a value, delete a key, as they stand in a file; each ends in a line feed.
std::string KeyLine(std::string_view key);
std::string DeletedKeyLine(std::string_view key);
std::string DeletedValueLine(std::string_view name);
std::string ValueLine(std::string_view name, std::uint32_t type, std::string_view data);

}  // namespace hosted
