#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

/// Files, folders and path texts, for every room.
///
/// Paths are narrow UTF-8 texts whose separator is `\`; a `/` is an ordinary character to the text functions, and a
/// separator to those that ask the system. A path "exists" when the system can tell its status, so a link onto nothing
/// does not exist. Nothing here logs: where a function prints, it prints a line on the standard error stream. Results
/// are as stated; besides, the exceptions of the filesystem library (`fs::filesystem_error`) pass through to the
/// caller where a function says so. No function keeps state, and all may be called from any thread.
namespace HVL::FileUtils {

// What is there

/// Whether `path` exists and is not a directory.
[[nodiscard]] bool FileExists(const std::string& path);

/// Whether `path` exists and is a directory.
[[nodiscard]] bool DirectoryExists(const std::string& path);

// Well-known places

/// The text of the environment variable "Temp"; empty when it is not set.
[[nodiscard]] std::string GetTempDirectory();

/// The text of the environment variable "USERPROFILE"; empty when it is not set.
[[nodiscard]] std::string GetUserHomeDirectory();

// Path texts, without a look at the disk

/// `first`, a `\` unless it ends in one already, and `second`. An empty `first` thus gives a `\` before `second`.
[[nodiscard]] std::string JoinPath(std::string_view first, std::string_view second);

/// `path` without its final `\` or `/`; at most one is removed.
[[nodiscard]] std::string StripTrailingSeparator(std::string_view path);

/// The last component: what stands after the last `\`, or before it when it is the final character
/// (`C:\a\b\` gives `b`). Without a `\` it is the whole text.
[[nodiscard]] std::string GetFileName(std::string_view path);

/// What stands before the last component: `C:\a\b` and `C:\a\b\` give `C:\a`. A drive root is its own parent, as is
/// `\`; a text of one component gives "."; an empty text stays empty.
[[nodiscard]] std::string GetParentPath(std::string_view path);

/// The text up to and including its first `:\` (`C:\`); empty when it holds none.
[[nodiscard]] std::string GetVolumeRoot(std::string_view path);

/// Whether the whole of `text` matches `pattern`: `*` stands for any run of characters, also an empty one, `?` for any
/// one character, every other character for itself, in its own case.
[[nodiscard]] bool MatchesWildcard(std::string_view pattern, std::string_view text);

// Making and finding names

/// A new path in `directory` that nothing else has: `prefix`, cut to 30 bytes at most (never inside a character),
/// and a random identifier. Nothing is made on disk.
[[nodiscard]] std::string MakeTempPath(std::string_view prefix, std::string_view directory);

/// Searches for a free name near `path` and tells whether a counter of up to 131,072 sufficed. The search only
/// looks, and makes nothing; the name that it found is not told.
bool GetUniqueFileName(const std::string& path);

/// The same search over names that `exists` knows.
bool GetUniqueFileName(const std::string& path, const std::function<bool(const std::string&)>& exists);

/// Fills `files` with the paths of the regular files directly in `directory` whose names match `pattern`, in the
/// system's order, after clearing it. Returns whether there are any; false when `directory` is no directory.
/// Throws fs::filesystem_error when a directory cannot be listed.
[[nodiscard]] bool MatchFilesInDirectory(const std::string& directory, std::string_view pattern,
                                         std::vector<std::string>& files);

// Changing the disk

/// Makes the directory `path` and its missing parents. Returns 0 on success, and also when `path` exists already, be
/// it as a file: who needs a directory tests for it. Parents that were made before a failure stay.
[[nodiscard]] int CreateDirectories(const std::string& path);

/// Removes a file, a link, or a directory with all its contents. Returns 0 on success, and also when there is nothing
/// at `path`. The first thing that cannot be removed stops the walk and gives a non-zero result; what was removed
/// before it is gone. Links are removed, never followed. A directory that cannot be
/// listed is a result here, not an exception: clean-ups call this where nothing may be thrown.
int DeleteFileOrDirectory(const std::string& path);

/// Copies a file or a directory tree to the path `destination`, making its parent first. Returns 0 on success; -1,
/// some of them with a line on the standard error stream, when the parent or the destination directory cannot be made,
/// the source does not exist, the tree holds a link onto a directory, or a directory that it has made has become a link
/// since. Each is held while it is filled. A file is never overwritten: throws
/// fs::filesystem_error when one is in the way, or when a single file cannot be copied. What was copied before a
/// failure stays.
[[nodiscard]] int CopyFileOrDirectory(const std::string& source, const std::string& destination);

/// Moves a file or a directory. Returns true when the move is done. Within a volume it is one rename, which replaces
/// what the platform's rename replaces, and leaves everything in place on failure. Between volumes it is a copy
/// (whose exceptions pass through) and then a deletion of the source, whose failure leaves a rest there but does not
/// undo the move.
[[nodiscard]] bool MoveFileOrDirectory(const std::string& source, const std::string& destination);

// Contents

/// The whole file, byte for byte, into `text`. Returns 0; or -1, and an empty `text`, when `path` is not a regular
/// file or cannot be read.
[[nodiscard]] int ReadFileToString(const std::string& path, std::string& text);

/// The file's lines into `lines`, without their line feeds and without one carriage return before each. A file that
/// ends in a line feed has a last empty line. Returns what ReadFileToString gives; on -1 there are no lines.
[[nodiscard]] int ReadFileLines(const std::string& path, std::vector<std::string>& lines);

/// The MD5 of the file's contents as 32 lower-case hexadecimal digits. A file that cannot be opened gives the MD5 of
/// no data.
[[nodiscard]] std::string GetFileMD5(const std::string& path);

}  // namespace HVL::FileUtils
