#include <algorithm>
#include <cstdio>
#include <memory>
#include <new>
#include <string_view>
#include <unordered_set>
#include <vector>

#include "hvframework/FileUtils.h"
#include "hvframework/Log.h"
#include "package/EntryNames.h"
#include "package/Inflater.h"
#include "package/ZipEntries.h"
#include "platform/files.h"
#include "platform/filesystem.h"
#include "platform/held_folder.h"

namespace HV {
namespace {

/// Room for one entry at a time. It is made anew, to the exact size, only for an entry that is larger than all before,
/// after the old room is gone: the largest entry sets the peak.
class EntryBuffer {
public:
    /// Null when there is not enough memory.
    char* Reserve(std::size_t size) {
        if (size > room_) {
            bytes_.reset();
            bytes_.reset(new (std::nothrow) char[size]);
            room_ = bytes_ ? size : 0;
        }
        return bytes_.get();
    }

private:
    std::unique_ptr<char[]> bytes_;
    std::size_t room_ = 0;
};

/// What stands before the last `/`; empty without one.
std::string FolderOf(const std::string& path) {
    const auto end = path.rfind('/');
    return end == std::string::npos ? "" : path.substr(0, end);
}

/// The folders that lead to the entry that is being written, each held, so that none of them is or becomes a link.
class HeldWay {
public:
    explicit HeldWay(std::string destination) : destination_(std::move(destination)) {}

    /// Holds what is there of `folder`, a path as EntryPath() gives it, and of the folders above it. False when one of
    /// them is a link. Nearly always the entry before was in the same folder.
    [[nodiscard]] bool Enter(const std::string& folder) {
        if (!steps_.empty() && steps_.back().folder == folder) {
            return true;
        }
        while (!steps_.empty() && !folder.starts_with(steps_.back().folder + "/")) {
            steps_.pop_back();
        }
        while (HeldPart() < folder.size()) {
            bool isLink = false;
            std::string next = folder.substr(0, folder.find('/', HeldPart() + 1));
            auto held = platform::HoldOwnFolder(HVL::FileUtils::JoinPath(destination_, next), isLink);
            if (held == nullptr) {
                return !isLink;
            }
            steps_.push_back({std::move(next), std::move(held)});
        }
        return true;
    }

private:
    struct Step {
        std::string folder;
        std::unique_ptr<platform::HeldFolder> held;
    };

    [[nodiscard]] std::size_t HeldPart() const { return steps_.empty() ? 0 : steps_.back().folder.size(); }

    std::string destination_;
    std::vector<Step> steps_;
};

/// The folders that extraction makes: those with an entry of their own, and those above them.
class EntryFolders {
public:
    explicit EntryFolders(const ZipEntries& archive) {
        for (const std::string& name : archive.Directories()) {
            for (std::string folder = EntryPath(name); !folder.empty() && folders_.insert(folder).second;) {
                folder = FolderOf(folder);
            }
        }
    }

    /// What is wrong with the folder that a file goes to, in words; empty when nothing is.
    [[nodiscard]] std::string ProblemOf(const std::string& file) const {
        const std::string folder = FolderOf(EntryPath(file));
        return folder.empty() || folders_.contains(folder) ? "" : "its folder " + folder + "/ has no entry of its own";
    }

private:
    std::unordered_set<std::string> folders_;
};

/// Unpacks the open entry into the buffer and gives its bytes; null, with the reason logged, when that cannot be.
/// An entry without bytes gives what must not be read.
const char* Unpack(ZipEntries& archive, EntryBuffer& buffer, const std::string& name) {
    const auto size = static_cast<std::size_t>(archive.FileSize());
    char* bytes = buffer.Reserve(std::max<std::size_t>(size, 1));
    if (bytes == nullptr) {
        LogEntryProblem(name, "there is no memory for its " + std::to_string(size) + " bytes");
        return nullptr;
    }
    if (!archive.ReadFile(bytes)) {
        LogEntryProblem(name, archive.Problem());
        return nullptr;
    }
    return bytes;
}

bool WriteAll(std::FILE* file, const char* bytes, std::size_t size) {
    // Unbuffered: the bytes go to the system in one piece, and a full disk shows here and not when the file is closed.
    std::setvbuf(file, nullptr, _IONBF, 0);
    while (size > 0) {
        const std::size_t piece = std::min<std::size_t>(size, kLargestPiece);
        if (std::fwrite(bytes, 1, piece, file) != piece) {
            return false;
        }
        bytes += piece;
        size -= piece;
    }
    return true;
}

constexpr const char* kLinkOnTheWay = "a folder that it goes into has become a link";

/// Opens the file that the entry becomes; null, with the reason logged where there is one to tell.
std::FILE* OpenTarget(ZipEntries& archive, HeldWay& way, const std::string& name, const std::string& target) {
    if (!way.Enter(FolderOf(EntryPath(name)))) {
        LogEntryProblem(name, kLinkOnTheWay);
        return nullptr;
    }
    std::FILE* const file = platform::OpenOwnFile(target);
    if (file == nullptr) {
        if (const std::string problem = EntryFolders(archive).ProblemOf(name); !problem.empty()) {
            LogEntryProblem(name, problem);
        }
    }
    return file;
}

bool WriteCurrentFile(ZipEntries& archive, EntryBuffer& buffer, const std::string& name, std::FILE* file) {
    const auto size = static_cast<std::size_t>(archive.FileSize());
    const char* bytes = Unpack(archive, buffer, name);
    const bool written = bytes != nullptr && WriteAll(file, bytes, size);
    return std::fclose(file) == 0 && written;
}

int ExtractFile(ZipEntries& archive, std::size_t place, EntryBuffer& buffer, HeldWay& way,
                const std::string& destination) {
    const std::string& name = archive.Files()[place];
    if (!archive.OpenFile(place)) {
        LogEntryProblem(name, archive.Problem());
        HVL_LOG(Error, "ERROR: failed to open zip file entry " << name);
        return -1;
    }
    std::FILE* const file = OpenTarget(archive, way, name, HVL::FileUtils::JoinPath(destination, name));
    if (file == nullptr || !WriteCurrentFile(archive, buffer, name, file)) {
        HVL_LOG(Error, "ERROR: failed to write zip entry file " << name);
        return -1;
    }
    return 0;
}

/// Parents are found by `\`, so that is how the folder is handed on; an archive need not list a folder's parents.
int MakeEntryDirectory(const std::string& joined) {
    std::string path = HVL::FileUtils::StripTrailingSeparator(joined);
    std::ranges::replace(path, '/', '\\');
    return HVL::FileUtils::CreateDirectories(path);
}

int ExtractDirectory(ZipEntries& archive, std::size_t place, HeldWay& way, const std::string& destination) {
    const std::string& name = archive.Directories()[place];
    const std::string path = HVL::FileUtils::JoinPath(destination, name);
    const bool sound = archive.CheckDirectory(place);
    const bool straight = sound && way.Enter(FolderOf(EntryPath(name)));
    if (!straight) {
        LogEntryProblem(name, sound ? kLinkOnTheWay : archive.Problem());
    }
    const int result = straight ? MakeEntryDirectory(path) : -1;
    if (result != 0) {
        HVL_LOG(Error, "ERROR: failed to create directory " << path);
    }
    return result;
}

/// Asked before the first byte is written. A disk that does not tell is written to all the same.
bool HasRoom(const std::string& destination, const ZipEntries& archive) {
    boost::system::error_code error;
    const fs::space_info space = fs::space(fs::path(destination), error);
    const std::uint64_t needed = archive.TotalSize();
    if (error || needed <= space.available) {
        return true;
    }
    HVL_LOG(Error, "unpacking takes " << needed << " bytes, and at " << destination << " there are " << space.available
                                      << " free");
    return false;
}

int ExtractEntries(ZipEntries& archive, const std::string& destination) {
    HeldWay way(destination);
    for (std::size_t place = 0; place < archive.Directories().size(); ++place) {
        if (const int result = ExtractDirectory(archive, place, way, destination); result != 0) {
            return result;
        }
    }
    EntryBuffer buffer;
    for (std::size_t place = 0; place < archive.Files().size(); ++place) {
        if (const int result = ExtractFile(archive, place, buffer, way, destination); result != 0) {
            return result;
        }
    }
    return 0;
}

bool CheckFile(ZipEntries& archive, std::size_t place, EntryBuffer& buffer, const EntryFolders& folders) {
    const std::string& name = archive.Files()[place];
    if (!archive.OpenFile(place)) {
        LogEntryProblem(name, archive.Problem());
        return false;
    }
    if (Unpack(archive, buffer, name) == nullptr) {
        return false;
    }
    const std::string problem = folders.ProblemOf(name);
    if (!problem.empty()) {
        LogEntryProblem(name, problem);
    }
    return problem.empty();
}

bool CheckDirectory(ZipEntries& archive, std::size_t place) {
    const bool sound = archive.CheckDirectory(place);
    if (!sound) {
        LogEntryProblem(archive.Directories()[place], archive.Problem());
    }
    return sound;
}

}  // namespace

int ExtractZip(const std::string& archivePath, const std::string& destination) {
    HVL_LOG(Debug, "DEBUG - extracting " << archivePath);
    HVL_LOG(Debug, "  to directory: " << destination);
    // Whether the destination could be made shows in what is put into it.
    static_cast<void>(HVL::FileUtils::CreateDirectories(destination));
    ZipEntries archive(archivePath);
    return HasRoom(destination, archive) ? ExtractEntries(archive, destination) : -1;
}

int CheckZip(const std::string& archivePath) {
    ZipEntries archive(archivePath);
    bool sound = archive.IsOpen();
    for (std::size_t place = 0; place < archive.Directories().size(); ++place) {
        sound &= CheckDirectory(archive, place);
    }
    const EntryFolders folders(archive);
    EntryBuffer buffer;
    for (std::size_t place = 0; place < archive.Files().size(); ++place) {
        sound &= CheckFile(archive, place, buffer, folders);
    }
    return sound ? 0 : -1;
}

}  // namespace HV
