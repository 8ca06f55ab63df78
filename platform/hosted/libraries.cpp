#include "platform/libraries.h"

#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <fstream>
#include <map>
#include <mutex>
#include <vector>

#include "platform/hosted/file_error.h"
#include "platform/hosted/machine.h"

namespace platform {
namespace {

using hosted::Machine;

constexpr std::string_view FileNameKey = ".fileName";
constexpr const char* MakingCopy = "platform::LibraryPropertyFile";
constexpr const char* Blanks = " \t\r\n\v\f";

std::string_view Trim(std::string_view text) {
    const std::size_t first = std::min(text.find_first_not_of(Blanks), text.size());
    text.remove_prefix(first);
    return text.substr(0, text.find_last_not_of(Blanks) + 1);
}

/// Files that live as long as the process.
class PrivateFiles {
public:
    static PrivateFiles& Instance() {
        static PrivateFiles files;
        return files;
    }
    PrivateFiles() = default;
    PrivateFiles(const PrivateFiles&) = delete;
    PrivateFiles& operator=(const PrivateFiles&) = delete;
    ~PrivateFiles() {
        for (const std::string& name : names_) {
            ::unlink(name.c_str());
        }
    }

    /// A new file that only this user can read. Gives its host name.
    std::string Make(const std::string& content) {
        const char* folder = std::getenv("TMPDIR");
        std::string name =
            std::string(folder != nullptr && *folder != '\0' ? folder : "/tmp") + "/hvlogproperties-XXXXXX";
        const int descriptor = ::mkstemp(name.data());
        if (descriptor < 0) {
            hosted::filesystem::Report(errno, nullptr, MakingCopy, name);
        }
        ::close(descriptor);
        const std::lock_guard guard(mutex_);
        names_.push_back(name);
        std::ofstream file(name, std::ios::binary);
        if (!(file << content).flush()) {
            hosted::filesystem::Report(EIO, nullptr, MakingCopy, name);
        }
        return name;
    }

private:
    std::mutex mutex_;
    std::vector<std::string> names_;
};

/// Turns the lines of a property file into those that the library may read on the host.
class PropertyLines {
public:
    std::string Convert(const std::string& line) {
        // For the library a `#` begins a comment wherever it stands.
        const std::string_view content = std::string_view(line).substr(0, line.find('#'));
        const std::size_t equals = content.find('=');
        if (equals == std::string_view::npos) {
            return line;
        }
        const std::string key(Trim(content.substr(0, equals)));
        const std::string value = FillIn(Trim(content.substr(equals + 1)));
        values_[key] = value;
        return key.ends_with(FileNameKey) ? key + "=" + Machine::Current().HostPath(std::string_view(value)) : line;
    }

private:
    /// With each `${NAME}` replaced by the variable, else by what a line before this one says, else by nothing.
    std::string FillIn(std::string_view value) const {
        std::string filled;
        std::size_t open = 0;
        while ((open = value.find("${")) != std::string_view::npos) {
            const std::size_t close = value.find('}', open);
            if (close == std::string_view::npos) {
                break;
            }
            filled += value.substr(0, open);
            filled += Variable(std::string(value.substr(open + 2, close - open - 2)));
            value.remove_prefix(close + 1);
        }
        return filled += value;
    }

    std::string Variable(const std::string& name) const {
        const auto earlier = values_.find(name);
        return Machine::Current().GetEnvironment().Get(name).value_or(earlier == values_.end() ? "" : earlier->second);
    }

    std::map<std::string, std::string> values_;
};

}  // namespace

std::string LibraryFileName(const fs::path& file) {
    return Machine::Current().HostPath(file.native());
}

std::string LibraryPropertyFile(const fs::path& file) {
    const std::string name = LibraryFileName(file);
    std::ifstream source(name, std::ios::binary);
    if (!source) {
        return name;
    }
    PropertyLines lines;
    std::string converted;
    for (std::string line; std::getline(source, line);) {
        converted += lines.Convert(line) + "\n";
    }
    return PrivateFiles::Instance().Make(converted);
}

}  // namespace platform
