#include "hvframework/TempFolder.h"

#include "hvframework/FileUtils.h"

namespace HVL {
namespace {

// Random names meet nobody's but by an attack, which must not keep the run busy for ever.
constexpr int kMostNames = 16;

}  // namespace

TempFolder::TempFolder(std::string_view prefix)
    : TempFolder([prefix] { return FileUtils::MakeTempPath(prefix, FileUtils::GetTempDirectory()); }) {}

TempFolder::TempFolder(const std::function<std::string()>& nextPath) {
    platform::NoFolder reason = platform::NoFolder::Taken;
    for (int i = 0; i < kMostNames && folder_ == nullptr && reason == platform::NoFolder::Taken; ++i) {
        const std::string path = nextPath();
        // What counts is whether the folder below can be made.
        (void)FileUtils::CreateDirectories(FileUtils::GetParentPath(path));
        folder_ = platform::MakePrivateFolder(path, reason);
    }
}

}  // namespace HVL
