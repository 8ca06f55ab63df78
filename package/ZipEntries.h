#pragma once

#include <minizip/unzip.h>

#include <cstdint>
#include <limits>
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "platform/archive_file.h"

namespace HV {

/// The number of entries from which on the end of an archive's directory cannot tell it: it says this one.
inline constexpr std::uint64_t kCountThatDoesNotFit = 0xFFFF;

/// An archive that is open for reading, with its list of entries; closes all that is open when it goes out of scope.
///
/// The directory of the archive is read once, by the constructor. An archive whose directory cannot be read to its end,
/// or has another number of entries than the archive's end says, counts as one that does not open. Nothing that an
/// archive says about itself is believed before it has been held against the archive's bytes: an entry on which two
/// places disagree, or that two readers could understand differently, is not handed out.
///
/// There is one judgement of an entry, here, for everybody who unpacks or checks one. An operation that gives false
/// leaves its reason in Problem().
class ZipEntries {
public:
    /// Opens and lists the archive at the narrow path.
    explicit ZipEntries(const std::string& archivePath);
    ~ZipEntries();
    ZipEntries(const ZipEntries&) = delete;
    ZipEntries& operator=(const ZipEntries&) = delete;

    [[nodiscard]] bool IsOpen() const { return archive_ != nullptr; }

    /// Names of the entries that end in a separator, and of all others, each in archive order. Both are empty when the
    /// archive did not open. An entry's place in its list is what the operations below take.
    [[nodiscard]] const std::vector<std::string>& Directories() const { return directories_.names; }
    [[nodiscard]] const std::vector<std::string>& Files() const { return files_.names; }

    /// The place of the first file entry of exactly that name; the number of files when there is none.
    [[nodiscard]] std::size_t FindFile(const std::string& name) const;

    /// Bytes that all file entries together claim to unpack to; the largest number when it is no smaller.
    [[nodiscard]] std::uint64_t TotalSize() const;

    /// Whether the directory entry may be made: its name can be a folder's, is nobody else's, and stands in the entry's
    /// own header too.
    [[nodiscard]] bool CheckDirectory(std::size_t place);

    /// Makes the file entry the current one, after CheckDirectory()'s questions and whether its bytes can be read:
    /// neither encrypted nor compressed in a way unknown here, of possible sizes, and shared with no entry that was
    /// opened before.
    [[nodiscard]] bool OpenFile(std::size_t place);

    /// Bytes that the current entry unpacks to.
    [[nodiscard]] std::uint64_t FileSize() const { return current_ != nullptr ? current_->size : 0; }

    /// Unpacks the whole current entry into `buffer`, which holds FileSize() bytes, and closes it. False unless these
    /// are all its bytes, and those that its checksum was taken of; what the buffer then holds is of no use.
    [[nodiscard]] bool ReadFile(char* buffer);

    /// Why the last operation that gave false did, in words that follow the entry's name.
    [[nodiscard]] const std::string& Problem() const { return problem_; }

    /// Hands the lists over; they are empty afterwards.
    void TakeLists(std::vector<std::string>& files, std::vector<std::string>& directories);

private:
    struct Entry {
        unz64_file_pos position;
        std::uint64_t compressedSize;
        std::uint64_t size;
        std::uint32_t checksum;
        std::uint16_t nameLength;
        std::uint16_t method;
        std::uint16_t flags;
        const std::string* namesake = nullptr;  // another entry's name, where that is the same file to Windows
    };
    struct List {
        std::vector<std::string> names;
        std::vector<Entry> entries;  // beside names, one for one
    };

    void Open();
    [[nodiscard]] bool ListEntries();
    [[nodiscard]] bool ListCurrentEntry();
    [[nodiscard]] bool IsAtEndOfDirectory();
    void FindNamesakes();
    [[nodiscard]] bool OpenEntry(const List& list, std::size_t place);
    [[nodiscard]] static std::string FaultOfName(const Entry& entry, const std::string& name);
    [[nodiscard]] static std::string FaultOfContents(const Entry& entry);
    [[nodiscard]] std::string FaultOfHeader(const Entry& entry, const std::string& name);
    [[nodiscard]] std::string ClaimBytes(const Entry& entry, std::uint64_t from, std::uint64_t to);
    [[nodiscard]] bool ReadStored(char* buffer);
    [[nodiscard]] bool ReadDeflated(char* buffer);
    bool CloseFile();
    bool Fail(std::string problem);

    std::unique_ptr<platform::ArchiveFile> file_;  // below the library's handle, which is closed first
    unzFile archive_ = nullptr;
    const Entry* current_ = nullptr;
    List directories_;
    List files_;
    unz64_file_pos behind_{};  // where the entry after the last one would stand
    bool namesakesKnown_ = false;
    std::map<std::uint64_t, std::pair<std::uint64_t, const Entry*>> claims_;  // from where, to where, by whom
    std::vector<char> packed_;
    std::string problem_;
};

/// The line at ERROR that says what is wrong with an entry.
void LogEntryProblem(const std::string& name, const std::string& problem);

/// Lists an archive: 0, or -1 with both lists empty when it does not open. The lists are cleared first.
[[nodiscard]] int ReadZipEntries(const std::string& archivePath, std::vector<std::string>& files,
                                 std::vector<std::string>& directories);

/// Reads one file entry whole: 0, or -1 when it is not there, cannot be read to its end, is empty, or has more than
/// `most` bytes. What is wrong with an entry that is there is logged at ERROR.
[[nodiscard]] int ReadZipEntryBytes(const std::string& archivePath, const std::string& entryName,
                                    std::vector<char>& bytes,
                                    std::uint64_t most = std::numeric_limits<std::uint64_t>::max());

/// Unpacks an archive into a directory, which is made with its parents: 0, or what went wrong, logged at ERROR. An
/// archive that does not open is no failure here and unpacks to nothing. Entries are written as the archive lists them,
/// directories first; the first that fails ends it, and what was written stays. Nothing is written when the disk has
/// less room than the entries need, and never outside the directory.
[[nodiscard]] int ExtractZip(const std::string& archivePath, const std::string& destination);

/// Unpacks an archive to nowhere: 0, or -1 when it does not open or ExtractZip() would fail for any entry. There is a
/// line at ERROR for every such entry.
[[nodiscard]] int CheckZip(const std::string& archivePath);

}  // namespace HV
