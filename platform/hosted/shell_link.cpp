#include "platform/shell_link.h"

#include <sys/stat.h>

#include <cstdio>

#include "platform/files.h"
#include "platform/hosted/link_file.h"
#include "platform/hosted/machine.h"
#include "platform/utf8.h"

namespace platform {
namespace {

/// Of the shell's buffer for a path, without the terminator.
constexpr std::size_t kLongestPath = 259;

void DescribeTarget(hosted::LinkFile& link) {
    struct stat status {};
    if (stat(hosted::Machine::Current().HostPath(link.target).c_str(), &status) != 0) {
        return;
    }
    const bool isFolder = S_ISDIR(status.st_mode);
    link.attributes = isFolder ? hosted::AttributeDirectory : hosted::AttributeArchive;
    link.size = isFolder ? 0 : static_cast<std::uint32_t>(status.st_size);
}

bool WriteFile(const std::string& path, const std::string& bytes) {
    std::FILE* file = OpenStream(path, "wb");
    if (file == nullptr) {
        return false;
    }
    const bool isWritten = std::fwrite(bytes.data(), 1, bytes.size(), file) == bytes.size();
    if (std::fclose(file) == 0 && isWritten) {
        return true;
    }
    (void)RemoveFile(path);
    return false;
}

}  // namespace

ShellLinkResult SaveShellLink(const ShellLink& wanted, const std::string& path) {
    hosted::LinkFile link;
    link.target = WideFromUtf8(wanted.target);
    link.description = WideFromUtf8(wanted.description);
    link.icon = wanted.showsIconOfTarget ? link.target : std::wstring();
    if (link.target.size() > kLongestPath) {
        return ShellLinkResult::NoLink;
    }
    DescribeTarget(link);
    const bool saved = WideFromUtf8(path).size() <= kLongestPath && WriteFile(path, LinkFileBytes(link));
    return saved ? ShellLinkResult::Saved : ShellLinkResult::NotSaved;
}

}  // namespace platform
