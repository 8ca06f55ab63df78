#include "package/ZipEntries.h"

#include <algorithm>
#include <functional>
#include <limits>
#include <string_view>

#include "platform/filesystem.h"
#include "platform/libraries.h"

namespace HV {
namespace {

constexpr std::uint16_t kStored = 0;
constexpr std::uint16_t kDeflated = 8;
constexpr std::uint16_t kEncryptedFlag = 1;

/// Deflate's shortest code stands for 258 bytes in two bits. Whoever claims more is not telling the truth.
constexpr std::uint64_t kBestDeflateRatio = 1032;

/// What an archive says when its number of entries does not fit into the field: this many, or any number above.
constexpr std::uint64_t kCountThatDoesNotFit = 0xFFFF;

/// The library's lengths and results are ints: what it is asked for at once stays below.
constexpr std::uint64_t kLargestRead = std::uint64_t{1} << 30;

unzFile OpenArchive(const fs::path& path) {
    zlib_filefunc64_def functions{};
    platform::FillArchiveFileFunctions(functions);
    return unzOpen2_64(path.c_str(), &functions);
}

std::uint64_t FileSize(const fs::path& path) {
    boost::system::error_code error;
    const std::uint64_t size = fs::file_size(path, error);
    return error ? 0 : size;
}

bool NamesDirectory(const std::string& name) {
    return !name.empty() && (name.back() == '/' || name.back() == '\\');
}

}  // namespace

ZipEntries::ZipEntries(const std::string& archivePath) {
    const fs::path path(archivePath);
    archive_ = OpenArchive(path);
    if (archive_ == nullptr) {
        return;
    }
    archiveSize_ = FileSize(path);
    if (!ListEntries()) {
        files_.clear();
        directories_.clear();
        Close();
    }
}

ZipEntries::~ZipEntries() {
    Close();
}

void ZipEntries::Close() {
    if (archive_ != nullptr) {
        CloseEntry();
        unzClose(archive_);
        archive_ = nullptr;
    }
}

bool ZipEntries::ListEntries() {
    unz_global_info64 info{};
    if (unzGetGlobalInfo64(archive_, &info) != UNZ_OK) {
        return false;
    }
    if (info.number_entry == 0) {
        return true;
    }
    int step = unzGoToFirstFile(archive_);
    while (step == UNZ_OK && ListCurrentEntry()) {
        step = unzGoToNextFile(archive_);
    }
    if (step == UNZ_END_OF_LIST_OF_FILE) {
        return true;
    }
    return step != UNZ_OK && info.number_entry == kCountThatDoesNotFit &&
           files_.size() + directories_.size() >= kCountThatDoesNotFit;
}

bool ZipEntries::ListCurrentEntry() {
    char buffer[kEntryNameRoom] = {};
    unz_file_info64 info{};
    Entry entry{};
    if (unzGetCurrentFileInfo64(archive_, &info, buffer, sizeof buffer, nullptr, 0, nullptr, 0) != UNZ_OK ||
        unzGetFilePos64(archive_, &entry.position) != UNZ_OK) {
        return false;
    }
    buffer[sizeof buffer - 1] = '\0';
    std::string name(buffer);
    // A name that was cut is no directory's, so that it is met, and fails, among the files.
    entry.nameFits = info.size_filename < sizeof buffer;
    if (entry.nameFits && NamesDirectory(name)) {
        directories_.push_back(std::move(name));
        return true;
    }
    entry.compressedSize = info.compressed_size;
    entry.size = info.uncompressed_size;
    entry.method = static_cast<std::uint16_t>(info.compression_method);
    entry.flags = static_cast<std::uint16_t>(info.flag);
    files_.push_back(std::move(name));
    entries_.push_back(entry);
    return true;
}

bool ZipEntries::OpenEntry(const std::string& name) {
    CloseEntry();
    const Entry* entry = Locate(name);
    if (entry == nullptr || !CanBeRead(*entry) || unzGoToFilePos64(archive_, &entry->position) != UNZ_OK ||
        unzOpenCurrentFile(archive_) != UNZ_OK) {
        return false;
    }
    entryIsOpen_ = true;
    entrySize_ = entry->size;
    return true;
}

/// The library would hand out the packed bytes of a method that it does not know, and would not notice encryption. The
/// sizes are tested before anybody allocates by them.
bool ZipEntries::CanBeRead(const Entry& entry) const {
    if (!entry.nameFits || (entry.flags & kEncryptedFlag) != 0 || entry.compressedSize > archiveSize_) {
        return false;
    }
    if (entry.method == kStored) {
        return entry.size == entry.compressedSize;
    }
    return entry.method == kDeflated && entry.size / kBestDeflateRatio <= entry.compressedSize &&
           entry.size <= std::numeric_limits<std::size_t>::max();
}

bool ZipEntries::ReadEntry(char* buffer) {
    std::uint64_t done = 0;
    while (done < entrySize_) {
        const auto wanted = static_cast<unsigned>(std::min(entrySize_ - done, kLargestRead));
        const int got = unzReadCurrentFile(archive_, buffer + done, wanted);
        if (got <= 0) {
            return false;
        }
        done += static_cast<std::uint64_t>(got);
    }
    return true;
}

bool ZipEntries::CloseEntry() {
    if (!entryIsOpen_) {
        return true;
    }
    entryIsOpen_ = false;
    entrySize_ = 0;
    return unzCloseCurrentFile(archive_) == UNZ_OK;
}

void ZipEntries::TakeLists(std::vector<std::string>& files, std::vector<std::string>& directories) {
    files = std::move(files_);
    directories = std::move(directories_);
    files_.clear();
    directories_.clear();
    entries_.clear();
    nameIndex_.clear();
}

/// The library's own search walks the whole directory for each name. This one does so once for all of them.
const ZipEntries::Entry* ZipEntries::Locate(const std::string& name) {
    if (nameIndex_.size() != files_.size()) {
        IndexNames();
    }
    const std::size_t hash = std::hash<std::string_view>()(name);
    auto found = std::ranges::lower_bound(nameIndex_, std::pair(hash, std::size_t{0}));
    while (found != nameIndex_.end() && found->first == hash) {
        if (files_[found->second] == name) {
            return &entries_[found->second];
        }
        ++found;
    }
    return nullptr;
}

void ZipEntries::IndexNames() {
    nameIndex_.clear();
    nameIndex_.reserve(files_.size());
    for (std::size_t place = 0; place < files_.size(); ++place) {
        nameIndex_.emplace_back(std::hash<std::string_view>()(files_[place]), place);
    }
    std::ranges::sort(nameIndex_);
}

int ReadZipEntries(const std::string& archivePath, std::vector<std::string>& files,
                   std::vector<std::string>& directories) {
    files.clear();
    directories.clear();
    ZipEntries archive(archivePath);
    if (!archive.IsOpen()) {
        return -1;
    }
    archive.TakeLists(files, directories);
    return 0;
}

int ReadZipEntryBytes(const std::string& archivePath, const std::string& entryName, std::vector<char>& bytes) {
    bytes.clear();
    ZipEntries archive(archivePath);
    if (!archive.OpenEntry(entryName) || archive.EntrySize() == 0) {
        return -1;
    }
    bytes.resize(archive.EntrySize());
    const bool complete = archive.ReadEntry(bytes.data());
    return archive.CloseEntry() && complete ? 0 : -1;
}

}  // namespace HV
