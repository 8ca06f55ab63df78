#pragma once

#include <cstddef>
#include <iomanip>
#include <iterator>
#include <ostream>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>

namespace hosted::filesystem {

/// A Windows path as text: the same names, rules and results as boost::filesystem::path of version 1.81 (its third
/// interface) has on Windows, on whatever machine this is compiled.
///
/// The text is kept as it was given; both `\` and `/` separate, `\` is what gets added. Roots are `C:`, device names
/// like `COM1:`, `\\server` and the prefixes `\\?\`, `\\.\` and `\??\`. Nothing here looks at a file.
/// Narrow text is UTF-8 in both directions; malformed text becomes U+FFFD and never throws (see platform/utf8.h).
/// What is not here is not needed; what is here is held against the library on thousands of paths by a test.
class path {
public:
    using value_type = wchar_t;
    using string_type = std::wstring;

    /// Separates in the generic form.
    static constexpr value_type separator = L'/';
    static constexpr value_type preferred_separator = L'\\';
    static constexpr value_type dot = L'.';

    class iterator;
    using const_iterator = iterator;

    path() noexcept = default;
    path(const value_type* text) : text_(text) {}
    path(string_type text) noexcept : text_(std::move(text)) {}
    path(std::wstring_view text) : text_(text) {}
    path(const char* text);
    path(const std::string& text);
    path(std::string_view text);
    /// From a range of characters, narrow or wide.
    template <class InputIterator, class Char = typename std::iterator_traits<InputIterator>::value_type,
              class = std::enable_if_t<std::is_same_v<Char, char> || std::is_same_v<Char, wchar_t>>>
    path(InputIterator first, InputIterator last) : path(std::basic_string<Char>(first, last)) {}

    path& assign(const path& source);

    /// Joins with a separator where one is missing. An absolute path does not replace what stands here, it is appended
    /// like any other, and appending nothing changes nothing.
    path& append(const path& source);
    path& operator/=(const path& source) { return append(source); }
    /// Joins without a separator.
    path& concat(const path& source);
    path& operator+=(const path& source) { return concat(source); }
    path& operator+=(value_type character);
    path& operator+=(char character);

    void clear() noexcept { text_.clear(); }
    path& make_preferred();
    /// Leaves the parent path.
    path& remove_filename();
    path& remove_trailing_separator();
    path& replace_extension(const path& extension = path());
    void swap(path& other) noexcept { text_.swap(other.text_); }

    [[nodiscard]] const string_type& native() const noexcept { return text_; }
    [[nodiscard]] const value_type* c_str() const noexcept { return text_.c_str(); }
    [[nodiscard]] std::size_t size() const noexcept { return text_.size(); }
    [[nodiscard]] std::string string() const;
    [[nodiscard]] const std::wstring& wstring() const { return text_; }
    template <class String>
    [[nodiscard]] String string() const {
        if constexpr (std::is_same_v<String, std::wstring>) {
            return text_;
        } else {
            return string();
        }
    }
    [[nodiscard]] path generic_path() const;
    [[nodiscard]] std::string generic_string() const;
    [[nodiscard]] std::wstring generic_wstring() const;

    /// Element by element: less than zero, zero or greater. Repeated separators do not count, and neither does the kind
    /// of separator, except inside a root name.
    [[nodiscard]] int compare(const path& other) const;

    [[nodiscard]] path root_name() const;
    [[nodiscard]] path root_directory() const;
    [[nodiscard]] path root_path() const;
    [[nodiscard]] path relative_path() const;
    [[nodiscard]] path parent_path() const;
    /// The last element; `.` for a path that ends in a separator, the root for a path that is nothing else.
    [[nodiscard]] path filename() const;
    [[nodiscard]] path stem() const;
    /// From the last dot of the filename on, also where that dot is its first character.
    [[nodiscard]] path extension() const;

    [[nodiscard]] bool empty() const noexcept { return text_.empty(); }
    [[nodiscard]] bool has_root_name() const { return !root_name().empty(); }
    [[nodiscard]] bool has_root_directory() const { return !root_directory().empty(); }
    [[nodiscard]] bool has_root_path() const { return !root_path().empty(); }
    [[nodiscard]] bool has_relative_path() const { return !relative_path().empty(); }
    [[nodiscard]] bool has_parent_path() const { return !parent_path().empty(); }
    [[nodiscard]] bool has_filename() const { return !empty(); }
    [[nodiscard]] bool has_stem() const { return !stem().empty(); }
    [[nodiscard]] bool has_extension() const { return !extension().empty(); }
    /// Has both a root name and a root directory.
    [[nodiscard]] bool is_absolute() const;
    [[nodiscard]] bool is_relative() const { return !is_absolute(); }

    /// `.` and `..` resolved in the text; a path that ends in a separator ends in `.` afterwards.
    [[nodiscard]] path lexically_normal() const;

    /// Elements from the root name on; the root directory shows as `/`, a trailing separator as `.`.
    [[nodiscard]] iterator begin() const;
    [[nodiscard]] iterator end() const;

private:
    void AppendSeparatorIfNeeded();

    string_type text_;
};

/// Walks a path that outlives it and does not change meanwhile.
class path::iterator {
public:
    using iterator_category = std::bidirectional_iterator_tag;
    using value_type = path;
    using difference_type = std::ptrdiff_t;
    using pointer = const path*;
    using reference = const path&;

    iterator() = default;
    reference operator*() const { return element_; }
    pointer operator->() const { return &element_; }
    iterator& operator++();
    iterator operator++(int);
    iterator& operator--();
    iterator operator--(int);

    friend bool operator==(const iterator& left, const iterator& right) {
        return left.path_ == right.path_ && left.position_ == right.position_;
    }
    friend bool operator!=(const iterator& left, const iterator& right) { return !(left == right); }

private:
    friend class path;
    iterator(const path* whole, std::size_t position, std::wstring_view element);

    const path* path_ = nullptr;
    std::size_t position_ = 0;
    path element_;
};

inline bool operator==(const path& left, const path& right) {
    return left.compare(right) == 0;
}
inline bool operator!=(const path& left, const path& right) {
    return left.compare(right) != 0;
}
inline bool operator<(const path& left, const path& right) {
    return left.compare(right) < 0;
}
inline bool operator<=(const path& left, const path& right) {
    return left.compare(right) <= 0;
}
inline bool operator>(const path& left, const path& right) {
    return left.compare(right) > 0;
}
inline bool operator>=(const path& left, const path& right) {
    return left.compare(right) >= 0;
}
inline path operator/(path left, const path& right) {
    return std::move(left.append(right));
}
inline void swap(path& left, path& right) noexcept {
    left.swap(right);
}

/// Found by boost::hash. It is taken of the text, so paths that compare equal but repeat a separator differ in it, as
/// they do with the library.
std::size_t hash_value(const path& source) noexcept;

/// In double quotes, with `&` before a double quote and before another `&`.
template <class Char, class Traits>
std::basic_ostream<Char, Traits>& operator<<(std::basic_ostream<Char, Traits>& stream, const path& source) {
    return stream << std::quoted(source.string<std::basic_string<Char>>(), static_cast<Char>('"'),
                                 static_cast<Char>('&'));
}

}  // namespace hosted::filesystem
