#pragma once

#include <memory>
#include <string>
#include <vector>

#include "platform/held_folder.h"

namespace HV {

/// The folders by whose files a run decides what it does: removal scripts, records of what is installed, and the
/// wizard's logging. Every user of a computer may make them before the first run does.
///
/// A run of an administrator makes one of these before it reads any of them. Any other run has nothing that somebody
/// could borrow, and the object does nothing then. What cannot be done is told by LogWarnings() and stops no run.
class GuardedFolders {
public:
    /// Takes over the company's folder and, where they are there, those in it that are read from. The company's folder
    /// is made where it is missing, so that nobody else makes it while the run goes on. A link in the place of a
    /// folder, and a file that IsPlanted(), goes into a new folder "set-aside-" and a random name; one that cannot be
    /// moved, and a folder that cannot be taken over, IsRefused() until the next object of this class.
    GuardedFolders();

    /// Removes what it has made if nothing has been put into it.
    ~GuardedFolders();

    GuardedFolders(const GuardedFolders&) = delete;
    GuardedFolders& operator=(const GuardedFolders&) = delete;

    /// A line at WARN for each thing that was found.
    void LogWarnings() const;

private:
    enum class Content { Nothing, EveryFile, PropertyFile };
    struct Place {
        std::string path;
        Content content;
    };

    void GuardCompanyFolder(const std::string& company, const std::vector<Place>& places);
    [[nodiscard]] bool TakeCompanyFolder(const std::string& company);
    bool MakeCompanyFolder(const std::string& company);
    void GuardPlace(const Place& place);
    void LookAt(const Place& place);
    void LookAtFile(const std::string& path);
    bool MoveAway(const std::string& path, const std::string& target);
    [[nodiscard]] std::string NextPlaceAside();
    void MakeFolderAside();
    void RefuseFolder(const std::string& path);

    std::vector<std::string> warnings_;
    std::vector<std::string> made_;
    std::vector<std::unique_ptr<platform::HeldFolder>> held_;  // while the constructor is at work
    std::string company_;
    std::string aside_;  // empty as long as nothing had to be moved
    int moved_ = 0;
};

/// Whether the item, or a folder above it, could not be secured: found planted and not moved away, or not taken over.
/// It must not be used. For the thread that has made the GuardedFolders, and for those that it starts afterwards.
[[nodiscard]] bool IsRefused(const std::string& path);

}  // namespace HV
