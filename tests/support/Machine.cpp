#include "tests/support/Machine.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>

#include "tests/support/Target.h"

namespace {

constexpr const char* LogFolder = R"(C:\ProgramData\Halvorn\Logs)";

bool EqualIgnoringCase(const std::string& left, const std::string& right) {
    return hosted::EqualsIgnoringCase(left, right);
}

/// The engine's own logs hold times and temporary names, and differ from run to run.
bool IsLog(const std::string& path, bool isFolder) {
    if (isFolder) {
        return EqualIgnoringCase(path, LogFolder);
    }
    const std::size_t separator = path.rfind('\\');
    return EqualIgnoringCase(path.substr(0, separator), LogFolder) && path.find(".log", separator) != std::string::npos;
}

std::string Read(const std::filesystem::path& file) {
    std::ifstream stream(file, std::ios::binary);
    std::string content{std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>()};
    if (!stream) {
        ADD_FAILURE() << "cannot read " << file;
    }
    return content;
}

void MakeFolder(const std::filesystem::path& folder) {
    std::error_code error;
    std::filesystem::create_directories(folder, error);
    if (error) {
        ADD_FAILURE() << "cannot make the folder " << folder << ": " << error.message();
    }
}

bool LeadsToAnother(const RegistryContent& content, RegistryContent::const_iterator key) {
    return std::any_of(content.begin(), content.end(), [&](const auto& other) {
        const std::string& path = other.first;
        return path.size() > key->first.size() && path[key->first.size()] == '\\' &&
               EqualIgnoringCase(path.substr(0, key->first.size()), key->first);
    });
}

}  // namespace

Machine::Machine() : target_(std::make_unique<MachineTarget>()) {}
Machine::~Machine() = default;

void Machine::Has(const std::string& path, const std::string& content) {
    const std::filesystem::path file = target_->HostPath(path);
    MakeFolder(file.parent_path());
    std::ofstream stream(file, std::ios::binary | std::ios::trunc);
    stream.write(content.data(), static_cast<std::streamsize>(content.size()));
    stream.close();
    if (!stream) {
        ADD_FAILURE() << "cannot write " << path;
    }
}

void Machine::HasFolder(const std::string& path) {
    MakeFolder(target_->HostPath(path));
}

void Machine::HasReadOnly(const std::string& path, const std::string& content) {
    using std::filesystem::perms;
    Has(path, content);
    std::filesystem::permissions(target_->HostPath(path), perms::owner_write | perms::group_write | perms::others_write,
                                 std::filesystem::perm_options::remove);
}

void Machine::Loads(const std::string& registryText) {
    try {
        target_->LoadRegistry(hosted::ParseRegistryText(registryText), registryText);
    } catch (const hosted::RegistryTextError& error) {
        ADD_FAILURE() << "line " << error.Line() << " of the registry text: " << error.what();
    }
}

bool Machine::Exists(const std::string& path) const {
    std::error_code error;
    return std::filesystem::exists(target_->HostPath(path), error);
}

bool Machine::HasFile(const std::string& path) const {
    std::error_code error;
    return std::filesystem::is_regular_file(target_->HostPath(path), error);
}

std::string Machine::Content(const std::string& path) const {
    if (!HasFile(path)) {
        ADD_FAILURE() << "there is no file " << path;
        return {};
    }
    return Read(target_->HostPath(path));
}

std::map<std::string, std::string> Machine::Files() const {
    std::map<std::string, std::string> files;
    for (const auto& [path, isFolder] : target_->AddedItems()) {
        if (IsLog(path, isFolder)) {
            continue;
        }
        files.emplace(isFolder ? path + '\\' : path, isFolder ? std::string() : Read(target_->HostPath(path)));
    }
    return files;
}

std::map<std::string, std::string> Machine::FilesWithoutFolders() const {
    std::map<std::string, std::string> files = Files();
    std::erase_if(files, [](const auto& item) { return item.first.back() == '\\'; });
    return files;
}

std::vector<std::string> Machine::TempEntries() const {
    const std::set<std::string> names = target_->AddedTempEntries();
    return {names.begin(), names.end()};
}

std::string Machine::Registry() const {
    const RegistryContent content = target_->AddedRegistry();
    std::string text = hosted::RegistryTextHeader();
    for (auto key = content.begin(); key != content.end(); ++key) {
        if (key->second.empty() && LeadsToAnother(content, key)) {
            continue;
        }
        text += "\n" + hosted::KeyLine(key->first);
        for (const auto& [name, value] : key->second) {
            text += hosted::ValueLine(name, value.type, value.data);
        }
    }
    return text;
}

std::string Machine::TempFolder() const {
    return target_->Variable("TEMP");
}

std::string Machine::UserFolder() const {
    return target_->Variable("USERPROFILE");
}

std::string Machine::HostName(const std::string& path) const {
    const std::u8string name = target_->HostPath(path).u8string();
    return {name.begin(), name.end()};
}
