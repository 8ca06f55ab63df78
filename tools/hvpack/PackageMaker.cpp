#include "tools/hvpack/PackageMaker.h"

#include <minizip/zip.h>

#include <algorithm>
#include <utility>
#include <vector>

#include "hvframework/FileUtils.h"
#include "package/EntryNames.h"
#include "package/Package.h"
#include "package/PackageNames.h"
#include "package/ZipEntries.h"
#include "platform/libraries.h"
#include "tools/hvpack/PackageError.h"
#include "tools/hvpack/ReleaseNames.h"
#include "tools/hvpack/ValidatedPackage.h"
#include "tools/hvpack/Zip64Count.h"

namespace HVPack {
namespace {

/// The first moment that the format can express. A file's own time would make each build of a package another file.
constexpr uLong kFixedTime = 0x00210000;
constexpr uLong kVersionMadeBy = 20;
constexpr uLong kNamesAreUtf8 = 1 << 11;
constexpr uLong kDirectoryAttribute = 0x10;

/// Larger files would need a form of archive that not every target's reader knows.
constexpr std::size_t kLargestFile = 0xFFFFFFFE;

struct Item {
    std::string entry;  // its name in the archive
    fs::path path;
    bool isDirectory = false;
};

void RefuseUnlessPackable(const Item& item) {
    if (item.entry.size() >= HV::kEntryNameRoom) {
        throw PackageError("the name " + item.entry + " is longer than " + std::to_string(HV::kEntryNameRoom - 1) +
                           " bytes");
    }
    if (!HV::IsSafeEntryName(item.entry)) {
        throw PackageError("the name " + item.entry + " cannot be unpacked on Windows");
    }
    if (fs::is_symlink(item.path) || !(item.isDirectory || fs::is_regular_file(item.path))) {
        throw PackageError(item.entry + " is neither a file nor a folder");
    }
}

void CollectItems(const fs::path& folder, const std::string& prefix, std::vector<Item>& items) {
    for (const fs::directory_entry& entry : fs::directory_iterator(folder)) {
        Item item{prefix + entry.path().filename().string(), entry.path(), fs::is_directory(entry)};
        if (item.isDirectory) {
            item.entry += '/';
        }
        RefuseUnlessPackable(item);
        items.push_back(item);
        if (item.isDirectory) {
            CollectItems(item.path, item.entry, items);
        }
    }
}

bool IsRootManifest(const Item& item) {
    return HV::IsRootManifest(item.entry);
}

std::vector<Item> SortedItems(const fs::path& folder) {
    std::vector<Item> items;
    CollectItems(folder, "", items);
    std::ranges::sort(items, {}, &Item::entry);
    if (std::ranges::none_of(items, IsRootManifest)) {
        throw PackageError("no _hvmanifest.xml in " + folder.string());
    }
    return items;
}

/// An archive that is being written; closed, as it stands, when it goes out of scope.
class ArchiveWriter {
public:
    explicit ArchiveWriter(const fs::path& path) : name_(path.string()) {
        zlib_filefunc64_def functions{};
        platform::FillArchiveFileFunctions(functions);
        archive_ = zipOpen2_64(path.c_str(), APPEND_STATUS_CREATE, nullptr, &functions);
        Require(archive_ != nullptr);
    }
    ~ArchiveWriter() {
        if (archive_ != nullptr) {
            zipClose(archive_, nullptr);
        }
    }
    ArchiveWriter(const ArchiveWriter&) = delete;
    ArchiveWriter& operator=(const ArchiveWriter&) = delete;

    /// Adds an entry. A folder's has no bytes.
    void Add(const Item& item, const std::string& bytes) {
        OpenEntry(item, !bytes.empty());
        for (std::size_t done = 0; done < bytes.size();) {
            const auto part = std::min<std::size_t>(bytes.size() - done, std::size_t{1} << 30);
            Require(zipWriteInFileInZip(archive_, bytes.data() + done, static_cast<unsigned>(part)) == ZIP_OK);
            done += part;
        }
        Require(zipCloseFileInZip(archive_) == ZIP_OK);
    }

    /// Writes the directory. Nothing can be added afterwards.
    void Finish() {
        zipFile archive = archive_;
        archive_ = nullptr;
        Require(zipClose(archive, nullptr) == ZIP_OK);
    }

private:
    void OpenEntry(const Item& item, bool hasBytes) {
        zip_fileinfo info{};
        info.dosDate = kFixedTime;
        info.external_fa = item.isDirectory ? kDirectoryAttribute : 0;
        const int method = hasBytes ? Z_DEFLATED : 0;
        Require(zipOpenNewFileInZip4_64(archive_, item.entry.c_str(), &info, nullptr, 0, nullptr, 0, nullptr, method,
                                        Z_BEST_COMPRESSION, 0, -MAX_WBITS, DEF_MEM_LEVEL, Z_DEFAULT_STRATEGY, nullptr,
                                        0, kVersionMadeBy, kNamesAreUtf8, 0) == ZIP_OK);
    }

    void Require(bool success) const {
        if (!success) {
            throw PackageError("cannot write " + name_);
        }
    }

    zipFile archive_ = nullptr;
    std::string name_;
};

std::string FileBytes(const Item& item) {
    std::string bytes;
    if (HVL::FileUtils::ReadFileToString(item.path.string(), bytes) != 0) {
        throw PackageError("cannot read " + item.path.string());
    }
    if (bytes.size() > kLargestFile) {
        throw PackageError(item.entry + " is too large for a package");
    }
    return bytes;
}

void WriteArchive(const std::vector<Item>& items, const fs::path& path) {
    ArchiveWriter archive(path);
    for (const Item& item : items) {
        archive.Add(item, item.isDirectory ? std::string() : FileBytes(item));
    }
    archive.Finish();
    if (items.size() >= HV::kCountThatDoesNotFit && !AddZip64Count(path, items.size())) {
        throw PackageError("cannot write " + path.string());
    }
}

/// A folder that is there for as long as the object. It holds the unfinished package under its final name, which is the
/// one that the engine's lines should say.
class WorkFolder {
public:
    explicit WorkFolder(fs::path path) : path_(std::move(path)) { fs::create_directories(path_); }
    ~WorkFolder() {
        boost::system::error_code ignored;
        fs::remove_all(path_, ignored);
    }
    WorkFolder(const WorkFolder&) = delete;
    WorkFolder& operator=(const WorkFolder&) = delete;
    [[nodiscard]] const fs::path& Path() const { return path_; }

private:
    fs::path path_;
};

void RefuseUnlessNamedAsPackage(const fs::path& output) {
    if (!HV::IsNamedAsPackage(output)) {
        throw PackageError("a package is named .hvpkg or .zip, not " + output.filename().string());
    }
}

/// An older package in the folder would become part of the new one.
void RefuseOutputInside(const fs::path& folder, const fs::path& output) {
    const fs::path inside = fs::absolute(folder).lexically_normal();
    for (fs::path above = fs::absolute(output).lexically_normal(); above.has_relative_path();
         above = above.parent_path()) {
        if (above == inside) {
            throw PackageError("the package cannot be written into the folder that it is made of");
        }
    }
}

HV::Manifest WriteAndCheck(const std::vector<Item>& items, const fs::path& output) {
    const WorkFolder work(output.parent_path() / (output.filename().string() + ".part"));
    const fs::path unfinished = work.Path() / output.filename();
    WriteArchive(items, unfinished);
    HV::Package package(unfinished);
    if (!IsSound(package)) {
        throw PackageError(output.filename().string() + " would not be a sound package");
    }
    RefuseUnsafeNames(output.filename().string(), package.manifest);
    fs::rename(unfinished, output);
    return std::move(package.manifest);
}

}  // namespace

HV::Manifest MakePackage(const fs::path& folder, const fs::path& output) {
    try {
        RefuseUnlessNamedAsPackage(output);
        if (!fs::is_directory(folder)) {
            throw PackageError(folder.string() + " is not a folder");
        }
        RefuseOutputInside(folder, output);
        return WriteAndCheck(SortedItems(folder), output);
    } catch (const fs::filesystem_error& error) {
        throw PackageError(error.what());
    }
}

}  // namespace HVPack
