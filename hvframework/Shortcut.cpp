#include "hvframework/Shortcut.h"

#include <iostream>

#include "hvframework/StringUtils.h"
#include "platform/shell_link.h"

namespace HVL::FileUtils {
namespace {

using platform::ShellLinkResult;

constexpr const char* kDescription = "Halvorn shortcut";

// Fixed (contracts, shortcuts): numbers that tell the two failures apart. They name no line of this source.
constexpr int kNoFileInterface = 503;
constexpr int kNotSaved = 513;

int Fail(int place) {
    std::cerr << "ERROR at "
              << "HVL::FileUtils::MakeShortcut"
              << ":" << place << std::endl;
    return -1;
}

}  // namespace

int MakeShortcut(const std::string& target, const std::string& linkPath) {
    const bool isProgram = StringUtils::EndsWith(target, ".exe");
    switch (platform::SaveShellLink({target, kDescription, isProgram}, linkPath)) {
        case ShellLinkResult::Saved:
            return 0;
        case ShellLinkResult::NoLink:
            return -1;
        case ShellLinkResult::NoFile:
            return Fail(kNoFileInterface);
        case ShellLinkResult::NotSaved:
            return Fail(kNotSaved);
    }
    return -1;
}

}  // namespace HVL::FileUtils
