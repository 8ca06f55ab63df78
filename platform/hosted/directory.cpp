#include <fcntl.h>
#include <sys/stat.h>

#include <cerrno>
#include <string_view>
#include <vector>

#include "platform/hosted/file_error.h"
#include "platform/hosted/folder.h"
#include "platform/hosted/machine.h"
#include "platform/utf8.h"

namespace hosted::filesystem {
namespace {

constexpr const char* Opening = "boost::filesystem::directory_iterator::construct";
constexpr const char* Advancing = "boost::filesystem::directory_iterator::operator++";

file_type TypeOfMode(mode_t mode) {
    if (S_ISREG(mode)) {
        return regular_file;
    }
    if (S_ISDIR(mode)) {
        return directory_file;
    }
    return S_ISLNK(mode) ? symlink_file : type_unknown;
}

}  // namespace

Folder::Folder(const std::string& hostName)
    : stream_(::opendir(hostName.c_str())), error_(stream_ == nullptr ? errno : 0) {}

Folder::~Folder() {
    if (stream_ != nullptr) {
        ::closedir(stream_);
    }
}

bool Folder::Next() {
    if (stream_ == nullptr) {
        return false;
    }
    do {
        errno = 0;
        entry_ = ::readdir(stream_);
        error_ = entry_ == nullptr ? errno : 0;
    } while (entry_ != nullptr && (std::string_view(Name()) == "." || std::string_view(Name()) == ".."));
    return entry_ != nullptr;
}

file_type Folder::Type() const {
    if (entry_->d_type != DT_UNKNOWN) {
        return TypeOfMode(static_cast<mode_t>(DTTOIF(entry_->d_type)));
    }
    struct stat found {};
    const bool answered = ::fstatat(::dirfd(stream_), Name(), &found, AT_SYMLINK_NOFOLLOW) == 0;
    return answered ? TypeOfMode(found.st_mode) : file_not_found;
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

    [[nodiscard]] const path& Path() const { return path_; }
    [[nodiscard]] const directory_entry& Entry() const { return entry_; }
    [[nodiscard]] int Error() const { return folder_.Error(); }
    [[nodiscard]] bool AtEnd() const { return atEnd_; }

    void Next() {
        atEnd_ = !folder_.Next();
        if (!atEnd_) {
            const file_status itself(folder_.Type());
            // What a link leads to is asked for when somebody wants to know.
            entry_ = directory_entry(path_ / platform::WideFromUtf8(folder_.Name()),
                                     is_symlink(itself) ? file_status() : itself, itself);
        }
    }

private:
    path path_;
    Folder folder_;
    directory_entry entry_;
    bool atEnd_ = false;
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

void directory_iterator::Advance(error_code* error) {
    reader_->Next();
    Report(reader_->Error(), error, Advancing, reader_->Path());
}

directory_iterator::reference directory_iterator::operator*() const {
    return reader_->Entry();
}

directory_iterator& directory_iterator::operator++() {
    Advance(nullptr);
    return *this;
}

directory_iterator& directory_iterator::increment(error_code& error) {
    Advance(&error);
    return *this;
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
