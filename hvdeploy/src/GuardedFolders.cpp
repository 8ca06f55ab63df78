#include "hvdeploy/src/GuardedFolders.h"

#include <algorithm>

#include "hvdeploy/src/InstalledHistory.h"
#include "hvdeploy/src/Logging.h"
#include "hvdeploy/src/UninstallScripts.h"
#include "hvframework/FileUtils.h"
#include "hvframework/Log.h"
#include "platform/files.h"
#include "platform/filesystem.h"
#include "platform/guarded_folder.h"
#include "platform/name_case.h"
#include "platform/utf8.h"

namespace HV {
namespace {

using namespace HVL::FileUtils;
using platform::Guarding;

// Whoever can put a link into the place again and again must not keep the run busy for ever.
constexpr int kMostTries = 16;

/// A path as Windows compares it.
std::wstring KeyOf(const std::string& path) {
    return platform::NameInUpperCase(platform::WideFromUtf8(path));
}

/// Keys of paths.
std::vector<std::wstring>& Refused() {
    static std::vector<std::wstring> paths;
    return paths;
}

}  // namespace

GuardedFolders::GuardedFolders() {
    Refused().clear();
    if (!platform::CanGuardFolders()) {
        return;
    }
    const std::string history = HistoryFolder();
    GuardCompanyFolder(GetParentPath(kUninstallScriptFolder), {{kUninstallScriptFolder, Content::EveryFile},
                                                               {GetParentPath(history), Content::Nothing},
                                                               {history, Content::EveryFile}});
    // The same folder as a rule, but the environment decides about this one.
    const std::string properties = GetParentPath(LoggingConfigOfTheMachine());
    GuardCompanyFolder(GetParentPath(properties), {{properties, Content::PropertyFile}});
}

GuardedFolders::~GuardedFolders() {
    for (const std::string& folder : made_) {
        // One that is not empty stays.
        (void)platform::RemoveEmptyDirectory(folder);
    }
}

void GuardedFolders::LogWarnings() const {
    for (const std::string& warning : warnings_) {
        HVL_LOG(Warn, warning);
    }
}

// From the top down, each held until the end: nobody comes between to what has been taken over.
void GuardedFolders::GuardCompanyFolder(const std::string& company, const std::vector<Place>& places) {
    company_ = company;
    aside_.clear();
    if (TakeCompanyFolder(company)) {
        for (const Place& place : places) {
            GuardPlace(place);
        }
    }
    held_.clear();
}

bool GuardedFolders::TakeCompanyFolder(const std::string& company) {
    for (int i = 0; i < kMostTries; ++i) {
        Guarding outcome = Guarding::Failed;
        held_.push_back(platform::GuardFolder(company, outcome));
        switch (outcome) {
            case Guarding::Done:
            case Guarding::Linked:
                return true;
            case Guarding::Failed:
                RefuseFolder(company);
                return false;
            case Guarding::Missing:
                if (!MakeCompanyFolder(company)) {
                    return false;
                }
                break;
            case Guarding::Planted:
                if (!MoveAway(company, MakeTempPath(GetFileName(company) + "-set-aside-", GetParentPath(company)))) {
                    return false;
                }
                break;
        }
    }
    RefuseFolder(company);
    return false;
}

/// False when there can be none, so that nobody else makes it either.
bool GuardedFolders::MakeCompanyFolder(const std::string& company) {
    if (!DirectoryExists(GetParentPath(company))) {
        return false;
    }
    platform::NoFolder reason = platform::NoFolder::Failed;
    if (platform::MakeGuardedFolder(company, reason) != nullptr) {
        made_.push_back(company);
        return true;
    }
    if (reason == platform::NoFolder::Failed) {
        RefuseFolder(company);
    }
    return reason == platform::NoFolder::Taken;
}

void GuardedFolders::GuardPlace(const Place& place) {
    if (IsRefused(place.path)) {
        return;
    }
    Guarding outcome = Guarding::Failed;
    held_.push_back(platform::GuardFolder(place.path, outcome));
    switch (outcome) {
        case Guarding::Done:
        case Guarding::Linked:
            LookAt(place);
            break;
        case Guarding::Missing:
            break;
        case Guarding::Planted:
            (void)MoveAway(place.path, NextPlaceAside() + GetFileName(place.path));
            break;
        case Guarding::Failed:
            RefuseFolder(place.path);
            break;
    }
}

void GuardedFolders::LookAt(const Place& place) {
    if (place.content == Content::PropertyFile) {
        LookAtFile(LoggingConfigOfTheMachine());
    }
    if (place.content != Content::EveryFile) {
        return;
    }
    boost::system::error_code error;
    std::vector<std::string> files;
    for (fs::directory_iterator entry(fs::path(place.path), error), end; !error && entry != end;
         entry.increment(error)) {
        files.push_back(JoinPath(place.path, entry->path().filename().string()));
    }
    std::ranges::for_each(files, [this](const std::string& file) { LookAtFile(file); });
}

void GuardedFolders::LookAtFile(const std::string& path) {
    boost::system::error_code error;
    const bool isFolder = fs::is_directory(fs::symlink_status(fs::path(path), error));
    if (!isFolder && platform::IsPlanted(path)) {
        (void)MoveAway(path, NextPlaceAside() + GetFileName(path));
    }
}

bool GuardedFolders::MoveAway(const std::string& path, const std::string& target) {
    boost::system::error_code error;
    fs::rename(fs::path(path), fs::path(target), error);
    if (error) {
        Refused().push_back(KeyOf(path));
        warnings_.push_back("somebody else than an administrator may have made " + path +
                            "; it cannot be moved away, and it is not used");
        return false;
    }
    warnings_.push_back("somebody else than an administrator may have made " + path +
                        "; it is not used, and now it is " + target);
    return true;
}

/// What the name of the next thing to be moved begins with. The number keeps things of one name apart.
std::string GuardedFolders::NextPlaceAside() {
    if (aside_.empty()) {
        MakeFolderAside();
    }
    return JoinPath(aside_, std::to_string(++moved_) + "-");
}

// Where it cannot be made the moving fails.
void GuardedFolders::MakeFolderAside() {
    platform::NoFolder reason = platform::NoFolder::Failed;
    aside_ = MakeTempPath("set-aside-", company_);
    held_.push_back(platform::MakeGuardedFolder(aside_, reason));
}

// Whoever keeps a folder open for nobody else would otherwise choose what is read there.
void GuardedFolders::RefuseFolder(const std::string& path) {
    Refused().push_back(KeyOf(path));
    warnings_.push_back("the folder " + path + " cannot be taken over; what is in it is not used");
}

bool IsRefused(const std::string& path) {
    if (Refused().empty()) {
        return false;
    }
    const std::wstring key = KeyOf(path);
    return std::ranges::any_of(
        Refused(), [&](const std::wstring& refused) { return key == refused || key.starts_with(refused + L'\\'); });
}

}  // namespace HV
