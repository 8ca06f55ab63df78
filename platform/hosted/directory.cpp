#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <memory>
#include <string_view>
#include <vector>

#include "platform/hosted/file_error.h"
#include "platform/hosted/folder.h"
#include "platform/hosted/ignoring_case.h"
#include "platform/hosted/machine.h"
#include "platform/utf8.h"

namespace hosted::filesystem {
namespace {

constexpr const char* Opening = "boost::filesystem::directory_iterator::construct";

file_type TypeOfMode(mode_t mode) {
    if (S_ISREG(mode)) {
        return regular_file;
    }
    if (S_ISDIR(mode)) {
        return directory_file;
    }
    return S_ISLNK(mode) ? symlink_file : type_unknown;
}

file_type TypeOf(DIR* folder, const dirent& entry) {
    if (entry.d_type != DT_UNKNOWN) {
        return TypeOfMode(static_cast<mode_t>(DTTOIF(entry.d_type)));
    }
    struct stat found {};
    const bool answered = ::fstatat(::dirfd(folder), entry.d_name, &found, AT_SYMLINK_NOFOLLOW) == 0;
    return answered ? TypeOfMode(found.st_mode) : file_not_found;
}

/// Names that differ in nothing but case, which the host allows, need an order too.
bool ComesBefore(const Folder::Entry& left, const Folder::Entry& right) {
    const LessIgnoringCase less;
    return less(left.name, right.name) || (!less(right.name, left.name) && left.name < right.name);
}

}  // namespace

Folder::Folder(const std::string& hostName) {
    struct Close {
        void operator()(DIR* folder) const { ::closedir(folder); }
    };
    const std::unique_ptr<DIR, Close> folder(::opendir(hostName.c_str()));
    errno = folder != nullptr ? 0 : errno;
    while (const dirent* entry = folder != nullptr ? ::readdir(folder.get()) : nullptr) {
        const std::string_view name(entry->d_name);
        if (name != "." && name != "..") {
            entries_.push_back({std::string(name), TypeOf(folder.get(), *entry)});
        }
        errno = 0;
    }
    error_ = errno;
    if (error_ != 0) {
        entries_.clear();
    }
    std::sort(entries_.begin(), entries_.end(), ComesBefore);
}

file_status directory_entry::symlink_status() const {
    if (symlinkStatus_.type() == status_error) {
        symlinkStatus_ = hosted::filesystem::symlink_status(path_);
    }
    return symlinkStatus_;
}

file_status directory_entry::symlink_status(error_code& error) const {
    error.clear();
    if (symlinkStatus_.type() == status_error) {
        symlinkStatus_ = hosted::filesystem::symlink_status(path_, error);
    }
    return symlinkStatus_;
}

file_status directory_entry::status() const {
    if (status_.type() == status_error) {
        status_ = hosted::filesystem::status(path_);
    }
    return status_;
}

file_status directory_entry::status(error_code& error) const {
    error.clear();
    if (status_.type() == status_error) {
        status_ = hosted::filesystem::status(path_, error);
    }
    return status_;
}

class directory_iterator::Reader {
public:
    explicit Reader(const path& folder) : path_(folder), folder_(Machine::Current().HostPath(folder.native())) {}

    [[nodiscard]] const directory_entry& Entry() const { return entry_; }
    [[nodiscard]] int Error() const { return folder_.Error(); }
    [[nodiscard]] bool AtEnd() const { return next_ > folder_.Entries().size(); }

    void Next() {
        if (next_ < folder_.Entries().size()) {
            const Folder::Entry& found = folder_.Entries()[next_];
            const file_status itself(found.type);
            // What a link leads to is asked for when somebody wants to know.
            entry_ = directory_entry(path_ / platform::WideFromUtf8(found.name),
                                     is_symlink(itself) ? file_status() : itself, itself);
        }
        ++next_;
    }

private:
    path path_;
    Folder folder_;
    directory_entry entry_;
    std::size_t next_ = 0;
};

directory_iterator::directory_iterator(const path& folder) {
    Open(folder, nullptr);
}
directory_iterator::directory_iterator(const path& folder, error_code& error) {
    Open(folder, &error);
}

bool directory_iterator::AtEnd() const {
    return reader_ == nullptr || reader_->AtEnd();
}

void directory_iterator::Open(const path& folder, error_code* error) {
    auto reader = std::make_shared<Reader>(folder);
    reader->Next();
    Report(reader->Error(), error, Opening, folder);
    if (reader->Error() == 0) {
        reader_ = std::move(reader);
    }
}

directory_iterator::reference directory_iterator::operator*() const {
    return reader_->Entry();
}

directory_iterator& directory_iterator::operator++() {
    reader_->Next();
    return *this;
}

directory_iterator& directory_iterator::increment(error_code& error) {
    error.clear();
    return ++*this;
}

/// From the first folder down to the one that is being read.
struct recursive_directory_iterator::Walk {
    std::vector<directory_iterator> folders;
    bool passOver = false;
};

recursive_directory_iterator::recursive_directory_iterator(const path& folder) {
    Open(folder, nullptr);
}

recursive_directory_iterator::recursive_directory_iterator(const path& folder, error_code& error) {
    Open(folder, &error);
}

bool recursive_directory_iterator::AtEnd() const {
    return walk_ == nullptr || walk_->folders.empty();
}

void recursive_directory_iterator::Open(const path& folder, error_code* error) {
    directory_iterator first = error != nullptr ? directory_iterator(folder, *error) : directory_iterator(folder);
    if (first != directory_iterator()) {
        walk_ = std::make_shared<Walk>();
        walk_->folders.push_back(std::move(first));
    }
}

void recursive_directory_iterator::Advance(error_code* error) {
    error_code failure;
    std::vector<directory_iterator>& folders = walk_->folders;
    const path current = folders.back()->path();
    const bool enter = !walk_->passOver && is_directory(folders.back()->symlink_status(failure));
    walk_->passOver = false;
    if (enter) {
        folders.emplace_back(current, failure);
    } else if (!failure) {
        folders.back().increment(failure);
    }
    while (!failure && !folders.empty() && folders.back() == directory_iterator()) {
        folders.pop_back();
        if (!folders.empty()) {
            folders.back().increment(failure);
        }
    }
    if (failure) {
        folders.clear();
    }
    Report(failure.value(), error, "boost::filesystem::recursive_directory_iterator::operator++", current);
}

recursive_directory_iterator::reference recursive_directory_iterator::operator*() const {
    return *walk_->folders.back();
}

recursive_directory_iterator& recursive_directory_iterator::operator++() {
    Advance(nullptr);
    return *this;
}

recursive_directory_iterator& recursive_directory_iterator::increment(error_code& error) {
    Advance(&error);
    return *this;
}

int recursive_directory_iterator::depth() const {
    return static_cast<int>(walk_->folders.size()) - 1;
}
void recursive_directory_iterator::disable_recursion_pending(bool value) {
    walk_->passOver = value;
}

}  // namespace hosted::filesystem
