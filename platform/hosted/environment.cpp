#include "platform/hosted/environment.h"

#include <unistd.h>

#include <algorithm>
#include <cstdlib>
#include <vector>

namespace hosted {
namespace {

/// The names under which `name` stands in the process, whatever their case, with their values.
std::vector<std::pair<std::string, std::string>> ProcessVariables(std::string_view name) {
    std::vector<std::pair<std::string, std::string>> found;
    for (char** entry = environ; entry != nullptr && *entry != nullptr; ++entry) {
        const std::string_view text(*entry);
        const std::size_t equals = text.find('=');
        if (equals != std::string_view::npos && EqualsIgnoringCase(text.substr(0, equals), name)) {
            found.emplace_back(text.substr(0, equals), text.substr(equals + 1));
        }
    }
    return found;
}

}  // namespace

Environment::Environment(const std::string& account) {
    // `users` and `windows` are spelled as they are on disk, which is how Wine gives them to a program.
    const std::string profile = R"(C:\users\)" + account;
    const std::string local = profile + R"(\AppData\Local)";
    variables_ = {{"ALLUSERSPROFILE", R"(C:\ProgramData)"},
                  {"APPDATA", profile + R"(\AppData\Roaming)"},
                  {"CommonProgramFiles", R"(C:\Program Files\Common Files)"},
                  {"CommonProgramFiles(x86)", R"(C:\Program Files (x86)\Common Files)"},
                  {"CommonProgramW6432", R"(C:\Program Files\Common Files)"},
                  {"ComSpec", R"(C:\windows\system32\cmd.exe)"},
                  {"HOMEDRIVE", "C:"},
                  {"HOMEPATH", R"(\users\)" + account},
                  {"LOCALAPPDATA", local},
                  {"OS", "Windows_NT"},
                  {"ProgramData", R"(C:\ProgramData)"},
                  {"ProgramFiles", R"(C:\Program Files)"},
                  {"ProgramFiles(x86)", R"(C:\Program Files (x86))"},
                  {"ProgramW6432", R"(C:\Program Files)"},
                  {"PUBLIC", R"(C:\users\Public)"},
                  {"SystemDrive", "C:"},
                  {"SystemRoot", R"(C:\windows)"},
                  {"TEMP", local + R"(\Temp)"},
                  {"TMP", local + R"(\Temp)"},
                  {"USERNAME", account},
                  {"USERPROFILE", profile},
                  {"windir", R"(C:\windows)"}};
}

std::optional<std::string> Environment::Get(std::string_view name) const {
    const std::lock_guard guard(mutex_);
    const auto inProcess = ProcessVariables(name);
    if (!inProcess.empty()) {
        return inProcess.front().second;
    }
    const auto found = variables_.find(name);
    return found == variables_.end() ? std::nullopt : std::optional(found->second);
}

void Environment::Set(const std::string& name, const std::optional<std::string>& value) {
    const std::lock_guard guard(mutex_);
    for (const auto& [spelling, old] : ProcessVariables(name)) {
        unsetenv(spelling.c_str());
    }
    if (value) {
        setenv(name.c_str(), value->c_str(), 1);
    } else if (const auto found = variables_.find(name); found != variables_.end()) {
        variables_.erase(found);
    }
}

std::string Environment::Expand(std::string_view text) const {
    std::string expanded;
    while (!text.empty()) {
        const std::size_t end = text[0] == '%' ? text.find('%', 1) : std::string_view::npos;
        const auto value = end == std::string_view::npos ? std::nullopt : Get(text.substr(1, end - 1));
        // A text that is no variable is taken up to the next percent sign, which may begin one itself.
        const std::size_t taken = value ? end + 1 : std::min(text.find('%', 1), text.size());
        expanded += value ? *value : std::string(text.substr(0, taken));
        text.remove_prefix(taken);
    }
    return expanded;
}

}  // namespace hosted
