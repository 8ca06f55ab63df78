#include "hvdeploy/src/DeployRollback.h"

#include <stdexcept>

#include "hvdeploy/src/EntryTrace.h"
#include "hvdeploy/src/HeldTarget.h"
#include "hvframework/FileUtils.h"
#include "hvframework/Log.h"

namespace HV {
namespace {

using namespace HVL;

bool IsSeparator(wchar_t c) {
    return c == L'\\' || c == L'/';
}

// Two paths that the filesystem library calls equal have one key: it compares name by name, so the kind and the number
// of the separators between two names do not count. A pair of them in front is a server's name and stays.
std::wstring KeyOf(const fs::path& path) {
    const std::wstring& text = path.native();
    std::wstring key;
    key.reserve(text.size());
    for (std::size_t i = 0; i < text.size(); ++i) {
        const bool repeated = IsSeparator(text[i]) && i > 1 && IsSeparator(text[i - 1]);
        if (!repeated) {
            key += IsSeparator(text[i]) ? L'\\' : text[i];
        }
    }
    return key;
}

// Whether the move is done. A move to another volume is a copy, and tells of a failure by what the filesystem library
// throws: here that is a failed move like any other, because both ways go on past it.
bool Move(const std::string& from, const std::string& to) {
    try {
        return FileUtils::MoveFileOrDirectory(from, to);
    } catch (const std::exception&) {
        return false;
    }
}

}  // namespace

DeployRollback::DeployRollback() : stashFolder("hvdeploystash") {
    const std::string folder = stashFolder.Path();
    if (!stashFolder.IsThere() || FileUtils::CreateDirectories(folder) != 0 || !FileUtils::DirectoryExists(folder)) {
        throw std::runtime_error("Failed to create stash directory for rollback.");
    }
    stashDir = folder;
}

DeployRollback::~DeployRollback() {
    DeleteStash();
}

void DeployRollback::StashExistingFile(const fs::path& path) {
    HVL_LOG(Debug, "stashing existing file in case of rollback, from " << path);
    const std::string original = path.string();
    // The stash is flat; the random part of the name keeps two files of one name apart.
    const std::string target = FileUtils::MakeTempPath(FileUtils::GetFileName(original), stashDir.string());
    if (Move(original, target)) {
        stashedFiles.emplace_back(path, target);
    } else {
        HVL_LOG(Warn, "Failed to move/copy existing item to rollback stash, from " << path);
    }
}

void DeployRollback::AddInstalledFile(const std::string& packageId, const std::string& payloadId,
                                      const fs::path& path) {
    InstalledFiles& files = installedFiles[packageId][payloadId];
    if (files.keys.insert(KeyOf(path)).second) {
        files.paths.push_back(path);
    }
}

// Removal comes first, so that nothing that is put back is deleted afterwards.
void DeployRollback::Rollback() {
    TraceEntry("HV::DeployRollback::", "Rollback");
    RemoveInstalledFiles();
    RestoreStashedFiles();
    rolledBack = true;
}

void DeployRollback::RemoveInstalledFiles() {
    HeldTarget target;
    for (const auto& package : installedFiles) {
        for (const auto& payload : package.second) {
            for (const fs::path& path : payload.second.paths) {
                boost::system::error_code ignored;
                if (!fs::exists(path, ignored) || !target.HoldNearest(path.parent_path())) {
                    continue;
                }
                HVL_LOG(Debug, "Removing file at " << path);
                if (const int error = FileUtils::DeleteFileOrDirectory(path.string()); error != 0) {
                    HVL_LOG(Warn, "DeleteFileOrDirectory returned " << error << "; failed to delete installed file at "
                                                                    << path);
                }
            }
        }
    }
}

// Fixed (contracts, rollback): in the order of stashing and not the other way round. Where two payloads placed one
// path, the later entry goes back last and wins.
void DeployRollback::RestoreStashedFiles() {
    HeldTarget target;
    for (const auto& [original, stashed] : stashedFiles) {
        HVL_LOG(Debug, "Restoring original file at " << original);
        if (target.HoldNearest(original.parent_path())) {
            // What cannot be put back has no message of its own.
            (void)Move(stashed.string(), original.string());
        }
    }
}

void DeployRollback::DeleteStash() {
    boost::system::error_code ignored;
    if (fs::exists(stashDir, ignored)) {
        HVL_LOG(Debug, "Deleting rollback stash directory.");
        stashFolder.LetGo();
        FileUtils::DeleteFileOrDirectory(stashDir.string());
    }
}

}  // namespace HV
