#include "package/ZipEntries.h"

#include <algorithm>
#include <array>
#include <iterator>
#include <string_view>
#include <unordered_map>

#include "hvframework/Log.h"
#include "package/EntryNames.h"
#include "package/Inflater.h"
#include "platform/filesystem.h"
#include "platform/libraries.h"
#include "platform/utf8.h"

namespace HV {
namespace {

constexpr std::uint16_t kStored = 0;
constexpr std::uint16_t kDeflated = 8;
constexpr std::uint16_t kEncryptedFlag = 1;

/// Deflate's shortest code stands for 258 bytes in two bits. Whoever claims more is not telling the truth.
constexpr std::uint64_t kBestDeflateRatio = 1032;

constexpr std::uint64_t kLargestFile = 0xFFFFFFFF;

/// An entry's header without its name, in the directory and before its bytes.
constexpr std::uint64_t kDirectoryHeaderLength = 46;
constexpr std::uint64_t kOwnHeaderLength = 30;

constexpr std::size_t kPackedRoom = std::size_t{1} << 17;

/// What stands where a directory ends: its signature, the wide form of its end, or the end.
constexpr std::array<std::string_view, 3> kEndsOfDirectory{"PK\x05\x05", "PK\x06\x06", "PK\x05\x06"};

bool NamesDirectory(const std::string& name) {
    return !name.empty() && (name.back() == '/' || name.back() == '\\');
}

std::unique_ptr<platform::ArchiveFile> OpenForReading(const fs::path& path) {
    auto file = platform::OpenRawFile(path.c_str(), platform::RawFile::Mode::Read);
    return file ? std::make_unique<platform::ArchiveFile>(std::move(file)) : nullptr;
}

std::string TextAt(platform::ArchiveFile& file, std::uint64_t place, std::size_t length) {
    std::string text(length, '\0');
    file.MoveTo(place);
    text.resize(file.Read(text.data(), length));
    return text;
}

}  // namespace

ZipEntries::ZipEntries(const std::string& archivePath) : file_(OpenForReading(fs::path(archivePath))) {
    if (file_ == nullptr) {
        return;
    }
    Open();
    if (archive_ != nullptr && !ListEntries()) {
        unzClose(archive_);
        archive_ = nullptr;
        directories_ = {};
        files_ = {};
    }
}

ZipEntries::~ZipEntries() {
    if (archive_ != nullptr) {
        unzClose(archive_);
    }
}

void ZipEntries::Open() {
    zlib_filefunc64_def functions{};
    platform::FillArchiveFileFunctions(functions, *file_);
    archive_ = unzOpen2_64("", &functions);
}

bool ZipEntries::ListEntries() {
    unz_global_info64 info{};
    if (unzGetGlobalInfo64(archive_, &info) != UNZ_OK) {
        return false;
    }
    int step = unzGoToFirstFile(archive_);
    while (step == UNZ_OK && ListCurrentEntry()) {
        step = unzGoToNextFile(archive_);
    }
    const std::uint64_t listed = files_.names.size() + directories_.names.size();
    const bool counted =
        listed == info.number_entry || (info.number_entry == kCountThatDoesNotFit && listed > kCountThatDoesNotFit);
    const bool goesOn = listed > 0 && unzGoToFilePos64(archive_, &behind_) == UNZ_OK;
    const bool ends = !goesOn && IsAtEndOfDirectory();
    if (goesOn || (ends && !counted)) {
        const bool more = goesOn || listed > info.number_entry;
        HVL_LOG(Error, "the archive counts " << info.number_entry << " entries, and its directory lists "
                                             << (more ? "more" : std::to_string(listed)));
    }
    return counted && ends;
}

/// The library gives up at whatever is no entry. What it looked at last tells an end from a directory that breaks off.
bool ZipEntries::IsAtEndOfDirectory() {
    const std::string signature = TextAt(*file_, file_->LastMove(), kEndsOfDirectory.front().size());
    return std::ranges::find(kEndsOfDirectory, signature) != kEndsOfDirectory.end();
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
    entry.compressedSize = info.compressed_size;
    entry.size = info.uncompressed_size;
    entry.checksum = static_cast<std::uint32_t>(info.crc);
    entry.nameLength = static_cast<std::uint16_t>(info.size_filename);
    entry.method = static_cast<std::uint16_t>(info.compression_method);
    entry.flags = static_cast<std::uint16_t>(info.flag);
    std::string name(buffer);
    // A name that was cut is no directory's, so that it is met, and fails, among the files.
    List& list = entry.nameLength == name.size() && NamesDirectory(name) ? directories_ : files_;
    list.names.push_back(std::move(name));
    list.entries.push_back(entry);
    behind_ = entry.position;
    behind_.num_of_file += 1;
    behind_.pos_in_zip_directory +=
        kDirectoryHeaderLength + info.size_filename + info.size_file_extra + info.size_file_comment;
    return true;
}

std::size_t ZipEntries::FindFile(const std::string& name) const {
    return static_cast<std::size_t>(std::ranges::find(files_.names, name) - files_.names.begin());
}

std::uint64_t ZipEntries::TotalSize() const {
    std::uint64_t total = 0;
    for (const Entry& entry : files_.entries) {
        total = entry.size > std::numeric_limits<std::uint64_t>::max() - total
                    ? std::numeric_limits<std::uint64_t>::max()
                    : total + entry.size;
    }
    return total;
}

bool ZipEntries::CheckDirectory(std::size_t place) {
    CloseFile();
    const bool sound = OpenEntry(directories_, place);
    CloseFile();
    return sound;
}

bool ZipEntries::OpenFile(std::size_t place) {
    CloseFile();
    if (place >= files_.entries.size()) {
        return Fail("there is no such entry");
    }
    if (std::string fault = FaultOfContents(files_.entries[place]); !fault.empty()) {
        return Fail(std::move(fault));
    }
    return OpenEntry(files_, place);
}

bool ZipEntries::OpenEntry(const List& list, std::size_t place) {
    FindNamesakes();
    const Entry& entry = list.entries[place];
    if (std::string fault = FaultOfName(entry, list.names[place]); !fault.empty()) {
        return Fail(std::move(fault));
    }
    // Unpacking by the library is for bytes that are not packed.
    int method = 0;
    int level = 0;
    const int raw = entry.method == kStored ? 0 : 1;
    if (unzGoToFilePos64(archive_, &entry.position) != UNZ_OK ||
        unzOpenCurrentFile2(archive_, &method, &level, raw) != UNZ_OK) {
        return Fail("its own header is missing, or says otherwise than the directory");
    }
    current_ = &entry;
    std::string fault = FaultOfHeader(entry, list.names[place]);
    return fault.empty() || Fail(std::move(fault));
}

/// Two names that are one to Windows would become one file, with the bytes of whichever is written last.
void ZipEntries::FindNamesakes() {
    if (namesakesKnown_) {
        return;
    }
    namesakesKnown_ = true;
    struct Known {
        Entry* entry;
        const std::string* name;
    };
    std::unordered_map<std::string, Known> known;
    known.reserve(directories_.names.size() + files_.names.size());
    for (List* list : {&directories_, &files_}) {
        for (std::size_t place = 0; place < list->names.size(); ++place) {
            const Known found{&list->entries[place], &list->names[place]};
            const auto [first, isNew] = known.emplace(EntryNameOnWindows(*found.name), found);
            if (!isNew) {
                found.entry->namesake = first->second.name;
                first->second.entry->namesake = found.name;
            }
        }
    }
}

std::string ZipEntries::FaultOfName(const Entry& entry, const std::string& name) {
    if (entry.nameLength != name.size()) {
        return entry.nameLength < kEntryNameRoom
                   ? "there is a zero byte in its name"
                   : "its name is longer than " + std::to_string(kEntryNameRoom - 1) + " bytes";
    }
    if (!platform::IsUtf8(name)) {
        return "its name is not UTF-8";
    }
    if (!IsSafeEntryName(name)) {
        return "its name cannot be used on Windows";
    }
    return entry.namesake != nullptr ? "to Windows it has the same name as " + *entry.namesake : "";
}

/// The library would hand out the packed bytes of a method that it does not know, and would not notice encryption. The
/// sizes are tested before anybody allocates by them.
std::string ZipEntries::FaultOfContents(const Entry& entry) {
    if ((entry.flags & kEncryptedFlag) != 0) {
        return "it is encrypted";
    }
    if (entry.method != kStored && entry.method != kDeflated) {
        return "it is compressed by the unknown method " + std::to_string(entry.method);
    }
    if (entry.size > kLargestFile) {
        return "it is larger than " + std::to_string(kLargestFile) + " bytes";
    }
    const bool possible = entry.method == kStored ? entry.size == entry.compressedSize
                                                  : entry.size / kBestDeflateRatio <= entry.compressedSize;
    return possible ? "" : "its sizes cannot both be true";
}

std::string ZipEntries::FaultOfHeader(const Entry& entry, const std::string& name) {
    const std::uint64_t data = unzGetCurrentFileZStreamPos64(archive_);
    const auto extra = static_cast<std::uint64_t>(unzGetLocalExtrafield(archive_, nullptr, 0));
    const std::uint64_t header = data - extra - entry.nameLength - kOwnHeaderLength;
    if (std::string own = TextAt(*file_, header + kOwnHeaderLength, entry.nameLength); own != name) {
        return "its own header names it " + own;
    }
    if (data > file_->Size() || entry.compressedSize > file_->Size() - data) {
        return "the archive ends before its bytes do";
    }
    return ClaimBytes(entry, header, data + entry.compressedSize);
}

/// No byte belongs to two entries: an archive in which one is inside another is read in different ways by different
/// programs, and unpacks to more than anyone expects.
std::string ZipEntries::ClaimBytes(const Entry& entry, std::uint64_t from, std::uint64_t to) {
    const auto next = claims_.upper_bound(from);
    const bool meetsNext = next != claims_.end() && next->first < to;
    const bool meetsLast =
        next != claims_.begin() && std::prev(next)->second.first > from && std::prev(next)->second.second != &entry;
    if (meetsNext || meetsLast) {
        return "it overlaps another entry";
    }
    claims_.insert_or_assign(next, from, std::pair(to, &entry));
    return "";
}

bool ZipEntries::ReadFile(char* buffer) {
    const bool whole = current_->method == kStored ? ReadStored(buffer) : ReadDeflated(buffer);
    const bool closed = CloseFile();
    return whole && (closed || Fail("its bytes do not match their checksum"));
}

bool ZipEntries::ReadStored(char* buffer) {
    std::uint64_t done = 0;
    while (done < current_->size) {
        const auto wanted = static_cast<unsigned>(std::min(current_->size - done, kLargestPiece));
        const int got = unzReadCurrentFile(archive_, buffer + done, wanted);
        if (got <= 0) {
            return Fail("its bytes cannot be read");
        }
        done += static_cast<std::uint64_t>(got);
    }
    return true;
}

/// Packed bytes are taken from where the library found them: it says nothing of what follows the bytes that it unpacks.
bool ZipEntries::ReadDeflated(char* buffer) {
    std::uint64_t left = current_->compressedSize;
    packed_.resize(static_cast<std::size_t>(std::min(left, kPackedRoom)));
    Inflater inflater(buffer, current_->size);
    file_->MoveTo(unzGetCurrentFileZStreamPos64(archive_));
    while (left > 0) {
        const auto wanted = static_cast<std::size_t>(std::min<std::uint64_t>(left, packed_.size()));
        if (file_->Read(packed_.data(), wanted) != wanted) {
            return Fail("its bytes cannot be read");
        }
        if (!inflater.Take(packed_.data(), wanted)) {
            return Fail(inflater.Problem());
        }
        left -= wanted;
    }
    const bool isNothing = current_->size == 0 && current_->compressedSize == 0;
    if (!isNothing && !inflater.IsComplete()) {
        return Fail(inflater.Problem());
    }
    return inflater.Checksum() == current_->checksum || Fail("its bytes do not match their checksum");
}

/// False when the library has read all bytes of the entry and they are not those of its checksum.
bool ZipEntries::CloseFile() {
    if (current_ == nullptr) {
        return true;
    }
    current_ = nullptr;
    return unzCloseCurrentFile(archive_) == UNZ_OK;
}

bool ZipEntries::Fail(std::string problem) {
    problem_ = std::move(problem);
    return false;
}

void ZipEntries::TakeLists(std::vector<std::string>& files, std::vector<std::string>& directories) {
    files = std::move(files_.names);
    directories = std::move(directories_.names);
    files_ = {};
    directories_ = {};
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

int ReadZipEntryBytes(const std::string& archivePath, const std::string& entryName, std::vector<char>& bytes,
                      std::uint64_t most) {
    bytes.clear();
    ZipEntries archive(archivePath);
    const std::size_t place = archive.FindFile(entryName);
    if (place == archive.Files().size()) {
        return -1;
    }
    if (!archive.OpenFile(place)) {
        LogEntryProblem(entryName, archive.Problem());
        return -1;
    }
    if (archive.FileSize() > most) {
        LogEntryProblem(entryName, "it is longer than " + std::to_string(most) + " bytes");
        return -1;
    }
    bytes.resize(archive.FileSize());
    if (!archive.ReadFile(bytes.data())) {
        LogEntryProblem(entryName, archive.Problem());
        return -1;
    }
    return bytes.empty() ? -1 : 0;
}

void LogEntryProblem(const std::string& name, const std::string& problem) {
    HVL_LOG(Error, "zip entry " << name << ": " << problem);
}

}  // namespace HV
