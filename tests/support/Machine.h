#pragma once

#include <map>
#include <memory>
#include <string>
#include <vector>

class MachineTarget;

/// A Windows machine as tests speak of it: what it has, and what came of a run. The same on both targets.
///
/// A fresh object is a fresh machine. Hosted it is a new folder, current until the object ends, and removed then; on
/// Windows it is the machine itself (a Wine prefix of its own), from which everything is removed that was not there
/// when the program first made one. One at a time. The environment is put back when the object ends.
///
/// Paths are Windows paths; contents are bytes. Folders of Windows itself are spelled as Windows 10 spells them
/// (`C:\Users`, `C:\Windows\System32`) in everything that is given back. What a fixture cannot do fails the test.
class Machine {
public:
    Machine();
    ~Machine();
    Machine(const Machine&) = delete;
    Machine& operator=(const Machine&) = delete;

    /// A file with this content, its folders included; replaces one that is there.
    void Has(const std::string& path, const std::string& content);
    void HasFolder(const std::string& path);
    /// A file that may not be written or deleted.
    void HasReadOnly(const std::string& path, const std::string& content);
    /// Registry entries, in the text form that begins with REGEDIT4.
    void Loads(const std::string& registryText);

    [[nodiscard]] bool Exists(const std::string& path) const;
    [[nodiscard]] bool HasFile(const std::string& path) const;
    /// Fails the test when there is no such file.
    [[nodiscard]] std::string Content(const std::string& path) const;

    /// All that was added to drive C: path to content for a file; a folder's path ends in `\` and has no content. Left
    /// out are what a fresh machine has, the folder for temporary files and the engine's own logs
    /// (`C:\ProgramData\Halvorn\Logs`, as a folder and with every name that holds ".log").
    [[nodiscard]] std::map<std::string, std::string> Files() const;
    /// The same without the folders: what must be equal where a run may leave folders behind.
    [[nodiscard]] std::map<std::string, std::string> FilesWithoutFolders() const;
    /// The names in the folder for temporary files, sorted.
    [[nodiscard]] std::vector<std::string> TempEntries() const;
    /// Registry text of the values and the keys that were added, sorted; a key that only leads to others has no line of
    /// its own. On Windows keys that a fresh machine has are looked into where programs leave things: `Software` (new
    /// keys in `Classes` and `Microsoft` too), the list of installed programs, `Environment`, the hardware profile.
    [[nodiscard]] std::string Registry() const;

    /// The folder for temporary files and the user's own folder, as the environment names them.
    [[nodiscard]] std::string TempFolder() const;
    [[nodiscard]] std::string UserFolder() const;
    /// The name by which the host's own tools find this path: for tests that compare with other programs.
    [[nodiscard]] std::string HostName(const std::string& path) const;

private:
    std::unique_ptr<MachineTarget> target_;
};
