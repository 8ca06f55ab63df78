#include "tests/support/Target.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cctype>

namespace {

std::string LowerCase(std::string text) {
    std::transform(text.begin(), text.end(), text.begin(),
                   [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
    return text;
}

std::string Utf8(const std::filesystem::path& path) {
    const std::u8string text = path.u8string();
    return {text.begin(), text.end()};
}

/// Windows' own folders are `users` and `windows` on disk; programs and people know them as here.
std::string AsWindowsSpells(const std::string& parent, const std::string& name) {
    const std::string lower = LowerCase(name);
    if (parent == "C:" && lower == "users") {
        return "Users";
    }
    if (parent == "C:" && lower == "windows") {
        return "Windows";
    }
    return parent == R"(C:\Windows)" && lower == "system32" ? "System32" : name;
}

bool IsBelow(const std::string& path, const std::string& folder) {
    return path.size() > folder.size() && path.compare(0, folder.size(), folder) == 0 && path[folder.size()] == '\\';
}

/// Folders of a fresh machine that are not looked into: Windows' own, which are large, and the user's, which Wine may
/// have made links to folders of the host.
bool IsUninteresting(const std::string& path, const std::string& temp) {
    const std::string windows = R"(C:\Windows)";
    if (IsBelow(path, windows)) {
        return path != windows + R"(\System32)";
    }
    const std::string name = LowerCase(path.substr(path.rfind('\\') + 1));
    for (const char* own :
         {"contacts", "desktop", "documents", "downloads", "favorites", "links", "music", "pictures", "saved games",
          "searches", "templates", "videos", "my documents", "my music", "my pictures", "my videos"}) {
        if (name == own && !IsBelow(path, R"(C:\Users\Public)")) {
            return IsBelow(path, R"(C:\Users)");
        }
    }
    return LowerCase(path) == LowerCase(temp);
}

class Lister {
public:
    Lister(const Items& base, std::string temp, Items& items) : base_(base), temp_(std::move(temp)), items_(items) {}

    void List(const std::filesystem::path& folder, const std::string& path) {
        std::error_code error;
        for (const auto& entry : std::filesystem::directory_iterator(folder, error)) {
            Add(entry, path + '\\' + AsWindowsSpells(path, Utf8(entry.path().filename())));
        }
        if (error) {
            ADD_FAILURE() << "cannot list " << path << ": " << error.message();
        }
    }

private:
    void Add(const std::filesystem::directory_entry& entry, const std::string& path) {
        const auto known = base_.find(path);
        // Asking an entry what it is costs far more than its name, and of the old ones the answer is known.
        const bool isFolder = known != base_.end() ? known->second : entry.is_directory() && !entry.is_symlink();
        items_.emplace(path, isFolder);
        // While a fresh machine is listed all that is found belongs to it.
        const bool isBase = base_.empty() || known != base_.end();
        if (isFolder && !(isBase && IsUninteresting(path, temp_))) {
            List(entry.path(), path);
        }
    }

    const Items& base_;
    std::string temp_;
    Items& items_;
};

}  // namespace

RegistryContent ContentOf(const std::vector<hosted::RegistryChange>& changes) {
    RegistryContent content;
    for (const hosted::RegistryChange& change : changes) {
        RegistryValues& values = content[change.key];
        if (change.kind == hosted::RegistryChange::Kind::SetValue) {
            values[change.name] = {change.type, change.data};
        }
    }
    return content;
}

std::string TempFolderInWindowsSpelling(const std::string& temp) {
    return LowerCase(temp.substr(0, 9)) == R"(c:\users\)" ? R"(C:\Users\)" + temp.substr(9) : temp;
}

Items MachineTarget::ListItems(const Items& base) const {
    Items items;
    Lister(base, TempFolderInWindowsSpelling(Variable("TEMP")), items).List(DriveC(), "C:");
    return items;
}

Items MachineTarget::AddedItems() const {
    Items items = ListItems(baseItems_);
    std::erase_if(items, [this](const auto& item) { return baseItems_.count(item.first) > 0; });
    return items;
}

std::set<std::string> MachineTarget::ListTemp() const {
    std::set<std::string> names;
    std::error_code error;
    for (const auto& entry : std::filesystem::directory_iterator(HostPath(Variable("TEMP")), error)) {
        names.insert(Utf8(entry.path().filename()));
    }
    return names;
}

std::set<std::string> MachineTarget::AddedTempEntries() const {
    std::set<std::string> names = ListTemp();
    std::erase_if(names, [this](const std::string& name) { return baseTemp_.count(name) > 0; });
    return names;
}
