#pragma once

#include <boost/system/error_code.hpp>
#include <boost/system/system_error.hpp>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <memory>
#include <string>

#include "platform/hosted/path.h"

/// Files of the hosted machine, under the names of boost::filesystem 1.81 and with what Windows makes of them.
///
/// Every path is a Windows path and goes through Machine::HostPath(). Whatever changes a file asks the machine's faults
/// first. Error codes are the host's own; they compare with boost::system::errc as those of Windows do. Thread-safe as
/// far as the host's files are. What Windows does not let happen, fails here too: a folder cannot be replaced by a
/// rename, a read-only file cannot be replaced, and a copy that failed leaves no file behind.
namespace hosted::filesystem {

using boost::system::error_code;

enum file_type { status_error, file_not_found, regular_file, directory_file, symlink_file, type_unknown };

class file_status {
public:
    file_status() noexcept = default;
    explicit file_status(file_type type) noexcept : type_(type) {}
    [[nodiscard]] file_type type() const noexcept { return type_; }
    friend bool operator==(const file_status&, const file_status&) = default;

private:
    file_type type_ = status_error;
};

/// Carries the error and the paths it is about; what() names them.
class filesystem_error : public boost::system::system_error {
public:
    filesystem_error(const std::string& operation, error_code error);
    filesystem_error(const std::string& operation, const path& first, error_code error);
    filesystem_error(const std::string& operation, const path& first, const path& second, error_code error);

    [[nodiscard]] const path& path1() const noexcept { return details_->first; }
    [[nodiscard]] const path& path2() const noexcept { return details_->second; }
    [[nodiscard]] const char* what() const noexcept override { return details_->what.c_str(); }

private:
    struct Details {
        path first;
        path second;
        std::string what;
    };
    std::shared_ptr<const Details> details_;
};

/// A missing item is no error without a code, but a code that is handed in says why it was not found.
file_status status(const path& item);
file_status status(const path& item, error_code& error);
/// The same for the item itself where it is a symbolic link.
file_status symlink_status(const path& item);
file_status symlink_status(const path& item, error_code& error);

inline bool exists(file_status s) noexcept {
    return s.type() != status_error && s.type() != file_not_found;
}
inline bool is_directory(file_status s) noexcept {
    return s.type() == directory_file;
}
inline bool is_regular_file(file_status s) noexcept {
    return s.type() == regular_file;
}
inline bool is_symlink(file_status s) noexcept {
    return s.type() == symlink_file;
}

inline bool exists(const path& item) {
    return exists(status(item));
}
inline bool exists(const path& item, error_code& error) {
    return exists(status(item, error));
}
inline bool is_directory(const path& item) {
    return is_directory(status(item));
}
inline bool is_directory(const path& item, error_code& error) {
    return is_directory(status(item, error));
}
inline bool is_regular_file(const path& item) {
    return is_regular_file(status(item));
}
inline bool is_regular_file(const path& item, error_code& error) {
    return is_regular_file(status(item, error));
}
inline bool is_symlink(const path& item) {
    return is_symlink(symlink_status(item));
}
inline bool is_symlink(const path& item, error_code& error) {
    return is_symlink(symlink_status(item, error));
}

/// Bytes of a file; `uintmax_t(-1)` with an error, which a folder gives too.
std::uintmax_t file_size(const path& file);
std::uintmax_t file_size(const path& file, error_code& error);

/// Bytes of the host's disk on which `item` lies; each number `uintmax_t(-1)` with an error.
struct space_info {
    std::uintmax_t capacity;
    std::uintmax_t free;
    std::uintmax_t available;
};
space_info space(const path& item, error_code& error);

/// Replaces a file that is there, unless it is read-only, and never a folder.
void rename(const path& from, const path& to);
void rename(const path& from, const path& to, error_code& error);

/// Copies contents, the time of the last change and whether the file is read-only. Fails when `to` exists; what fails
/// on the way leaves no `to`. True when copied.
bool copy_file(const path& from, const path& to);
bool copy_file(const path& from, const path& to, error_code& error);

/// True when made, false without an error when it was there.
bool create_directory(const path& folder);
bool create_directory(const path& folder, error_code& error);
bool create_directories(const path& folder);
bool create_directories(const path& folder, error_code& error);

/// Removes a file, a link or an empty folder, read-only or not; false when there was none.
bool remove(const path& item);
bool remove(const path& item, error_code& error);
/// Removes the item with all below it, following no link; gives how many items that were.
std::uintmax_t remove_all(const path& item);
std::uintmax_t remove_all(const path& item, error_code& error);

path current_path();
path current_path(error_code& error);
void current_path(const path& folder);
void current_path(const path& folder, error_code& error);
path absolute(const path& item, const path& base = current_path());
path absolute(const path& item, error_code& error);

/// What a folder holds: a path and, as far as reading the folder told it, what it is.
class directory_entry {
public:
    directory_entry() = default;
    explicit directory_entry(const class path& item, file_status status = file_status(),
                             file_status symlinkStatus = file_status())
        : path_(item), status_(status), symlinkStatus_(symlinkStatus) {}

    [[nodiscard]] const class path& path() const noexcept { return path_; }
    operator const class path &() const noexcept { return path_; }
    /// As of the reading of the folder where that told it, else asked for once.
    [[nodiscard]] file_status status() const;
    file_status status(error_code& error) const;
    [[nodiscard]] file_status symlink_status() const;
    file_status symlink_status(error_code& error) const;

    friend bool operator==(const directory_entry& left, const directory_entry& right) {
        return left.path_ == right.path_;
    }
    friend bool operator<(const directory_entry& left, const directory_entry& right) {
        return left.path_ < right.path_;
    }

private:
    class path path_;
    mutable file_status status_;
    mutable file_status symlinkStatus_;
};

inline bool exists(const directory_entry& entry) {
    return exists(entry.status());
}
inline bool exists(const directory_entry& entry, error_code& error) {
    return exists(entry.status(error));
}
inline bool is_directory(const directory_entry& entry) {
    return is_directory(entry.status());
}
inline bool is_directory(const directory_entry& entry, error_code& error) {
    return is_directory(entry.status(error));
}
inline bool is_regular_file(const directory_entry& entry) {
    return is_regular_file(entry.status());
}
inline bool is_regular_file(const directory_entry& entry, error_code& error) {
    return is_regular_file(entry.status(error));
}
inline bool is_symlink(const directory_entry& entry) {
    return is_symlink(entry.symlink_status());
}
inline bool is_symlink(const directory_entry& entry, error_code& error) {
    return is_symlink(entry.symlink_status(error));
}

/// The entries of one folder, once, in the order of their names in upper case, as they are when the folder is opened.
/// Copies walk together.
class directory_iterator {
public:
    using iterator_category = std::input_iterator_tag;
    using value_type = directory_entry;
    using difference_type = std::ptrdiff_t;
    using pointer = const directory_entry*;
    using reference = const directory_entry&;

    /// The end of every folder.
    directory_iterator() noexcept = default;
    explicit directory_iterator(const path& folder);
    /// The end when there is an error.
    directory_iterator(const path& folder, error_code& error);

    reference operator*() const;
    pointer operator->() const { return &**this; }
    directory_iterator& operator++();
    directory_iterator& increment(error_code& error);

    friend bool operator==(const directory_iterator& left, const directory_iterator& right) {
        return left.reader_ == right.reader_ || (left.AtEnd() && right.AtEnd());
    }
    friend bool operator!=(const directory_iterator& left, const directory_iterator& right) { return !(left == right); }

private:
    class Reader;
    void Open(const path& folder, error_code* error);
    [[nodiscard]] bool AtEnd() const;

    std::shared_ptr<Reader> reader_;
};

inline directory_iterator begin(const directory_iterator& i) noexcept {
    return i;
}
inline directory_iterator end(const directory_iterator&) noexcept {
    return {};
}

/// The entries of a folder and of all folders below it, a folder before what it holds. Links are not followed.
class recursive_directory_iterator {
public:
    using iterator_category = std::input_iterator_tag;
    using value_type = directory_entry;
    using difference_type = std::ptrdiff_t;
    using pointer = const directory_entry*;
    using reference = const directory_entry&;

    recursive_directory_iterator() noexcept = default;
    explicit recursive_directory_iterator(const path& folder);
    recursive_directory_iterator(const path& folder, error_code& error);

    reference operator*() const;
    pointer operator->() const { return &**this; }
    /// A folder below that cannot be read is an error, and the end.
    recursive_directory_iterator& operator++();
    recursive_directory_iterator& increment(error_code& error);

    /// How many folders below the first one the entry lies.
    [[nodiscard]] int depth() const;
    /// Passes over what the current folder holds.
    void disable_recursion_pending(bool value = true);

    friend bool operator==(const recursive_directory_iterator& left, const recursive_directory_iterator& right) {
        return left.walk_ == right.walk_ || (left.AtEnd() && right.AtEnd());
    }
    friend bool operator!=(const recursive_directory_iterator& left, const recursive_directory_iterator& right) {
        return !(left == right);
    }

private:
    struct Walk;
    void Open(const path& folder, error_code* error);
    void Advance(error_code* error);
    [[nodiscard]] bool AtEnd() const;

    std::shared_ptr<Walk> walk_;
};

inline recursive_directory_iterator begin(const recursive_directory_iterator& i) noexcept {
    return i;
}
inline recursive_directory_iterator end(const recursive_directory_iterator&) noexcept {
    return {};
}

}  // namespace hosted::filesystem
