#pragma once

#include <minizip/unzip.h>

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

namespace HV {

/// An archive that is open for reading, with its list of entries; closes all that is open when it goes out of scope.
///
/// The directory of the archive is read once, by the constructor. An archive whose directory cannot be read to its end
/// counts as one that does not open. Where two entries have one name, the name means the first. Nothing that an archive
/// says about itself is believed before it has been held against the archive's size.
class ZipEntries {
public:
    /// Opens and lists the archive at the narrow path.
    explicit ZipEntries(const std::string& archivePath);
    ~ZipEntries();
    ZipEntries(const ZipEntries&) = delete;
    ZipEntries& operator=(const ZipEntries&) = delete;

    [[nodiscard]] bool IsOpen() const { return archive_ != nullptr; }

    /// Names of the entries that end in a separator, and of all others, each in archive order. Both are empty when the
    /// archive did not open.
    [[nodiscard]] const std::vector<std::string>& Directories() const { return directories_; }
    [[nodiscard]] const std::vector<std::string>& Files() const { return files_; }

    /// Makes the file entry of that name the current one, closing another. False when there is none, or it is of a kind
    /// that cannot be read: encrypted, compressed in a way unknown here, of impossible sizes, at odds with its own
    /// header.
    [[nodiscard]] bool OpenEntry(const std::string& name);

    /// Bytes that the current entry unpacks to.
    [[nodiscard]] std::uint64_t EntrySize() const { return entrySize_; }

    /// Unpacks the whole current entry into `buffer`, which holds EntrySize() bytes. False when there are fewer.
    [[nodiscard]] bool ReadEntry(char* buffer);

    /// Closes the current entry. False when its bytes were not those that its checksum was taken of.
    bool CloseEntry();

    /// Hands the lists over; they are empty afterwards.
    void TakeLists(std::vector<std::string>& files, std::vector<std::string>& directories);

private:
    struct Entry {
        unz64_file_pos position;
        std::uint64_t compressedSize;
        std::uint64_t size;
        std::uint16_t method;
        std::uint16_t flags;
        bool nameFits;
    };

    [[nodiscard]] bool ListEntries();
    [[nodiscard]] bool ListCurrentEntry();
    [[nodiscard]] bool CanBeRead(const Entry& entry) const;
    [[nodiscard]] const Entry* Locate(const std::string& name);
    void IndexNames();
    void Close();

    unzFile archive_ = nullptr;
    bool entryIsOpen_ = false;
    std::uint64_t entrySize_ = 0;
    std::uint64_t archiveSize_ = 0;
    std::vector<std::string> directories_;
    std::vector<std::string> files_;
    std::vector<Entry> entries_;  // beside files_, one for one
    std::vector<std::pair<std::size_t, std::size_t>>
        nameIndex_;  // hash of a name, place in files_; sorted; made on need
};

/// Lists an archive: 0, or -1 with both lists empty when it does not open. The lists are cleared first.
[[nodiscard]] int ReadZipEntries(const std::string& archivePath, std::vector<std::string>& files,
                                 std::vector<std::string>& directories);

/// Reads one file entry whole: 0, or -1 when it is not there, cannot be read to its end, or is empty.
[[nodiscard]] int ReadZipEntryBytes(const std::string& archivePath, const std::string& entryName,
                                    std::vector<char>& bytes);

/// Unpacks an archive into a directory, which is made with its parents: 0, or what went wrong, logged at ERROR. An
/// archive that does not open is no failure here and unpacks to nothing. Entries are written as the archive lists them,
/// directories first; the first that fails ends it, and what was written stays. No entry is written outside the
/// directory: one whose name leads there fails.
[[nodiscard]] int ExtractZip(const std::string& archivePath, const std::string& destination);

/// Whether an entry of this name lands below the directory that it is unpacked to, on the file system as Windows reads
/// names: no step up, no drive or stream, no leading separator, no device, no end that the system drops.
[[nodiscard]] bool IsSafeEntryName(const std::string& name);

/// Room for an entry's name, with the zero that ends it. Longer names cannot be unpacked.
inline constexpr std::size_t kEntryNameRoom = 260;

}  // namespace HV
