#pragma once

#include <memory>
#include <string>
#include <string_view>

#include "platform/hosted/environment.h"
#include "platform/hosted/faults.h"
#include "platform/hosted/registry.h"

namespace hosted {

/// A Windows machine that is kept in one folder: `drive_c/` with its files and `registry.reg` with its registry.
///
/// The layout is that of a Wine prefix, so that what both targets leave behind can be compared file by file. A missing
/// folder is made on first use, with the base folders of Windows 10; one that cannot be made ends the process with
/// exit status 1 and a message on standard error. Names are case-sensitive but for the base folders.
/// One process at a time changes a machine. Thread-safe, except for Use().
class Machine {
public:
    /// The machine of this process: the folder named by HV_MACHINE, else `.hvmachine` in the user's home. It lives
    /// until the process ends, and its registry is brought into order then.
    static Machine& Current();
    /// Makes the machine in `folder` the current one and ends the one before it, with all its key handles.
    /// No other thread may be using the machine.
    static void Use(const std::string& folder);
    /// Ends the current machine without writing anything more to its folder, which may be gone already.
    static void Abandon();

    explicit Machine(const std::string& folder);
    ~Machine();
    Machine(const Machine&) = delete;
    Machine& operator=(const Machine&) = delete;

    /// The folder, absolute and without links in it.
    [[nodiscard]] const std::string& Folder() const { return folder_; }
    /// The account whose profile is in `C:\users`, named as Wine does.
    [[nodiscard]] const std::string& Account() const { return account_; }

    /// The host's name of a Windows path. Both separators count, `.` and `..` are resolved in the text (never above
    /// a drive's root), a final component loses its trailing dots and blanks. `C:` is drive_c, and so is the drive of a
    /// path that names none; `Z:` is the host's root and the one way out of the machine; another drive is `drive_x` in
    /// the folder if that exists. A relative path begins at the process's current directory, and stays relative where
    /// that is outside of drive_c. Base folders such as `C:\Windows` are found in any case.
    ///
    /// What Windows cannot find (a missing drive, a network share) becomes a path below /dev/null, where nothing exists
    /// and nothing can be made. What it refuses (characters, names of devices, a separator behind a file's name)
    /// becomes a name that the host refuses too. A name below a folder that is held (held_folders.h) leads through the
    /// open folder.
    [[nodiscard]] std::string HostPath(std::wstring_view windowsPath) const;
    /// The same for UTF-8.
    [[nodiscard]] std::string HostPath(std::string_view windowsPath) const;
    /// The Windows path of a host's name: below drive_c on `C:`, any other absolute name on `Z:`; a relative one stays
    /// relative.
    [[nodiscard]] std::wstring WindowsPath(std::string_view hostPath) const;

    Faults& GetFaults() { return faults_; }
    Registry& GetRegistry() { return registry_; }
    Environment& GetEnvironment() { return environment_; }

private:
    struct BaseFolder;

    template <class Char>
    class HostName;

    static Machine& First();
    static std::unique_ptr<const BaseFolder> BaseFoldersOf(const std::string& account);
    static void MakeFolders(const BaseFolder& folder, const std::string& hostPath);
    void ArmFromEnvironment();
    /// The Windows path of the process's current directory; empty where that is outside of drive_c.
    [[nodiscard]] std::wstring CurrentFolderOnC() const;

    std::string folder_;
    std::string driveC_;
    std::string account_;
    std::unique_ptr<const BaseFolder> baseFolders_;
    Faults faults_;
    Environment environment_;
    Registry registry_;
};

}  // namespace hosted
