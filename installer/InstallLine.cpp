#include "installer/InstallLine.h"

#include "hvframework/StringUtils.h"

namespace HV {
namespace {

std::string Quoted(const std::string& text) {
    return "\"" + text + "\"";
}

std::string Joined(const std::vector<std::string>& texts) {
    std::string joined;
    for (const std::string& text : texts) {
        joined += (joined.empty() ? "" : ",") + text;
    }
    return joined;
}

std::string SkipArgument(const std::vector<std::string>& identifiers) {
    return identifiers.empty() ? std::string() : "skip=" + Quoted(Joined(identifiers)) + " ";
}

}  // namespace

std::string InstallLine(const InstallRequest& request) {
    // In the wizard "log=" names a file that never comes to be, since logging stands before the line is read. The
    // argument stays: without that logging the same line gets its file.
    return "--verbose " + SkipArgument(request.skippedIdentifiers) +
           "log=" + Quoted(request.logPathPrefix + HVL::StringUtils::ToString(request.time) + "-log.txt") +
           " --legacyuninstall " + "dir=" + Quoted(request.packagesDirectory);
}

}  // namespace HV
