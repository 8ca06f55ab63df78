#pragma once

#include <string>
#include <unordered_map>
#include <vector>

#include "hvframework/Version.h"

namespace HV {

/// What is installed on this machine, as the files of the history folder tell it.
///
/// A file "<identifier>_v<version>_hvmanifest.xml" says that this version is there; packages bring those files along.
/// The first reading that finds any stands for the life of the object, so a run does not see its own packages.
/// Not thread-safe.
class InstalledHistory {
public:
    explicit InstalledHistory(std::string historyFolder) : folder(std::move(historyFolder)) {}

    /// The products that are installed, each once, in the folder's order. Empty when the folder is missing.
    const std::vector<std::string>& Identifiers();

    /// The installed versions of `identifier`, in the folder's order; empty when it is not installed.
    const std::vector<HVL::Version>& Versions(const std::string& identifier);

private:
    void Read();

    std::string folder;
    std::vector<std::string> stems;
    std::vector<std::string> identifiers;
    std::unordered_map<std::string, std::vector<HVL::Version>> versions;
};

/// The folder that records what is installed. It is a fixed place and not looked up in the environment.
[[nodiscard]] std::string HistoryFolder();

/// The stems of `folder`, in its order: one for each regular file whose name ends in "_hvmanifest.xml", without that
/// ending. Files that IsRefused() are left out.
std::vector<std::string> ReadHistoryStems(const std::string& folder);

/// The text of a stem before the first "_v", or all of it.
std::string IdentifierOfStem(const std::string& stem);

/// The text of a stem after the first "_v", or all of it when nothing stands there.
std::string VersionOfStem(const std::string& stem);

}  // namespace HV
