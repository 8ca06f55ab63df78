#include "hvframework/FileUtils.h"

#include <algorithm>
#include <array>
#include <boost/uuid/random_generator.hpp>
#include <boost/uuid/uuid.hpp>
#include <boost/uuid/uuid_io.hpp>
#include <cstdio>
#include <iostream>
#include <memory>

#include "hvframework/Md5.h"
#include "hvframework/StringUtils.h"
#include "platform/files.h"
#include "platform/filesystem.h"
#include "platform/held_folder.h"
#include "platform/removal.h"

namespace HVL::FileUtils {
namespace {

using boost::system::error_code;

constexpr std::size_t kLongestTempPrefix = 30;
constexpr std::string_view kTempPlaceholder = "-tmpXXXXXXXXX";
constexpr std::string_view kTempMark = "-tmpX";
constexpr std::uint32_t kLargestUniqueCounter = 131072;
constexpr std::size_t kMd5BlockSize = 4096;
constexpr std::size_t kReadAhead = 65536;

struct FileCloser {
    void operator()(std::FILE* file) const { std::fclose(file); }
};
using File = std::unique_ptr<std::FILE, FileCloser>;

File OpenForReading(const std::string& path) {
    return File(platform::OpenStream(path, "rb"));
}

fs::file_status StatusOf(const std::string& path) {
    error_code error;
    return fs::status(fs::path(path), error);
}

bool Exists(const std::string& path) {
    return fs::exists(StatusOf(path));
}

// The last `\` of `path`, not counting one that is its final character.
std::size_t SeparatorBeforeLastComponent(std::string_view path) {
    const std::size_t last = path.rfind('\\');
    if (last == std::string_view::npos || last + 1 < path.size()) {
        return last;
    }
    return last == 0 ? std::string_view::npos : path.rfind('\\', last - 1);
}

}  // namespace

bool FileExists(const std::string& path) {
    const fs::file_status status = StatusOf(path);
    return fs::exists(status) && !fs::is_directory(status);
}

bool DirectoryExists(const std::string& path) {
    return fs::is_directory(StatusOf(path));
}

std::string GetTempDirectory() {
    return StringUtils::GetEnvironmentValue("Temp");
}

std::string GetUserHomeDirectory() {
    return StringUtils::GetEnvironmentValue("USERPROFILE");
}

std::string JoinPath(std::string_view first, std::string_view second) {
    std::string path;
    path.reserve(first.size() + 1 + second.size());
    path += first;
    if (!first.ends_with('\\')) {
        path += '\\';
    }
    path += second;
    return path;
}

std::string StripTrailingSeparator(std::string_view path) {
    if (path.ends_with('\\') || path.ends_with('/')) {
        path.remove_suffix(1);
    }
    return std::string(path);
}

std::string GetFileName(std::string_view path) {
    const std::size_t separator = SeparatorBeforeLastComponent(path);
    if (path.ends_with('\\')) {
        path.remove_suffix(1);
    }
    return std::string(separator == std::string_view::npos ? path : path.substr(separator + 1));
}

std::string GetParentPath(std::string_view path) {
    if (path.empty()) {
        return {};
    }
    const std::size_t last = path.rfind('\\');
    // A root ends in its own separator and has no component before it.
    const bool isRoot = last == 0 || (last == 2 && path[1] == ':');
    const std::size_t separator = isRoot ? last : SeparatorBeforeLastComponent(path);
    if (separator == std::string_view::npos) {
        return ".";
    }
    if (separator == 0) {
        return "\\";
    }
    const bool belowDrive = separator == 2 && path[1] == ':';
    return std::string(path.substr(0, belowDrive ? 3 : separator));
}

std::string GetVolumeRoot(std::string_view path) {
    constexpr std::string_view kRootMark = ":\\";
    const std::size_t mark = path.find(kRootMark);
    return mark == std::string_view::npos ? std::string() : std::string(path.substr(0, mark + kRootMark.size()));
}

bool MatchesWildcard(std::string_view pattern, std::string_view text) {
    std::size_t inPattern = 0;
    std::size_t inText = 0;
    std::size_t lastStar = std::string_view::npos;
    std::size_t retryFrom = 0;
    while (inText < text.size()) {
        if (inPattern < pattern.size() && pattern[inPattern] == '*') {
            lastStar = inPattern++;
            retryFrom = inText;
        } else if (inPattern < pattern.size() && (pattern[inPattern] == '?' || pattern[inPattern] == text[inText])) {
            ++inPattern;
            ++inText;
        } else if (lastStar != std::string_view::npos) {
            inPattern = lastStar + 1;
            inText = ++retryFrom;
        } else {
            return false;
        }
    }
    return pattern.find_first_not_of('*', inPattern) == std::string_view::npos;
}

namespace {

// Cuts at most kLongestTempPrefix bytes off the front, and no character in two: half a character is no valid name.
std::string_view CutPrefix(std::string_view prefix) {
    if (prefix.size() <= kLongestTempPrefix) {
        return prefix;
    }
    const auto continues = [](char byte) { return (static_cast<unsigned char>(byte) & 0xc0U) == 0x80U; };
    std::size_t length = kLongestTempPrefix;
    while (length > 0 && continues(prefix[length])) {
        --length;
    }
    return prefix.substr(0, length);
}

// One generator a thread: it needs no lock, and its source of randomness is set up once.
std::string RandomIdentifier() {
    thread_local boost::uuids::random_generator generate;
    return boost::uuids::to_string(generate());
}

}  // namespace

// The name is filled into a pattern, at the first place that looks like the pattern's own: a prefix that holds "-tmpX"
// itself loses what follows it. No blank or hyphen stands between the prefix and the identifier.
std::string MakeTempPath(std::string_view prefix, std::string_view directory) {
    std::string name(CutPrefix(prefix));
    name += kTempPlaceholder;
    name.replace(name.find(kTempMark), std::string::npos, RandomIdentifier());
    return JoinPath(directory, name);
}

bool GetUniqueFileName(const std::string& path) {
    return GetUniqueFileName(path, Exists);
}

// Fixed (contracts, files): only the flag is given, and not the name that was found.
bool GetUniqueFileName(const std::string& path, const std::function<bool(const std::string&)>& exists) {
    const std::string name = GetFileName(path);
    const std::size_t dot = name.rfind('.');
    const bool hasExtension = dot != std::string::npos;
    const std::string before = (hasExtension ? JoinPath(GetParentPath(path), name.substr(0, dot)) : path) + "-";
    const std::string after = hasExtension ? name.substr(dot) : std::string();

    std::uint32_t counter = 0;
    std::string candidate = path;
    while (exists(candidate)) {
        candidate = before + std::to_string(++counter) + after;
    }
    return counter <= kLargestUniqueCounter;
}

bool MatchFilesInDirectory(const std::string& directory, std::string_view pattern, std::vector<std::string>& files) {
    files.clear();
    if (!DirectoryExists(directory)) {
        return false;
    }
    for (const fs::directory_entry& entry : fs::directory_iterator(fs::path(directory))) {
        std::string name = entry.path().filename().string();
        if (MatchesWildcard(pattern, name) && fs::is_regular_file(entry.status())) {
            files.push_back(JoinPath(directory, name));
        }
    }
    return !files.empty();
}

// Looks upwards only until it meets a directory that is there, and leaves it to mkdir to say that another one made the
// directory meanwhile: in the usual case, a new folder in an existing one, this asks twice and makes once.
int CreateDirectories(const std::string& path) {
    if (Exists(path)) {
        return 0;
    }
    if (const std::string parent = GetParentPath(path); parent != path) {
        if (const int result = CreateDirectories(parent); result != 0) {
            return result;
        }
    }
    const int result = platform::MakeDirectory(path);
    return result != 0 && Exists(path) ? 0 : result;
}

// A link or a junction is removed as what it is. Someone may have moved a plug-in folder to another disk and left a
// junction in its place: following it would empty a folder that no package has put there, and that no stash holds.
int DeleteFileOrDirectory(const std::string& path) {
    return platform::RemoveTree(path);
}

namespace {

using platform::HeldFolder;

bool Refuse(const std::string& link) {
    std::cerr << "ERROR: refusing to copy into the link at " << link << std::endl;
    return false;
}

// Holds the directory `target`, which this program has just made if `made`, until it is filled. False when it is a
// link: one that it has made is none, and any other link is followed as everywhere else. A directory that cannot be
// held, as on a drive that somebody shares, is filled all the same.
bool HoldWhileFilled(const std::string& target, bool made, std::vector<std::unique_ptr<HeldFolder>>& held) {
    bool isLink = false;
    std::string planted;
    held.push_back(made ? platform::HoldOwnFolder(target, isLink) : platform::HoldFolder(target, planted));
    return (!isLink && planted.empty()) || Refuse(isLink ? target : planted);
}

// Copies what is in `source`; the directory `destination` is there, and held. Each entry's path is formed from the
// iterator's own by changing its front, and its kind is what the listing told: nothing is asked twice.
int CopyTree(const std::string& source, const std::string& destination) {
    const std::size_t front = fs::path(StripTrailingSeparator(source)).native().size();
    const fs::path newFront(StripTrailingSeparator(destination));
    std::vector<std::unique_ptr<HeldFolder>> held;
    for (fs::recursive_directory_iterator at{fs::path(source)}, end; at != end; ++at) {
        const fs::directory_entry& entry = *at;
        const fs::path target(newFront.native() + entry.path().native().substr(front));
        const fs::file_status status = entry.symlink_status();
        // Those of the folders that the walk has left are let go.
        held.resize(static_cast<std::size_t>(at.depth()));
        if (fs::is_directory(status)) {
            const bool made = fs::create_directory(target);
            if (!HoldWhileFilled(target.string(), made, held)) {
                return -1;
            }
        } else if (fs::is_symlink(status) && fs::is_directory(entry.status())) {
            // The walk does not enter it, so a copy would be an empty directory, and a move would lose what is there.
            return -1;
        } else {
            fs::copy_file(entry.path(), target);
        }
    }
    return 0;
}

// The destination itself is held as what is in it is.
int CopyDirectory(const std::string& source, const std::string& destination) {
    const bool made = !DirectoryExists(destination);
    if (made && platform::MakeDirectory(destination) != 0) {
        return -1;
    }
    std::vector<std::unique_ptr<HeldFolder>> held;
    return HoldWhileFilled(destination, made, held) ? CopyTree(source, destination) : -1;
}

}  // namespace

int CopyFileOrDirectory(const std::string& source, const std::string& destination) {
    const std::string parent = GetParentPath(destination);
    if (!DirectoryExists(parent) && CreateDirectories(parent) != 0) {
        std::cerr << "ERROR: failed to make parent directory at " << parent << std::endl;
        return -1;
    }
    const fs::file_status status = StatusOf(source);
    if (!fs::exists(status)) {
        std::cerr << "ERROR: source does not exist at " << source << std::endl;
        return -1;
    }
    if (!fs::is_directory(status)) {
        fs::copy_file(fs::path(source), fs::path(destination));
        return 0;
    }
    return CopyDirectory(source, destination);
}

bool MoveFileOrDirectory(const std::string& source, const std::string& destination) {
    if (GetVolumeRoot(source) != GetVolumeRoot(destination)) {
        if (CopyFileOrDirectory(source, destination) != 0) {
            return false;
        }
        DeleteFileOrDirectory(source);
        return true;
    }
    // No copy is tried after a rename that fails: what holds the source open would leave it half moved.
    error_code error;
    fs::rename(fs::path(source), fs::path(destination), error);
    return !error;
}

int ReadFileToString(const std::string& path, std::string& text) {
    text.clear();
    const fs::path name(path);
    error_code error;
    if (!fs::is_regular_file(fs::status(name, error))) {
        return -1;
    }
    const auto size = fs::file_size(name, error);
    const File file = OpenForReading(path);
    if (error || !file) {
        return -1;
    }
    // Straight into the text: the stream's own buffer would only be one more copy.
    std::setvbuf(file.get(), nullptr, _IONBF, 0);
    text.resize(static_cast<std::size_t>(size));
    text.resize(std::fread(text.data(), 1, text.size(), file.get()));
    if (std::ferror(file.get()) != 0) {
        text.clear();
        return -1;
    }
    return 0;
}

int ReadFileLines(const std::string& path, std::vector<std::string>& lines) {
    lines.clear();
    std::string text;
    if (const int result = ReadFileToString(path, text); result != 0) {
        return result;
    }
    lines = StringUtils::Split(text, '\n');
    for (std::string& line : lines) {
        if (line.ends_with('\r')) {
            line.pop_back();
        }
    }
    return 0;
}

std::string GetFileMD5(const std::string& path) {
    Md5 md5;
    if (const File file = OpenForReading(path)) {
        std::setvbuf(file.get(), nullptr, _IOFBF, kReadAhead);
        std::array<char, kMd5BlockSize> block;
        while (const std::size_t size = std::fread(block.data(), 1, block.size(), file.get())) {
            md5.Update(block.data(), size);
        }
    }
    return md5.Finish();
}

}  // namespace HVL::FileUtils
